// lyra links FILE
#include <memory>

#include "lyra/Verbs.h"
#include "lyra/commands/RecordsJson.h"
#include "lyra/terminal/Table.h"
#include "toolkit/records/DocumentRecords.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

struct LinksOptions {
  std::string file;
  bool json = false, check = false;
};

void PrintTable(const std::vector<LinkRecord>& inLinks, Output& ioOutput) {
  using Align = TableColumn::Align;
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

int Links(const LinksOptions& inOptions, Output& ioOutput) {
  ClashDocument file(inOptions.file);
  file.Require({DocumentKind::kFederator}, "links");
  std::vector<LinkRecord> links = ReadLinks(file);
  const bool areAllWell = !inOptions.check || Check(links, inOptions.file);
  if (inOptions.json)
    WriteJsonLines(links, ioOutput);
  else
    PrintTable(links, ioOutput);
  return areAllWell ? 0 : 1;
}

}  // namespace

VerbAction DeclareLinks(Arguments& ioArguments) {
  const auto options = std::make_shared<LinksOptions>();
  ioArguments.Positional("FILE", options->file, "A federator document, or - for standard input");
  ioArguments.Flag("--json", options->json, "Print a JSON array of all that is known of each");
  ioArguments.Flag(
      "--check", options->check,
      "Also say which linked files are missing, unreadable, of the wrong kind or listed "
      "twice; exit code 1 if any");
  return [options](Output& ioOutput) { return Links(*options, ioOutput); };
}

}  // namespace lyra
