// A part's mesh at its place.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_PLACEDMESHREP_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_PLACEDMESHREP_H

#include <memory>

#include "ZORPlatformExport.h"
#include "default_platform/visualisation/PartMesh.h"
#include "platform/mathematics/ZORMathTransformation.h"
#include "platform/visualisation/ZOR3DRep.h"

/// Shows one mesh, which it shares with other nodes, placed in the root's space.
class ZOR_PLATFORM_EXPORT PlacedMeshRep : public ZOR3DRep {
 public:
  /// @param inMesh never null.
  /// @param inOwnColour shown by triangles without a colour of their own; null: the default grey.
  PlacedMeshRep(std::shared_ptr<const PartMesh> inMesh, const ZORMathTransformation& inRootFromPart,
                const PartColour* inOwnColour);
  const std::shared_ptr<const PartMesh>& GetMesh() const { return mesh_; }
  const ZORMathTransformation& GetRootFromPart() const { return rootFromPart_; }
  /// Whether the mesh is drawn over all that is not, as markers are, whatever lies between it and
  /// the eye; not at first. Has no effect in a view with a near plane.
  void SetDrawnOver(bool inIsDrawnOver) { isDrawnOver_ = inIsDrawnOver; }
  bool IsDrawnOver() const { return isDrawnOver_; }
  ZOR3DBoundingSphere GetShowBoundingElement() const override;
  void Accept(ZOR3DSceneVisitor& ioVisitor) const override;

 protected:
  ~PlacedMeshRep() override;

 private:
  std::shared_ptr<const PartMesh> mesh_;
  ZORMathTransformation rootFromPart_;
  bool isDrawnOver_ = false;
};

#endif
