// lyra show FILE N
#include <charconv>
#include <memory>

#include "lyra/Facts.h"
#include "lyra/Language.h"
#include "lyra/RecordsJson.h"
#include "lyra/Verbs.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

struct ShowOptions {
  std::string file, language;
  long long number = 0;
  bool json = false;
};

std::string Joined(const NumberTriple& inTriple) {
  const auto& [x, y, z] = inTriple;
  const bool isEmpty = x.text.empty() && y.text.empty() && z.text.empty();
  return isEmpty ? "" : x.text + ", " + y.text + ", " + z.text;
}

std::string NumberShown(double inNumber) {
  char digits[32];
  const auto end = std::to_chars(digits, digits + sizeof digits, inNumber).ptr;
  return std::string(digits, end);
}

std::string TripleShown(const double* inTriple) {
  return NumberShown(inTriple[0]) + ", " + NumberShown(inTriple[1]) + ", " +
         NumberShown(inTriple[2]);
}

void AddPlacement(const Placement& inPlacement, Facts& ioFacts) {
  ioFacts.Add("Position", TripleShown(&inPlacement[9]));
  ioFacts.Add("Rx", TripleShown(&inPlacement[0]));
  ioFacts.Add("Ry", TripleShown(&inPlacement[3]));
  ioFacts.Add("Rz", TripleShown(&inPlacement[6]));
}

void AddProduct(const char* inGroup, const ProductRecord& inProduct, Facts& ioFacts) {
  if (!inProduct.exists) return;
  ioFacts.AddGroup(inGroup);
  ioFacts.Add({{"Alias", inProduct.alias},
               {"Identifier", inProduct.id},
               {"Instance", inProduct.instance},
               {"Label", inProduct.label},
               {"Shape", inProduct.shape},
               {"Shape source", inProduct.shapeSource},
               {"Alien", inProduct.alien},
               {"Process mode", inProduct.processMode},
               {"Preview", inProduct.preview}});
  AddPlacement(inProduct.placement, ioFacts);
}

void AddRule(const RuleRecord& inRule, Facts& ioFacts) {
  if (inRule.name.empty() && inRule.clearance.text.empty() && inRule.severity.empty() &&
      inRule.penetrationCandidate.empty())
    return;
  ioFacts.AddGroup("Violated rule");
  ioFacts.Add({{"Name", inRule.name},
               {"Clearance", inRule.clearance.text},
               {"Severity", inRule.severity},
               {"Penetration candidate", inRule.penetrationCandidate}});
}

void AddGeometry(const InterferenceRecord& inRecord, Facts& ioFacts) {
  if (inRecord.curveLength.text.empty() && inRecord.distance.text.empty() &&
      inRecord.points.empty())
    return;
  ioFacts.AddGroup("Geometry");
  ioFacts.Add("Curve length", inRecord.curveLength.text);
  ioFacts.Add("Value", inRecord.distance.text);
  for (const NumberTriple& point : inRecord.points) ioFacts.Add("Point", Joined(point));
}

void AddViewpoint(const ViewpointRecord& inViewpoint, Facts& ioFacts) {
  ioFacts.AddGroup("Viewpoint");
  ioFacts.Add({{"Projection", inViewpoint.projection},
               {"Focus distance", inViewpoint.focusDistance.text},
               {"Near plane", inViewpoint.nearPlane.text},
               {"Far plane", inViewpoint.farPlane.text}});
  ioFacts.Add("Point", Joined(inViewpoint.point));
  ioFacts.Add("Sight", Joined(inViewpoint.sight));
}

void PrintText(const InterferenceRecord& inRecord, Output& ioOutput) {
  Facts facts("Interference " + std::to_string(inRecord.index) +
              (inRecord.name.empty() ? "" : ": " + inRecord.name));
  facts.Add({{"Result", inRecord.result},
             {"Type", inRecord.type},
             {"Value", inRecord.value.text},
             {"Clearance", inRecord.clearance.text},
             {"Status", inRecord.status},
             {"Computation case", inRecord.computationCase},
             {"Retrieve", inRecord.retrieve},
             {"Comment", inRecord.comment},
             {"Picture", inRecord.picture}});
  AddRule(inRecord.rule, facts);
  AddProduct("First product", inRecord.products[0], facts);
  AddProduct("Second product", inRecord.products[1], facts);
  AddGeometry(inRecord, facts);
  if (inRecord.viewpoint) AddViewpoint(*inRecord.viewpoint, facts);
  facts.Print(ioOutput);
}

int Show(const ShowOptions& inOptions, Output& ioOutput) {
  ChooseLanguage(inOptions.language);
  ClashDocument document(inOptions.file);
  const InterferenceRecord record = ReadInterference(document, inOptions.number);
  if (inOptions.json)
    ioOutput.Write(JsonText(record) + "\n");
  else
    PrintText(record, ioOutput);
  return 0;
}

}  // namespace

VerbAction DeclareShow(Arguments& ioArguments) {
  const auto options = std::make_shared<ShowOptions>();
  ioArguments.Positional("FILE", options->file, "A clash result, or - for standard input");
  ioArguments.PositionalNumber("N", options->number, "Number of the interference, from 1");
  ioArguments.Flag("--json", options->json, "Print a JSON object");
  ioArguments.Language(options->language);
  return [options](Output& ioOutput) { return Show(*options, ioOutput); };
}

}  // namespace lyra
