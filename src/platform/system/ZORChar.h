// One narrow (8-bit) character.
#ifndef ZOR_PLATFORM_SYSTEM_ZORCHAR_H
#define ZOR_PLATFORM_SYSTEM_ZORCHAR_H

#include "platform/ZORPlatformAdditions.h"

/// One 8-bit character of a ZORString. Compared as a signed value: bytes 0x80 to 0xFF are negative.
class ZORChar {
 public:
  ZORChar() = default;
  ZORChar(char inCharacter) : character_(static_cast<signed char>(inCharacter)) {}
  operator char() const { return static_cast<char>(character_); }

#if ZOR_PLATFORM_ADDITIONS
  /// The character as a number from -128 to 127, whatever the compiler's char is.
  int SignedValue() const { return character_; }
#endif

 private:
  signed char character_ = 0;
};

#endif
