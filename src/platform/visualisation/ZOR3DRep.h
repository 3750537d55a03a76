// What is shown of an object in space.
#ifndef ZOR_PLATFORM_VISUALISATION_ZOR3DREP_H
#define ZOR_PLATFORM_VISUALISATION_ZOR3DREP_H

#include "platform/ZORPlatformAdditions.h"
#include "platform/visualisation/ZORRep.h"

class ZOR3DSceneVisitor;

class ZOR_PLATFORM_EXPORT ZOR3DRep : public ZORRep {
 public:
  /// The sphere around all that this node shows; empty when it shows nothing.
  virtual ZOR3DBoundingSphere GetShowBoundingElement() const = 0;

#if ZOR_PLATFORM_ADDITIONS
  /// Hands what the node shows to a visitor.
  virtual void Accept(ZOR3DSceneVisitor& ioVisitor) const = 0;
#endif

 protected:
  ZOR3DRep();
  ~ZOR3DRep() override;
};

#endif
