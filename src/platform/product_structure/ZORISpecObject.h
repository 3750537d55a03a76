// An object in the tree of its document.
#ifndef ZOR_PLATFORM_PRODUCT_STRUCTURE_ZORISPECOBJECT_H
#define ZOR_PLATFORM_PRODUCT_STRUCTURE_ZORISPECOBJECT_H

#include "ZORPlatformExport.h"
#include "platform/system/ZORInterfaceHandle.h"
#include "platform/system/ZORListVal.h"

class ZOR_PLATFORM_EXPORT ZORISpecObject : public ZORBaseUnknown {
 public:
  static const IID& ClassId();
  /// @return the father with a reference that the caller releases; null at the root.
  virtual ZORISpecObject* GetFather() = 0;
};

typedef ZORInterfaceHandle<ZORISpecObject> ZORISpecObject_var;
typedef ZORListVal<ZORISpecObject_var> ZORListValZORISpecObject_var;

#endif
