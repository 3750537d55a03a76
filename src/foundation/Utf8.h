// Conversion between UTF-8 and UTF-16.
#ifndef ZOR_FOUNDATION_UTF8_H
#define ZOR_FOUNDATION_UTF8_H

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>

#include "ZORFoundationExport.h"

namespace ZORFoundation {

/// Replaces what cannot be converted.
inline constexpr char16_t kReplacementCharacter = 0xFFFD;

inline bool IsHighSurrogate(char32_t inUnit) { return inUnit >= 0xD800 && inUnit <= 0xDBFF; }
inline bool IsLowSurrogate(char32_t inUnit) { return inUnit >= 0xDC00 && inUnit <= 0xDFFF; }

inline bool IsAscii(std::string_view inBytes) {
  const char* at = inBytes.data();
  const char* const end = at + inBytes.size();
  std::uint64_t all = 0;
  for (; end - at >= 8; at += 8) {
    std::uint64_t block = 0;
    std::memcpy(&block, at, sizeof block);
    all |= block;
  }
  for (; at != end; ++at) all |= static_cast<unsigned char>(*at);
  return (all & 0x8080808080808080u) == 0;
}

/// @return whether all of it is well-formed UTF-8.
ZOR_FOUNDATION_EXPORT bool IsUtf8(std::string_view inBytes);

/// Writes UTF-8 as UTF-16; each maximal part of an ill-formed sequence becomes one U+FFFD.
/// @param outUnits room for one unit a byte.
/// @return the number of units written.
ZOR_FOUNDATION_EXPORT std::size_t DecodeUtf8(std::string_view inBytes, char16_t* outUnits);

/// @return the number of bytes that EncodeUtf8 writes for these units.
ZOR_FOUNDATION_EXPORT std::size_t Utf8Length(std::u16string_view inUnits);

/// Writes UTF-16 as UTF-8; a lone surrogate becomes U+FFFD.
/// @param outBytes room for Utf8Length bytes, at most three a unit.
/// @return the number of bytes written.
ZOR_FOUNDATION_EXPORT std::size_t EncodeUtf8(std::u16string_view inUnits, char* outBytes);

/// Takes the character at a position of a UTF-16 text and moves the position past it; a lone
/// surrogate is U+FFFD.
ZOR_FOUNDATION_EXPORT char32_t NextCharacter(std::u16string_view inUnits, std::size_t& ioPosition);

/// Takes the character at a position of a UTF-8 text and moves the position past it; a maximal part
/// of an ill-formed sequence is U+FFFD.
ZOR_FOUNDATION_EXPORT char32_t NextCharacter(std::string_view inBytes, std::size_t& ioPosition);

/// Writes one character below U+110000, no surrogate, as UTF-8.
/// @return the end of what was written.
ZOR_FOUNDATION_EXPORT char* EncodeCharacter(char32_t inCharacter, char* outBytes);

}  // namespace ZORFoundation

#endif
