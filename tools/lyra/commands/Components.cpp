// lyra components FILE
#include <memory>

#include "lyra/Verbs.h"
#include "lyra/commands/RecordsJson.h"
#include "lyra/terminal/Table.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

struct ComponentsOptions {
  std::string file;
  bool json = false;
};

void PrintTable(const std::vector<ComponentRecord>& inComponents, Output& ioOutput) {
  using Align = TableColumn::Align;
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

int Components(const ComponentsOptions& inOptions, Output& ioOutput) {
  ClashDocument file(inOptions.file);
  file.Require({DocumentKind::kComponents}, "components");
  const std::vector<ComponentRecord> components = ReadComponents(file);
  if (inOptions.json)
    WriteJsonLines(components, ioOutput);
  else
    PrintTable(components, ioOutput);
  return 0;
}

}  // namespace

VerbAction DeclareComponents(Arguments& ioArguments) {
  const auto options = std::make_shared<ComponentsOptions>();
  ioArguments.Positional("FILE", options->file, "A component list, or - for standard input");
  ioArguments.Flag("--json", options->json, "Print a JSON array of all that is known of each");
  return [options](Output& ioOutput) { return Components(*options, ioOutput); };
}

}  // namespace lyra
