// What the session knows of a product.
#ifndef ZOR_PLATFORM_PRODUCT_STRUCTURE_ZORIPRODUCTINSESSION_H
#define ZOR_PLATFORM_PRODUCT_STRUCTURE_ZORIPRODUCTINSESSION_H

#include "ZORPlatformExport.h"
#include "platform/system/ZORInterfaceHandle.h"
#include "platform/system/ZORUnicodeString.h"

/// A product's own representation: geometry of the product itself, not that of its children.
class ZOR_PLATFORM_EXPORT ZORIProductInSession : public ZORBaseUnknown {
 public:
  static const IID& ClassId();
  /// The name of the product's own representation.
  /// @param outState 1 when it is loaded, else 0.
  /// @param inShown  1: the representation that is shown.
  /// @param outName  the part's name; empty when the product has no geometry of its own.
  /// @return S_OK; E_INVALIDARG for another inShown.
  virtual HRESULT GetRepresentationName(int& outState, int inShown, ZORUnicodeString& outName) = 0;
  /// The product's own representation as a component.
  /// @return S_OK with a handle; E_FAIL, the handle empty, when the product has no geometry of its
  ///         own; E_INVALIDARG for another inShown.
  virtual HRESULT GetRepresentation(int& outState, int inShown, ZORBaseUnknown_var& outRep) = 0;
};

typedef ZORInterfaceHandle<ZORIProductInSession> ZORIProductInSession_var;

/// @return non-zero when the session works in the new visualisation mode, in which representations
///         are asked for as handles; 0 in the old mode, in which they are asked for by name.
ZOR_PLATFORM_EXPORT int ZORPrdNewVisuMode();

#endif
