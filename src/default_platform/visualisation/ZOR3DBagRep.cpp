#include "platform/visualisation/ZOR3DBagRep.h"

#include <algorithm>

#include "default_platform/system/ObjectCounters.h"
#include "default_platform/visualisation/PlacedMeshRep.h"
#include "default_platform/visualisation/SphereAround.h"
#include "default_platform/visualisation/ZOR3DSceneVisitor.h"

namespace {

ZORDefault::ObjectCounter& Counter() {
  static ZORDefault::ObjectCounter& counter = ZORDefault::CounterOf("ZOR3DBagRep");
  return counter;
}

void AddTo(ZORDefault::SphereAround& ioSphere, const ZOR3DRep& inRep) {
  if (const auto* const bag = dynamic_cast<const ZOR3DBagRep*>(&inRep)) {
    for (const ZOR3DRep* const child : bag->GetChildren()) AddTo(ioSphere, *child);
  } else if (const auto* const mesh = dynamic_cast<const PlacedMeshRep*>(&inRep)) {
    ioSphere.AddMesh(*mesh->GetMesh(), mesh->GetRootFromPart());
  } else {
    ioSphere.AddSphere(inRep.GetShowBoundingElement());
  }
}

}  // namespace

ZOR3DBagRep::ZOR3DBagRep() { ++Counter().built; }
ZOR3DBagRep::~ZOR3DBagRep() { ++Counter().released; }

void ZOR3DBagRep::AddChild(ZORRep* inChild) {
  if (auto* const child = dynamic_cast<ZOR3DRep*>(inChild)) children_.push_back(child);
}

void ZOR3DBagRep::RemoveChild(ZORRep* inChild) {
  const auto found = std::find(children_.begin(), children_.end(), inChild);
  if (found != children_.end()) children_.erase(found);
}

const std::vector<ZOR3DRep*>& ZOR3DBagRep::GetChildren() const { return children_; }

ZOR3DBoundingSphere ZOR3DBagRep::GetShowBoundingElement() const {
  ZORDefault::SphereAround sphere;
  AddTo(sphere, *this);
  return sphere.Get();
}

void ZOR3DBagRep::Accept(ZOR3DSceneVisitor& ioVisitor) const {
  if (!ioVisitor.EnterBag(*this)) return;
  for (const ZOR3DRep* const child : children_) child->Accept(ioVisitor);
  ioVisitor.LeaveBag(*this);
}
