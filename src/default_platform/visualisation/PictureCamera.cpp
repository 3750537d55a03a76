#include "default_platform/visualisation/PictureCamera.h"

#include <algorithm>
#include <cmath>

namespace ZORDefault {
namespace {

constexpr double kPi = 3.14159265358979323846;
constexpr double kWidestAngle = 170 * kPi / 180;

bool IsFinite(const ZORMathVector& inVector) {
  return std::isfinite(inVector.x) && std::isfinite(inVector.y) && std::isfinite(inVector.z);
}

ZORMathVector Cross(const ZORMathVector& inA, const ZORMathVector& inB) {
  return {inA.y * inB.z - inA.z * inB.y, inA.z * inB.x - inA.x * inB.z,
          inA.x * inB.y - inA.y * inB.x};
}

ZORMathVector RightOf(const ZORMathVector& inForward, const ZORMathVector& inUp) {
  constexpr double kParallel = 1e-6;
  for (const ZORMathVector& up :
       {Direction(inUp, {0, 0, 0}), ZORMathVector(0, 0, 1), ZORMathVector(0, 1, 0)}) {
    const ZORMathVector right = Cross(inForward, up);
    if (std::hypot(right.x, right.y, right.z) > kParallel) return Direction(right, {1, 0, 0});
  }
  return {1, 0, 0};
}

double PixelSize(const ZOR3DViewpoint& inViewpoint, int inHeight) {
  if (inViewpoint.projection == ZOR3DViewpoint::kCylindric)
    return PositiveOr(inViewpoint.viewHeight, 1) / inHeight;
  const double angle = std::min(PositiveOr(inViewpoint.viewAngle, kPi / 6), kWidestAngle);
  return 2 * std::tan(angle / 2) / inHeight;
}

}  // namespace

ZORMathVector DefaultSight() {
  const double component = -1 / std::sqrt(3.0);
  return {component, component, component};
}

double PositiveOr(double inValue, double inOtherwise) {
  return std::isfinite(inValue) && inValue > 0 ? inValue : inOtherwise;
}

ZORMathVector Direction(const ZORMathVector& inVector, const ZORMathVector& inOtherwise) {
  if (!IsFinite(inVector)) return inOtherwise;
  // By its largest component first, so that no length is too large or too small.
  const double largest =
      std::max({std::fabs(inVector.x), std::fabs(inVector.y), std::fabs(inVector.z)});
  if (largest == 0) return inOtherwise;
  const ZORMathVector scaled(inVector.x / largest, inVector.y / largest, inVector.z / largest);
  const double length = std::hypot(scaled.x, scaled.y, scaled.z);
  return {scaled.x / length, scaled.y / length, scaled.z / length};
}

Camera CameraOf(const ZOR3DViewpoint& inViewpoint, int inHeight) {
  Camera camera;
  camera.isConic = inViewpoint.projection != ZOR3DViewpoint::kCylindric;
  camera.eye = IsFinite(inViewpoint.origin) ? inViewpoint.origin : ZORMathVector();
  camera.forward = Direction(inViewpoint.sight, DefaultSight());
  camera.right = RightOf(camera.forward, inViewpoint.up);
  camera.down = Cross(camera.forward, camera.right);
  camera.pixelSize = PixelSize(inViewpoint, inHeight);
  camera.nearPlane = PositiveOr(inViewpoint.nearPlane, 0);
  camera.farPlane = PositiveOr(inViewpoint.farPlane, 0);
  return camera;
}

}  // namespace ZORDefault
