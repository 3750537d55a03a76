#include "lyra/manual/TextPieces.h"

namespace lyra {

std::string Joined(const std::vector<std::string>& inTexts, std::string_view inBetween) {
  std::string joined;
  for (const std::string& text : inTexts) {
    if (!joined.empty()) joined += inBetween;
    joined += text;
  }
  return joined;
}

std::string Replaced(std::string inText, std::string_view inOld, std::string_view inNew) {
  for (std::size_t at = inText.find(inOld); at != std::string::npos;
       at = inText.find(inOld, at + inNew.size()))
    inText.replace(at, inOld.size(), inNew);
  return inText;
}

std::string Escaped(std::string_view inText, std::string_view inCharacters) {
  std::string escaped;
  for (const char character : inText) {
    if (inCharacters.find(character) != std::string_view::npos) escaped += '\\';
    escaped += character;
  }
  return escaped;
}

}  // namespace lyra
