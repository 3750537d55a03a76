// The name by which people know an object.
#ifndef ZOR_PLATFORM_PRODUCT_STRUCTURE_ZORIALIAS_H
#define ZOR_PLATFORM_PRODUCT_STRUCTURE_ZORIALIAS_H

#include "ZORPlatformExport.h"
#include "platform/system/ZORInterfaceHandle.h"
#include "platform/system/ZORUnicodeString.h"

class ZOR_PLATFORM_EXPORT ZORIAlias : public ZORBaseUnknown {
 public:
  static const IID& ClassId();
  /// The alias; never empty on the default platform, and different from its siblings'.
  virtual ZORUnicodeString GetAlias() = 0;
};

typedef ZORInterfaceHandle<ZORIAlias> ZORIAlias_var;

#endif
