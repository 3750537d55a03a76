// A product of an assembly.
#ifndef ZOR_PLATFORM_PRODUCT_STRUCTURE_ZORIPRODUCT_H
#define ZOR_PLATFORM_PRODUCT_STRUCTURE_ZORIPRODUCT_H

#include "ZORPlatformExport.h"
#include "platform/system/ZORInterfaceHandle.h"
#include "platform/system/ZORListValZORBaseUnknown_var.h"

/// One instance in a product tree: a part that carries geometry, or an assembly of products.
class ZOR_PLATFORM_EXPORT ZORIProduct : public ZORBaseUnknown {
 public:
  static const IID& ClassId();
  /// The children that offer an interface, in their order in the product.
  /// @return a new list that the caller deletes, possibly empty; null for an unknown interface.
  virtual ZORListValZORBaseUnknown_var* GetChildren(const char* inInterfaceName) = 0;
  /// The product that this one is a child of; empty at the root.
  virtual ZORInterfaceHandle<ZORIProduct> GetFatherProduct() = 0;
};

typedef ZORInterfaceHandle<ZORIProduct> ZORIProduct_var;

#endif
