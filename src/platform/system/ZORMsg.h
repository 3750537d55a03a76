// One message of a catalogue.
#ifndef ZOR_PLATFORM_SYSTEM_ZORMSG_H
#define ZOR_PLATFORM_SYSTEM_ZORMSG_H

#include "ZORPlatformExport.h"
#include "platform/ZORPlatformAdditions.h"
#include "platform/system/ZORUnicodeString.h"

/// A message text that may hold the places /p1 to /p9 for parameters. "//" is a slash; a slash
/// before anything else stands for itself.
class ZOR_PLATFORM_EXPORT ZORMsg {
 public:
  ZORMsg();
  /// @param inParameters inCount texts, or null for none; a place without parameter stays empty.
  ZORUnicodeString BuildMessage(const ZORUnicodeString* inParameters = nullptr,
                                int inCount = 0) const;

#if ZOR_PLATFORM_ADDITIONS
  explicit ZORMsg(const ZORUnicodeString& inText);
#endif

 private:
  ZORUnicodeString text_;
  bool isPlain_ = true;  // holds no place, so that building it is a copy
};

#endif
