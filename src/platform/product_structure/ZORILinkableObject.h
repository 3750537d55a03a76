// An object that knows its document.
#ifndef ZOR_PLATFORM_PRODUCT_STRUCTURE_ZORILINKABLEOBJECT_H
#define ZOR_PLATFORM_PRODUCT_STRUCTURE_ZORILINKABLEOBJECT_H

#include "ZORPlatformExport.h"
#include "platform/product_structure/ZORDocument.h"
#include "platform/system/ZORInterfaceHandle.h"

class ZOR_PLATFORM_EXPORT ZORILinkableObject : public ZORBaseUnknown {
 public:
  static const IID& ClassId();
  /// @return the document that holds the object, borrowed; null when there is none.
  virtual ZORDocument* GetDocument() = 0;
};

typedef ZORInterfaceHandle<ZORILinkableObject> ZORILinkableObject_var;

#endif
