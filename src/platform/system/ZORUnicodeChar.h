// One UTF-16 code unit.
#ifndef ZOR_PLATFORM_SYSTEM_ZORUNICODECHAR_H
#define ZOR_PLATFORM_SYSTEM_ZORUNICODECHAR_H

#include "platform/ZORPlatformAdditions.h"

/// A UTF-16 code unit as a number; ZORUnicodeString::ConvertToUCChar gives an array of them.
typedef char16_t ZORUC2Bytes;

/// One UTF-16 code unit: a character of the basic plane or half of a surrogate pair.
class ZORUnicodeChar {
 public:
  ZORUnicodeChar() = default;
  /// @param inCharacter an ASCII character; other bytes are taken as U+0080 to U+00FF.
  ZORUnicodeChar(char inCharacter) : unit_(static_cast<unsigned char>(inCharacter)) {}
  /// Makes this the given code unit; surrogate halves are kept as they are.
  void BuildFromUC2Bytes(ZORUC2Bytes inUnit) { unit_ = inUnit; }

#if ZOR_PLATFORM_ADDITIONS
  ZORUC2Bytes ConvertToUC2Bytes() const { return unit_; }
  friend bool operator==(ZORUnicodeChar a, ZORUnicodeChar b) { return a.unit_ == b.unit_; }
  friend bool operator!=(ZORUnicodeChar a, ZORUnicodeChar b) { return a.unit_ != b.unit_; }
#endif

 private:
  ZORUC2Bytes unit_ = 0;
};

#endif
