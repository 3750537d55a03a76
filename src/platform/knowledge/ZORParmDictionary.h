// The dictionary of magnitudes.
#ifndef ZOR_PLATFORM_KNOWLEDGE_ZORPARMDICTIONARY_H
#define ZOR_PLATFORM_KNOWLEDGE_ZORPARMDICTIONARY_H

#include "ZORPlatformExport.h"
#include "platform/knowledge/ZORICkeMagnitude.h"

class ZOR_PLATFORM_EXPORT ZORParmDictionary {
 public:
  /// @param inName "LENGTH", "ANGLE", "MASS", "TIME", "AREA" or "VOLUME", exactly.
  /// @return the magnitude, or an empty handle when the dictionary has none of this name.
  static ZORICkeMagnitude_var FindMagnitude(const ZORUnicodeString& inName);
};

#endif
