#include "foundation/TomlNesting.h"

#include <algorithm>

namespace ZORFoundation {
namespace {

/// @return the end of the string that begins with a quotation mark; an unclosed one on a single
/// line ends with the line.
std::size_t EndOfQuoted(std::string_view inText, std::size_t inStart) {
  const char quote = inText[inStart];
  const std::string_view three = quote == '"' ? "\"\"\"" : "'''";
  const bool isLong = inText.substr(inStart).starts_with(three);
  std::size_t at = inStart + (isLong ? 3 : 1);
  while (at < inText.size()) {
    if (isLong && inText.substr(at).starts_with(three)) {
      at += 3;  // up to two more quotation marks may belong to the text
      while (at < inText.size() && inText[at] == quote) ++at;
      return at;
    }
    if (!isLong && (inText[at] == quote || inText[at] == '\n'))
      return inText[at] == quote ? at + 1 : at;
    at += quote == '"' && inText[at] == '\\' ? 2 : 1;
  }
  return inText.size();
}

TextPlace PlaceOf(std::string_view inText, std::size_t inAt) {
  const std::string_view before = inText.substr(0, inAt);
  const std::size_t feed = before.rfind('\n');
  return {1 + static_cast<std::size_t>(std::ranges::count(before, '\n')),
          feed == std::string_view::npos ? inAt + 1 : inAt - feed};
}

}  // namespace

std::optional<TextPlace> FindTooDeepToml(std::string_view inText) {
  int parts = 1, brackets = 0;
  for (std::size_t at = 0; at < inText.size();) {
    switch (inText[at]) {
      case '"':
      case '\'':
        at = EndOfQuoted(inText, at);
        continue;
      case '#':
        at = std::min(inText.find('\n', at), inText.size());
        continue;
      case '.':
        ++parts;
        break;
      case '[':
      case '{':
        ++brackets;
        parts = 1;
        break;
      case ']':
      case '}':
        brackets = std::max(0, brackets - 1);
        parts = 1;
        break;
      case '=':
      case ',':
      case '\n':
        parts = 1;
        break;
      default:
        break;
    }
    if (parts > kMaxTomlKeyParts || brackets > kMaxTomlBrackets) return PlaceOf(inText, at);
    ++at;
  }
  return std::nullopt;
}

}  // namespace ZORFoundation
