#include "default_platform/visualisation/PlacedMeshRep.h"

#include <utility>

#include "default_platform/visualisation/SphereAround.h"
#include "default_platform/visualisation/ZOR3DSceneVisitor.h"

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
  ZORDefault::SphereAround sphere;
  sphere.AddMesh(*mesh_, rootFromPart_);
  return sphere.Get();
}

void PlacedMeshRep::Accept(ZOR3DSceneVisitor& ioVisitor) const { ioVisitor.VisitMesh(*this); }
