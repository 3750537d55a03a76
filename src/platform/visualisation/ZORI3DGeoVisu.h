// The representation of an object that can be shown.
#ifndef ZOR_PLATFORM_VISUALISATION_ZORI3DGEOVISU_H
#define ZOR_PLATFORM_VISUALISATION_ZORI3DGEOVISU_H

#include "platform/system/ZORInterfaceHandle.h"
#include "platform/visualisation/ZORRep.h"

class ZOR_PLATFORM_EXPORT ZORI3DGeoVisu : public ZORBaseUnknown {
 public:
  static const IID& ClassId();
  /// The object's representation. Of a product: the product's own, with all below it, placed in
  /// the root's space; belongs to the product. Null when there is nothing to show.
  virtual ZORRep* GetRep() = 0;
};

typedef ZORInterfaceHandle<ZORI3DGeoVisu> ZORI3DGeoVisu_var;

#endif
