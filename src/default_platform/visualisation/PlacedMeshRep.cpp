#include "default_platform/visualisation/PlacedMeshRep.h"

#include <algorithm>
#include <cmath>

#include "default_platform/visualisation/ZOR3DSceneVisitor.h"

namespace {

/// By how much a transformation stretches lengths at most, for rotations with a scale of each axis.
double LargestScale(const ZORMathTransformation& inTransformation) {
  double largest = 0;
  for (int i = 0; i < 3; ++i) {
    const ZORMathVector& column = inTransformation.GetMatrix().GetColumn(i);
    largest = std::max(largest, std::hypot(column.x, column.y, column.z));
  }
  return largest;
}

}  // namespace

PlacedMeshRep::PlacedMeshRep(std::shared_ptr<const PartMesh> inMesh,
                             const ZORMathTransformation& inRootFromPart,
                             const PartColour* inOwnColour)
    : mesh_(std::move(inMesh)), rootFromPart_(inRootFromPart) {
  if (!inOwnColour) return;
  SetColorRGBA((*inOwnColour)[0], (*inOwnColour)[1], (*inOwnColour)[2], (*inOwnColour)[3]);
  SetInheritanceMode(kOwnColour);
}

PlacedMeshRep::~PlacedMeshRep() = default;

ZOR3DBoundingSphere PlacedMeshRep::GetShowBoundingElement() const {
  if (mesh_->sphere.IsEmpty()) return {};
  return {rootFromPart_ * mesh_->sphere.centre, mesh_->sphere.radius * LargestScale(rootFromPart_)};
}

void PlacedMeshRep::Accept(ZOR3DSceneVisitor& ioVisitor) const { ioVisitor.VisitMesh(*this); }
