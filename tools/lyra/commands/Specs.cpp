// lyra specs FILE
#include <memory>

#include "lyra/Verbs.h"
#include "lyra/commands/RecordsJson.h"
#include "lyra/terminal/Table.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

struct SpecsOptions {
  std::string file;
  bool json = false;
};

void PrintTable(const std::vector<SpecificationRecord>& inSpecifications, Output& ioOutput) {
  using Align = TableColumn::Align;
  Table table({{"N", Align::kRight},
               {"First products", Align::kLeft, Cut::kStart},
               {"Version"},
               {"Shape"},
               {"Second products", Align::kLeft, Cut::kStart},
               {"Version"},
               {"Shape"}});
  for (const SpecificationRecord& specification : inSpecifications) {
    const SpecifiedProducts& first = specification.products[0];
    const SpecifiedProducts& second = specification.products[1];
    table.Add({std::to_string(specification.index), first.alias, first.version, first.shape,
               second.alias, second.version, second.shape});
  }
  table.Print(ioOutput);
}

int Specs(const SpecsOptions& inOptions, Output& ioOutput) {
  ClashDocument file(inOptions.file);
  file.Require({DocumentKind::kClash, DocumentKind::kInterference, DocumentKind::kFederator},
               "specifications");
  const std::vector<SpecificationRecord> specifications = ReadSpecifications(file);
  if (inOptions.json)
    WriteJsonLines(specifications, ioOutput);
  else
    PrintTable(specifications, ioOutput);
  return 0;
}

}  // namespace

VerbAction DeclareSpecs(Arguments& ioArguments) {
  const auto options = std::make_shared<SpecsOptions>();
  ioArguments.Positional("FILE", options->file, "A clash result, or - for standard input");
  ioArguments.Flag("--json", options->json, "Print a JSON array of all that is known of each");
  return [options](Output& ioOutput) { return Specs(*options, ioOutput); };
}

}  // namespace lyra
