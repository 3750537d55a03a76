// The platform's narrow string.
#ifndef ZOR_PLATFORM_SYSTEM_ZORSTRING_H
#define ZOR_PLATFORM_SYSTEM_ZORSTRING_H

#include <string>

#include "ZORPlatformExport.h"
#include "platform/system/ZORChar.h"

/// A string of 8-bit characters: UTF-8 on Linux, the ANSI code page on Windows. A value: copied
/// freely.
class ZOR_PLATFORM_EXPORT ZORString {
 public:
  ZORString();
  /// @param inText zero-terminated; null gives the empty string.
  ZORString(const char* inText);
  /// @param inText    at least inLength bytes, which may hold zeros.
  ZORString(const char* inText, int inLength);
  ZORString(const ZORString& inOther);
  ZORString(ZORString&& ioOther) noexcept;
  ZORString& operator=(const ZORString& inOther);
  ZORString& operator=(ZORString&& ioOther) noexcept;
  ~ZORString();

  /// The text, zero-terminated; valid until this string changes or ends. Never null.
  const char* CastToCharPtr() const;
  /// Number of bytes.
  int GetLengthInChar() const;
  /// The byte at a 0-based position; the zero character outside the text.
  ZORChar operator[](int inPosition) const;
  ZORString& Append(const ZORString& inTail);

  ZOR_PLATFORM_EXPORT friend bool operator==(const ZORString& inA, const ZORString& inB);
  ZOR_PLATFORM_EXPORT friend bool operator!=(const ZORString& inA, const ZORString& inB);

 private:
  std::string text_;
};

#endif
