#include "lyra/manual/CommandTable.h"

#include <algorithm>

#include "lyra/CommandLine.h"

namespace lyra {
namespace {

/// Help names a value after what it is.
ValueKind KindOf(const std::string& inValue) {
  if (inValue == "DIR") return ValueKind::kFolder;
  for (const char* name : {"FILE", "MODEL", "RESULT", "LINK", "OUT", "PICTURE", "REFERENCE"})
    if (inValue == name) return ValueKind::kFile;
  return ValueKind::kText;
}

PositionalRow RowOfPositional(const CLI::Option& inOption) {
  const std::string name = inOption.get_name(true);
  return {name, inOption.get_description(), KindOf(name), inOption.get_expected_max() > 1};
}

OptionRow RowOfOption(const CLI::Option& inOption, const OptionWords& inWords) {
  OptionRow row;
  for (const std::string& name : inOption.get_snames()) row.names.push_back("-" + name);
  for (const std::string& name : inOption.get_lnames()) row.names.push_back("--" + name);
  if (inOption.get_items_expected_max() > 0) row.value = inOption.get_type_name();
  row.help = inOption.get_description();
  const auto words = inWords.find(&inOption);
  if (words != inWords.end()) row.words = words->second;
  row.kind = KindOf(row.value);
  row.isRequired = inOption.get_required();
  row.isRepeatable = inOption.get_multi_option_policy() == CLI::MultiOptionPolicy::TakeAll;
  return row;
}

std::vector<OptionRow> OptionRows(const CLI::App& inApp, const OptionWords& inWords) {
  std::vector<OptionRow> rows;
  for (const CLI::Option* option : inApp.get_options())
    if (!option->get_positional()) rows.push_back(RowOfOption(*option, inWords));
  return rows;
}

bool HasName(const std::vector<OptionRow>& inOptions, const std::string& inName) {
  return std::any_of(inOptions.begin(), inOptions.end(),
                     [&](const OptionRow& inRow) { return inRow.names.back() == inName; });
}

VerbRow RowOfVerb(const CLI::App& inApp, const CommandLine& inLine) {
  VerbRow row{inApp.get_name(), inApp.get_description(), {}, OptionRows(inApp, inLine.words)};
  for (const CLI::Option* option : inApp.get_options())
    if (option->get_positional()) row.positionals.push_back(RowOfPositional(*option));
  for (const OptionRow& common : OptionRows(inLine.app, inLine.words))
    if (common.TakesValue() && !HasName(row.options, common.names.back()))
      row.options.push_back(common);
  return row;
}

}  // namespace

bool VerbRow::TakesFiles() const {
  return std::any_of(positionals.begin(), positionals.end(),
                     [](const PositionalRow& inRow) { return inRow.kind == ValueKind::kFile; });
}

CommandTable TableOfCommand() {
  const CommandLine line;
  CommandTable table{
      line.app.version(), line.app.get_description(), OptionRows(line.app, line.words), {}};
  for (const DeclaredVerb& verb : line.verbs) table.verbs.push_back(RowOfVerb(*verb.app, line));
  return table;
}

}  // namespace lyra
