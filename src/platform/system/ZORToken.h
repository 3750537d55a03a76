// Splitting a text at separators.
#ifndef ZOR_PLATFORM_SYSTEM_ZORTOKEN_H
#define ZOR_PLATFORM_SYSTEM_ZORTOKEN_H

#include "ZORPlatformExport.h"
#include "platform/system/ZORUnicodeString.h"

/// Gives the parts of a text one after another. Consecutive separators count as one, so no token is
/// empty but the one that says that there are no more.
class ZOR_PLATFORM_EXPORT ZORToken {
 public:
  explicit ZORToken(const ZORUnicodeString& inText);
  /// @param inSeparators each of its characters separates.
  /// @return the next non-empty part, or the empty string when the text is used up.
  ZORUnicodeString GetNextToken(const ZORUnicodeString& inSeparators);

 private:
  ZORUnicodeString text_;
  int position_ = 0;
};

#endif
