// A node that holds other nodes.
#ifndef ZOR_PLATFORM_VISUALISATION_ZOR3DBAGREP_H
#define ZOR_PLATFORM_VISUALISATION_ZOR3DBAGREP_H

#include <vector>

#include "platform/ZORPlatformAdditions.h"
#include "platform/visualisation/ZOR3DRep.h"

/// Shows its children, which it does not own. Made with new, ended with Destroy.
class ZOR_PLATFORM_EXPORT ZOR3DBagRep : public ZOR3DRep {
 public:
  ZOR3DBagRep();
  /// Adds a node as the last child; null is passed over.
  void AddChild(ZORRep* inChild);
  /// Takes the first occurrence of a child out; one that is none is passed over.
  void RemoveChild(ZORRep* inChild);
  ZOR3DBoundingSphere GetShowBoundingElement() const override;

#if ZOR_PLATFORM_ADDITIONS
  const std::vector<ZOR3DRep*>& GetChildren() const;
  void Accept(ZOR3DSceneVisitor& ioVisitor) const override;
#endif

 protected:
  ~ZOR3DBagRep() override;

 private:
  std::vector<ZOR3DRep*> children_;
};

#endif
