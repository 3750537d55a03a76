// Small pieces of text.
#ifndef ZOR_TOOLS_LYRA_MANUAL_TEXT_PIECES_H
#define ZOR_TOOLS_LYRA_MANUAL_TEXT_PIECES_H

#include <string>
#include <string_view>
#include <vector>

namespace lyra {

std::string Joined(const std::vector<std::string>& inTexts, std::string_view inBetween);
std::string Replaced(std::string inText, std::string_view inOld, std::string_view inNew);
/// With a backslash before each of these characters.
std::string Escaped(std::string_view inText, std::string_view inCharacters);

}  // namespace lyra

#endif
