#include "platform/visualisation/ZOR3DBagRep.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include "default_platform/visualisation/ZOR3DSceneVisitor.h"

namespace {

/// A box that grows around spheres.
struct Box {
  ZORMathVector low{kFar, kFar, kFar};
  ZORMathVector high{-kFar, -kFar, -kFar};

  void Add(const ZOR3DBoundingSphere& inSphere) {
    const ZORMathVector& centre = inSphere.centre;
    const double radius = inSphere.radius;
    low = {std::min(low.x, centre.x - radius), std::min(low.y, centre.y - radius),
           std::min(low.z, centre.z - radius)};
    high = {std::max(high.x, centre.x + radius), std::max(high.y, centre.y + radius),
            std::max(high.z, centre.z + radius)};
  }
  ZORMathVector Middle() const {
    return {(low.x + high.x) / 2, (low.y + high.y) / 2, (low.z + high.z) / 2};
  }

  static constexpr double kFar = std::numeric_limits<double>::max();
};

/// A sphere around spheres, in the middle of their box.
ZOR3DBoundingSphere SphereAround(const std::vector<ZOR3DBoundingSphere>& inSpheres) {
  if (inSpheres.empty()) return {};
  Box box;
  for (const ZOR3DBoundingSphere& sphere : inSpheres) box.Add(sphere);
  const ZORMathVector middle = box.Middle();
  double radius = 0;
  for (const ZOR3DBoundingSphere& sphere : inSpheres) {
    const double distance = std::hypot(sphere.centre.x - middle.x, sphere.centre.y - middle.y,
                                       sphere.centre.z - middle.z);
    radius = std::max(radius, distance + sphere.radius);
  }
  return {middle, radius};
}

}  // namespace

ZOR3DBagRep::ZOR3DBagRep() = default;
ZOR3DBagRep::~ZOR3DBagRep() = default;

void ZOR3DBagRep::AddChild(ZORRep* inChild) {
  if (auto* const child = dynamic_cast<ZOR3DRep*>(inChild)) children_.push_back(child);
}

void ZOR3DBagRep::RemoveChild(ZORRep* inChild) {
  const auto found = std::find(children_.begin(), children_.end(), inChild);
  if (found != children_.end()) children_.erase(found);
}

const std::vector<ZOR3DRep*>& ZOR3DBagRep::GetChildren() const { return children_; }

ZOR3DBoundingSphere ZOR3DBagRep::GetShowBoundingElement() const {
  std::vector<ZOR3DBoundingSphere> spheres;
  for (const ZOR3DRep* const child : children_) {
    const ZOR3DBoundingSphere sphere = child->GetShowBoundingElement();
    if (!sphere.IsEmpty()) spheres.push_back(sphere);
  }
  return SphereAround(spheres);
}

void ZOR3DBagRep::Accept(ZOR3DSceneVisitor& ioVisitor) const {
  if (!ioVisitor.EnterBag(*this)) return;
  for (const ZOR3DRep* const child : children_) child->Accept(ioVisitor);
  ioVisitor.LeaveBag(*this);
}
