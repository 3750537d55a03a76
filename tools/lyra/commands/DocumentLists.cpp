// lyra components FILE, lyra specs FILE, lyra links FILE
#include <memory>

#include "lyra/Verbs.h"
#include "lyra/commands/RecordsJson.h"
#include "lyra/terminal/Table.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

using Align = TableColumn::Align;

struct ListsOptions {
  std::string file;
  bool json = false, check = false;
};

void PrintTable(const std::vector<ComponentRecord>& inComponents, Output& ioOutput) {
  Table table({{"Position", Align::kRight},
               {"Alias", Align::kLeft, Cut::kStart},
               {"Type"},
               {"Part number"},
               {"Attributes", Align::kRight},
               {"Shapes", Align::kRight}});
  for (const ComponentRecord& component : inComponents)
    table.Add({std::to_string(component.position), component.id, component.type,
               component.partNumber, std::to_string(component.attributes.size()),
               std::to_string(component.shapes.size())});
  table.Print(ioOutput);
}

void PrintTable(const std::vector<SpecificationRecord>& inSpecifications, Output& ioOutput) {
  Table table({{"N", Align::kRight},
               {"First products", Align::kLeft, Cut::kStart},
               {"Version"},
               {"Shape"},
               {"Second products", Align::kLeft, Cut::kStart},
               {"Version"},
               {"Shape"}});
  for (const SpecificationRecord& specification : inSpecifications) {
    const auto& [first, second] = specification.products;
    table.Add({std::to_string(specification.index), first.alias, first.version, first.shape,
               second.alias, second.version, second.shape});
  }
  table.Print(ioOutput);
}

void PrintTable(const std::vector<LinkRecord>& inLinks, Output& ioOutput) {
  const bool isChecked = !inLinks.empty() && inLinks.front().check.has_value();
  std::vector<TableColumn> columns = {{"Link", Align::kLeft, Cut::kStart},
                                      {"First product", Align::kLeft, Cut::kStart},
                                      {"Second product", Align::kLeft, Cut::kStart}};
  if (isChecked) columns.push_back({"Check"});
  Table table(columns);
  for (const LinkRecord& link : inLinks) {
    std::vector<std::string> cells = {link.link, link.products[0].name, link.products[1].name};
    if (isChecked) cells.push_back(*link.check);
    table.Add(cells);
  }
  table.Print(ioOutput);
}

template <class Records>
int Print(const ListsOptions& inOptions, const Records& inRecords, Output& ioOutput) {
  if (inOptions.json)
    WriteJsonLines(inRecords, ioOutput);
  else
    PrintTable(inRecords, ioOutput);
  return 0;
}

int Components(const ListsOptions& inOptions, Output& ioOutput) {
  ClashDocument file(inOptions.file);
  file.Require({DocumentKind::kComponents}, "components");
  return Print(inOptions, ReadComponents(file), ioOutput);
}

int Specs(const ListsOptions& inOptions, Output& ioOutput) {
  ClashDocument file(inOptions.file);
  file.Require({DocumentKind::kClash, DocumentKind::kInterference, DocumentKind::kFederator},
               "specifications");
  return Print(inOptions, ReadSpecifications(file), ioOutput);
}

/// Notes at each link what a check says. @return whether all are well.
bool Check(std::vector<LinkRecord>& ioLinks, const std::string& inFederator) {
  const std::vector<std::string> problems = CheckLinks(ioLinks, inFederator);
  bool areAllWell = true;
  for (std::size_t i = 0; i < problems.size(); ++i) {
    areAllWell = areAllWell && problems[i].empty();
    ioLinks[i].check = problems[i].empty() ? "ok" : problems[i];
  }
  return areAllWell;
}

int Links(const ListsOptions& inOptions, Output& ioOutput) {
  ClashDocument file(inOptions.file);
  file.Require({DocumentKind::kFederator}, "links");
  std::vector<LinkRecord> links = ReadLinks(file);
  const bool areAllWell = !inOptions.check || Check(links, inOptions.file);
  Print(inOptions, links, ioOutput);
  return areAllWell ? 0 : 1;
}

std::shared_ptr<ListsOptions> Declare(Arguments& ioArguments, const char* inFile) {
  const auto options = std::make_shared<ListsOptions>();
  ioArguments.Positional("FILE", options->file, inFile);
  ioArguments.Flag("--json", options->json, "Print a JSON array of all that is known of each");
  return options;
}

}  // namespace

VerbAction DeclareComponents(Arguments& ioArguments) {
  const auto options = Declare(ioArguments, "A component list, or - for standard input");
  return [options](Output& ioOutput) { return Components(*options, ioOutput); };
}

VerbAction DeclareSpecs(Arguments& ioArguments) {
  const auto options = Declare(ioArguments, "A clash result, or - for standard input");
  return [options](Output& ioOutput) { return Specs(*options, ioOutput); };
}

VerbAction DeclareLinks(Arguments& ioArguments) {
  const auto options = Declare(ioArguments, "A federator document, or - for standard input");
  ioArguments.Flag(
      "--check", options->check,
      "Also say which linked files are missing, unreadable, of the wrong kind or listed "
      "twice; exit code 1 if any");
  return [options](Output& ioOutput) { return Links(*options, ioOutput); };
}

}  // namespace lyra
