// Walking through what a representation shows.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_ZOR3DSCENEVISITOR_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_ZOR3DSCENEVISITOR_H

class PlacedMeshRep;
class ZOR3DBagRep;

/// Is shown the nodes of a scene, from the top down.
class ZOR3DSceneVisitor {
 public:
  virtual void VisitMesh(const PlacedMeshRep& inMesh) = 0;
  /// @return true to be shown the bag's children too; LeaveBag follows then.
  virtual bool EnterBag(const ZOR3DBagRep& inBag) = 0;
  virtual void LeaveBag(const ZOR3DBagRep& inBag) = 0;

 protected:
  ~ZOR3DSceneVisitor() = default;
};

#endif
