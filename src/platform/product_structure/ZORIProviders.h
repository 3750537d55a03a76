// The providers of a document.
#ifndef ZOR_PLATFORM_PRODUCT_STRUCTURE_ZORIPROVIDERS_H
#define ZOR_PLATFORM_PRODUCT_STRUCTURE_ZORIPROVIDERS_H

#include "ZORPlatformExport.h"
#include "platform/system/ZORInterfaceHandle.h"

/// A document's list of objects that provide something for it, by interface.
class ZOR_PLATFORM_EXPORT ZORIProviders : public ZORBaseUnknown {
 public:
  static const IID& ClassId();
  /// Adds a provider for an interface; the document keeps a reference until it is closed.
  /// @return S_OK; E_INVALIDARG for null; E_FAIL when it is a provider for that interface already.
  virtual HRESULT AddProvider(const IID& inInterface, ZORBaseUnknown* inProvider) = 0;
};

typedef ZORInterfaceHandle<ZORIProviders> ZORIProviders_var;

#endif
