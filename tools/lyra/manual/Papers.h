// The papers that are written from the table of the command.
#ifndef ZOR_TOOLS_LYRA_MANUAL_PAPERS_H
#define ZOR_TOOLS_LYRA_MANUAL_PAPERS_H

#include <string>
#include <string_view>
#include <vector>

#include "lyra/manual/CommandTable.h"

namespace lyra {

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
