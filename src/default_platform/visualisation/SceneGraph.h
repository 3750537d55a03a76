// The scene that a representation shows: meshes with their placements and colours.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_SCENEGRAPH_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_SCENEGRAPH_H

#include <memory>
#include <vector>

#include "ZORPlatformExport.h"
#include "default_platform/PartMesh.h"
#include "platform/mathematics/ZORMathTransformation.h"
#include "platform/visualisation/ZOR3DRep.h"

class ZOR3DBagRep;

/// A leaf of the scene: one mesh, which it shares with other leaves, placed in the root's space.
class ZOR_PLATFORM_EXPORT PlacedMeshRep : public ZOR3DRep {
 public:
  /// @param inMesh never null.
  /// @param inOwnColour shown by triangles without a colour of their own; null: the default grey.
  PlacedMeshRep(std::shared_ptr<const PartMesh> inMesh, const ZORMathTransformation& inRootFromPart,
                const PartColour* inOwnColour);
  const std::shared_ptr<const PartMesh>& GetMesh() const { return mesh_; }
  const ZORMathTransformation& GetRootFromPart() const { return rootFromPart_; }
  /// An overlay is drawn over everything that is not one, whatever lies between it and the eye, as
  /// markers are; off at first. Has no effect in a view with a near plane.
  void SetOverlay(bool inIsOverlay) { isOverlay_ = inIsOverlay; }
  bool IsOverlay() const { return isOverlay_; }
  ZOR3DBoundingSphere GetShowBoundingElement() const override;
  void Accept(ZOR3DSceneVisitor& ioVisitor) const override;

 protected:
  ~PlacedMeshRep() override;

 private:
  std::shared_ptr<const PartMesh> mesh_;
  ZORMathTransformation rootFromPart_;
  bool isOverlay_ = false;
};

/// Visits the nodes of a scene in preorder.
class ZOR3DSceneVisitor {
 public:
  virtual void VisitMesh(const PlacedMeshRep& inMesh) = 0;
  /// @return true to visit the bag's children too; LeaveBag follows then.
  virtual bool EnterBag(const ZOR3DBagRep& inBag) = 0;
  virtual void LeaveBag(const ZOR3DBagRep& inBag) = 0;

 protected:
  ~ZOR3DSceneVisitor() = default;
};

namespace ZORDefault {

/// One occurrence of a mesh in a scene, with its placement and resolved colour.
struct MeshInstance {
  std::shared_ptr<const PartMesh> mesh;
  ZORMathTransformation rootFromPart;
  /// Of the triangles without a colour of their own; of all when it is imposed.
  PartColour colour{210, 210, 210, 255};
  bool isColourImposed = false;
  bool isOverlay = false;
};

/// The meshes that a node shows, in preorder. An ancestor that imposes its colour wins, the topmost
/// first; then a triangle's own colour; then the nearest node that shows its colour.
ZOR_PLATFORM_EXPORT std::vector<MeshInstance> CollectMeshInstances(const ZOR3DRep& inRep);

}  // namespace ZORDefault

#endif
