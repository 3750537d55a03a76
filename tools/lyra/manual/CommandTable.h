// The verbs and options of the command as plain rows, for the papers that are written from them.
#ifndef ZOR_TOOLS_LYRA_MANUAL_COMMAND_TABLE_H
#define ZOR_TOOLS_LYRA_MANUAL_COMMAND_TABLE_H

#include <string>
#include <string_view>
#include <vector>

namespace lyra {

/// What a shell can complete a value with.
enum class ValueKind { kText, kFile, kFolder };

struct OptionRow {
  std::vector<std::string> names;  ///< with their hyphens, the short one first
  std::string value;               ///< what help calls the value; "" for a flag
  std::string help;
  std::vector<std::string> words;  ///< that the value is one of; none: anything
  ValueKind kind = ValueKind::kText;
  bool isRequired = false;
  bool isRepeatable = false;

  bool TakesValue() const { return !value.empty(); }
};

struct PositionalRow {
  std::string name, help;
  ValueKind kind = ValueKind::kText;
  bool isRepeatable = false;
};

struct VerbRow {
  std::string name, summary;
  std::vector<PositionalRow> positionals;
  std::vector<OptionRow> options;  ///< those of all verbs that it reads too are among them

  bool TakesFiles() const;
};

struct CommandTable {
  std::string version, description;
  std::vector<OptionRow> options;  ///< those before the verb
  std::vector<VerbRow> verbs;
};

CommandTable TableOfCommand();

/// The manual page, in the macros of man(7).
std::string ManualPage(const CommandTable& inTable);

// What a shell reads to complete the command's words.
std::string BashCompletion(const CommandTable& inTable);
std::string ZshCompletion(const CommandTable& inTable);
std::string FishCompletion(const CommandTable& inTable);

// Small pieces of text
std::string Joined(const std::vector<std::string>& inTexts, std::string_view inBetween);
std::string Replaced(std::string inText, std::string_view inOld, std::string_view inNew);
/// With a backslash before each of these characters.
std::string Escaped(std::string_view inText, std::string_view inCharacters);

}  // namespace lyra

#endif
