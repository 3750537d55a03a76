// lyra links FILE
#include <memory>

#include "lyra/RecordsJson.h"
#include "lyra/Table.h"
#include "lyra/Verbs.h"

namespace lyra {
namespace {

struct LinksOptions {
  std::string file;
  bool json = false;
};

void PrintTable(const std::vector<LinkRecord>& inLinks, Output& ioOutput) {
  using Align = TableColumn::Align;
  Table table({{"Link", Align::kLeft, Cut::kStart},
               {"First product", Align::kLeft, Cut::kStart},
               {"Second product", Align::kLeft, Cut::kStart}});
  for (const LinkRecord& link : inLinks)
    table.Add({link.link, link.products[0].name, link.products[1].name});
  table.Print(ioOutput);
}

int Links(const LinksOptions& inOptions, Output& ioOutput) {
  ClashResultFile file(inOptions.file);
  file.Require({DocumentKind::kFederator}, "links");
  const std::vector<LinkRecord> links = ReadLinks(file);
  if (inOptions.json)
    WriteJsonLines(links, ioOutput);
  else
    PrintTable(links, ioOutput);
  return 0;
}

}  // namespace

VerbAction DeclareLinks(Arguments& ioArguments) {
  const auto options = std::make_shared<LinksOptions>();
  ioArguments.Positional("FILE", options->file, "A federator document, or - for standard input");
  ioArguments.Flag("--json", options->json, "Print a JSON array of all that is known of each");
  return [options](Output& ioOutput) { return Links(*options, ioOutput); };
}

}  // namespace lyra
