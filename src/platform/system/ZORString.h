// The platform's narrow string.
#ifndef ZOR_PLATFORM_SYSTEM_ZORSTRING_H
#define ZOR_PLATFORM_SYSTEM_ZORSTRING_H

#include <string>

#include "ZORPlatformExport.h"
#include "platform/ZORPlatformAdditions.h"
#include "platform/system/ZORChar.h"

/// A value of 8-bit characters: UTF-8 on Linux, the ANSI code page on Windows.
class ZOR_PLATFORM_EXPORT ZORString {
 public:
  ZORString();
  /// @param inText zero-terminated; null gives the empty string.
  ZORString(const char* inText);
  ZORString(const ZORString& inOther);
  ZORString(ZORString&& ioOther) noexcept;
  ZORString& operator=(const ZORString& inOther);
  ZORString& operator=(ZORString&& ioOther) noexcept;
  ~ZORString();

  /// The text, zero-terminated; valid until this string changes or ends. Never null.
  const char* CastToCharPtr() const;
  /// The byte at a 0-based position; the zero character outside the text.
  ZORChar operator[](int inPosition) const;

#if ZOR_PLATFORM_ADDITIONS
  /// @param inText at least inLength bytes, which may hold zeros.
  ZORString(const char* inText, int inLength);
  int GetLengthInChar() const;  ///< number of bytes
  ZORString& Append(const ZORString& inTail);
  ZOR_PLATFORM_EXPORT friend bool operator==(const ZORString& inA, const ZORString& inB);
  ZOR_PLATFORM_EXPORT friend bool operator!=(const ZORString& inA, const ZORString& inB);
#endif

 private:
  std::string text_;
};

#endif
