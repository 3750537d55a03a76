// Patterns of names.
#ifndef ZOR_TOOLKIT_RECORDS_GLOB_H
#define ZOR_TOOLKIT_RECORDS_GLOB_H

#include <algorithm>
#include <string>
#include <string_view>
#include <vector>

namespace ZORToolkit {

/// Whether a pattern with "*" (any text) and "?" (one character of UTF-8) fits a whole text. In
/// time of pattern times text, without recursion: only the last "*" is ever taken up again.
inline bool MatchesGlob(std::string_view inPattern, std::string_view inText) {
  std::size_t p = 0, t = 0, star = std::string_view::npos, resume = 0;
  while (t < inText.size()) {
    if (p < inPattern.size() && inPattern[p] == '*') {
      star = p++;
      resume = t;
    } else if (p < inPattern.size() && inPattern[p] == '?') {
      ++p;
      for (++t; t < inText.size() && (inText[t] & 0xC0) == 0x80; ++t) {  // continuation bytes
      }
    } else if (p < inPattern.size() && inPattern[p] == inText[t]) {
      ++p;
      ++t;
    } else if (star != std::string_view::npos) {
      p = star + 1;
      t = ++resume;
    } else {
      return false;
    }
  }
  return std::ranges::all_of(inPattern.substr(p), [](char sign) { return sign == '*'; });
}

inline bool MatchesAnyGlob(const std::vector<std::string>& inPatterns, std::string_view inText) {
  return std::ranges::any_of(
      inPatterns, [&](const std::string& inPattern) { return MatchesGlob(inPattern, inText); });
}

}  // namespace ZORToolkit

#endif
