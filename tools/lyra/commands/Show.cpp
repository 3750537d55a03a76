// lyra show FILE N
#include <memory>

#include "lyra/Verbs.h"
#include "lyra/commands/CommonOptions.h"
#include "lyra/commands/JsonDocument.h"
#include "lyra/commands/RecordsJson.h"
#include "lyra/terminal/Table.h"
#include "toolkit/review/Match.h"

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

std::string TripleShown(const double* inTriple) {
  return Joined({Number(inTriple[0]), Number(inTriple[1]), Number(inTriple[2])});
}

void AddPlacement(const Placement& inPlacement, KeyValueList& ioList) {
  ioList.Add("Position", TripleShown(&inPlacement[9]));
  ioList.Add("Rx", TripleShown(&inPlacement[0]));
  ioList.Add("Ry", TripleShown(&inPlacement[3]));
  ioList.Add("Rz", TripleShown(&inPlacement[6]));
}

void AddProduct(const char* inGroup, const ProductRecord& inProduct, KeyValueList& ioList) {
  if (!inProduct.exists) return;
  ioList.AddGroup(inGroup);
  ioList.Add({{"Alias", inProduct.alias},
              {"Identifier", inProduct.id},
              {"Instance", inProduct.instance},
              {"Label", inProduct.label},
              {"Shape", inProduct.shape},
              {"Shape source", inProduct.shapeSource},
              {"Alien", inProduct.alien},
              {"Process mode", inProduct.processMode},
              {"Preview", inProduct.preview}});
  AddPlacement(inProduct.placement, ioList);
}

void AddRule(const RuleRecord& inRule, KeyValueList& ioList) {
  if (inRule.name.empty() && inRule.clearance.text.empty() && inRule.severity.empty() &&
      inRule.penetrationCandidate.empty())
    return;
  ioList.AddGroup("Violated rule");
  ioList.Add({{"Name", inRule.name},
              {"Clearance", inRule.clearance.text},
              {"Severity", inRule.severity},
              {"Penetration candidate", inRule.penetrationCandidate}});
}

void AddGeometry(const InterferenceRecord& inRecord, KeyValueList& ioList) {
  if (inRecord.curveLength.text.empty() && inRecord.distance.text.empty() &&
      inRecord.points.empty())
    return;
  ioList.AddGroup("Geometry");
  ioList.Add("Curve length", inRecord.curveLength.text);
  ioList.Add("Value", inRecord.distance.text);
  for (const NumberTriple& point : inRecord.points) ioList.Add("Point", Joined(point));
}

void AddViewpoint(const ViewpointRecord& inViewpoint, KeyValueList& ioList) {
  ioList.AddGroup("Viewpoint");
  ioList.Add({{"Projection", inViewpoint.projection},
              {"Focus distance", inViewpoint.focusDistance.text},
              {"Near plane", inViewpoint.nearPlane.text},
              {"Far plane", inViewpoint.farPlane.text}});
  ioList.Add("Point", Joined(inViewpoint.point));
  ioList.Add("Sight", Joined(inViewpoint.sight));
}

void PrintText(const InterferenceRecord& inRecord, Output& ioOutput) {
  KeyValueList list("Interference " + std::to_string(inRecord.index) +
                    (inRecord.name.empty() ? "" : ": " + inRecord.name));
  list.Add({{"Result", inRecord.result},
            {"Type", inRecord.type},
            {"Value", inRecord.value.text},
            {"Clearance", inRecord.clearance.text},
            {"Status", inRecord.status},
            {"Computation case", inRecord.computationCase},
            {"Retrieve", inRecord.retrieve},
            {"Comment", inRecord.comment},
            {"Picture", inRecord.picture}});
  AddRule(inRecord.rule, list);
  AddProduct("First product", inRecord.products[0], list);
  AddProduct("Second product", inRecord.products[1], list);
  AddGeometry(inRecord, list);
  if (inRecord.viewpoint) AddViewpoint(*inRecord.viewpoint, list);
  list.Print(ioOutput);
}

int Show(const ShowOptions& inOptions, Output& ioOutput) {
  ChooseLanguage(inOptions.language);
  ClashDocument document(inOptions.file);
  const InterferenceRecord record = ReadInterference(document, inOptions.number);
  if (inOptions.json)
    ioOutput.Write(Behind(JsonHeaderText("show"),
                          JsonText({record, StableIds(ReadForReview(document))
                                                .at(static_cast<std::size_t>(record.index - 1))})) +
                   "\n");
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
