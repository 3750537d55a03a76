#include "platform/visualisation/ZOR3DViewpoint.h"

#include <algorithm>
#include <cmath>

#include "default_platform/system/ObjectCounters.h"
#include "default_platform/visualisation/Rendering.h"
#include "foundation/Vector3.h"

using ZORDefault::PositiveOr;

namespace {

constexpr double kDefaultAngle = 30 * 3.14159265358979323846 / 180;
constexpr double kDefaultDistance = 100;

/// The sphere with non-finite values replaced.
ZOR3DBoundingSphere Framed(const ZOR3DBoundingSphere& inSphere) {
  return {ZORFoundation::IsFinite(inSphere.centre) ? inSphere.centre : ZORMathVector(),
          PositiveOr(inSphere.radius, 1)};
}

}  // namespace

ZOR3DViewpoint::ZOR3DViewpoint()
    : sight(ZORDefault::DefaultSightDirection()),
      up(0, 0, 1),
      focusDistance(kDefaultDistance),
      viewAngle(kDefaultAngle),
      viewHeight(kDefaultDistance) {
  up = ZORDefault::NormalizeOr({-1, -1, 2}, up);
  origin = {-sight.x * focusDistance, -sight.y * focusDistance, -sight.z * focusDistance};
  ++ZORDefault::CounterOf<ZOR3DViewpoint>("ZOR3DViewpoint").built;
}

ZOR3DViewpoint::ZOR3DViewpoint(const ZOR3DViewpoint& inOther) : ZORBaseUnknown(inOther) {
  ++ZORDefault::CounterOf<ZOR3DViewpoint>("ZOR3DViewpoint").built;
  *this = inOther;
}

ZOR3DViewpoint& ZOR3DViewpoint::operator=(const ZOR3DViewpoint& inOther) {
  projection = inOther.projection;
  origin = inOther.origin;
  sight = inOther.sight;
  up = inOther.up;
  focusDistance = inOther.focusDistance;
  viewAngle = inOther.viewAngle;
  viewHeight = inOther.viewHeight;
  nearPlane = inOther.nearPlane;
  farPlane = inOther.farPlane;
  return *this;
}

ZOR3DViewpoint::~ZOR3DViewpoint() {
  ++ZORDefault::CounterOf<ZOR3DViewpoint>("ZOR3DViewpoint").released;
}

void ZOR3DViewpoint::Reframe(float inWidth, float inHeight, float inWidthScale, float inHeightScale,
                             const ZOR3DBoundingSphere& inSphere) {
  const ZOR3DBoundingSphere sphere = Framed(inSphere);
  const double widthScale = PositiveOr(inWidthScale, 1);
  const double heightScale = PositiveOr(inHeightScale, 1);
  // The room for the sphere, in halves of the picture's height.
  const double room =
      std::min(heightScale, widthScale * PositiveOr(inWidth, 1) / PositiveOr(inHeight, 1));

  sight = ZORDefault::NormalizeOr(sight, ZORDefault::DefaultSightDirection());
  if (projection == kCylindric) {
    viewHeight = 2 * sphere.radius / room;
    focusDistance = 2 * sphere.radius;
  } else {
    viewAngle = PositiveOr(viewAngle, kDefaultAngle);
    focusDistance = sphere.radius / std::sin(std::atan(std::tan(viewAngle / 2) * room));
  }
  origin = {sphere.centre.x - sight.x * focusDistance, sphere.centre.y - sight.y * focusDistance,
            sphere.centre.z - sight.z * focusDistance};
  nearPlane = farPlane = 0;
}

void ZOR3DViewpoint::Reframe(float inWidth, float inHeight, float inWidthScale,
                             float inHeightScale) {
  Reframe(inWidth, inHeight, inWidthScale, inHeightScale, scene_);
}
