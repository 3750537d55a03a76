// How deep a TOML text is nested.
#ifndef ZOR_FOUNDATION_TOMLNESTING_H
#define ZOR_FOUNDATION_TOMLNESTING_H

#include <cstddef>
#include <optional>
#include <string_view>

#include "ZORFoundationExport.h"

namespace ZORFoundation {

inline constexpr int kMaxTomlKeyParts = 32;
inline constexpr int kMaxTomlBrackets = 64;
inline constexpr const char* kTomlTooDeep = "is nested too deeply";

/// Counted from 1.
struct TextPlace {
  std::size_t line = 1, column = 1;
};

/// Where a key has more than kMaxTomlKeyParts parts, or more than kMaxTomlBrackets brackets are
/// open. The TOML library takes apart what it read by recursion and would overflow the stack.
/// @return nothing for a text that may be read.
ZOR_FOUNDATION_EXPORT std::optional<TextPlace> FindTooDeepToml(std::string_view inText);

}  // namespace ZORFoundation

#endif
