// A kind of quantity.
#ifndef ZOR_PLATFORM_KNOWLEDGE_ZORICKEMAGNITUDE_H
#define ZOR_PLATFORM_KNOWLEDGE_ZORICKEMAGNITUDE_H

#include "ZORPlatformExport.h"
#include "platform/ZORPlatformAdditions.h"
#include "platform/knowledge/ZORICkeUnit.h"
#include "platform/system/ZORInterfaceHandle.h"
#include "platform/system/ZORUnicodeString.h"

/// A kind of quantity, such as a length.
class ZOR_PLATFORM_EXPORT ZORICkeMagnitude : public ZORBaseUnknown {
 public:
  static const IID& ClassId();
  /// The unit in which values are stored (metres for a length); an empty handle when the magnitude
  /// has none.
  virtual ZORICkeUnit_var Unit() const = 0;

#if ZOR_PLATFORM_ADDITIONS
  virtual ZORUnicodeString Name() const = 0;
#endif
};

typedef ZORInterfaceHandle<ZORICkeMagnitude> ZORICkeMagnitude_var;

#endif
