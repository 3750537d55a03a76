// A document that holds objects.
#ifndef ZOR_PLATFORM_PRODUCT_STRUCTURE_ZORDOCUMENT_H
#define ZOR_PLATFORM_PRODUCT_STRUCTURE_ZORDOCUMENT_H

#include "ZORPlatformExport.h"
#include "platform/system/ZORInterfaceHandle.h"

/// An opened document, such as an assembly with all its products.
class ZOR_PLATFORM_EXPORT ZORDocument : public ZORBaseUnknown {
 public:
  static const IID& ClassId();
};

typedef ZORInterfaceHandle<ZORDocument> ZORDocument_var;

#endif
