#include "default_platform/visualisation/Rendering.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstdlib>
#include <cstring>
#include <mutex>
#include <numbers>
#include <utility>

#include "foundation/PluginLoader.h"
#include "foundation/Vector3.h"

namespace ZORDefault {
namespace {

constexpr double kMaxViewAngle = 170 * std::numbers::pi / 180;

using ZORFoundation::Cross;
using ZORFoundation::IsFinite;

ZORMathVector RightOf(const ZORMathVector& inForward, const ZORMathVector& inUp) {
  constexpr double kParallel = 1e-6;
  for (const ZORMathVector& up :
       {NormalizeOr(inUp, {0, 0, 0}), ZORMathVector(0, 0, 1), ZORMathVector(0, 1, 0)}) {
    const ZORMathVector right = Cross(inForward, up);
    if (ZORFoundation::Length(right) > kParallel) return NormalizeOr(right, {1, 0, 0});
  }
  return {1, 0, 0};
}

double PixelSize(const ZOR3DViewpoint& inViewpoint, int inHeight) {
  if (inViewpoint.projection == ZOR3DViewpoint::kCylindric)
    return PositiveOr(inViewpoint.viewHeight, 1) / inHeight;
  const double angle =
      std::min(PositiveOr(inViewpoint.viewAngle, std::numbers::pi / 6), kMaxViewAngle);
  return 2 * std::tan(angle / 2) / inHeight;
}

const RayCaster* FindRayCaster() {
  std::string reason;
  void* const function =
      ZORFoundation::FindPluginFunction("ZORRayCaster", kGetRayCasterName, reason);
  return function ? reinterpret_cast<GetRayCasterFunction*>(function)() : nullptr;
}

}  // namespace

ZORMathVector DefaultSightDirection() {
  const double component = -1 / std::sqrt(3.0);
  return {component, component, component};
}

double PositiveOr(double inValue, double inOtherwise) {
  return std::isfinite(inValue) && inValue > 0 ? inValue : inOtherwise;
}

ZORMathVector NormalizeOr(const ZORMathVector& inVector, const ZORMathVector& inOtherwise) {
  if (!IsFinite(inVector)) return inOtherwise;
  // Scaled by the largest component first, so that the length cannot overflow or underflow.
  const double largest =
      std::max({std::fabs(inVector.x), std::fabs(inVector.y), std::fabs(inVector.z)});
  if (largest == 0) return inOtherwise;
  const ZORMathVector scaled(inVector.x / largest, inVector.y / largest, inVector.z / largest);
  const double length = ZORFoundation::Length(scaled);
  return {scaled.x / length, scaled.y / length, scaled.z / length};
}

Camera MakeCamera(const ZOR3DViewpoint& inViewpoint, int inHeight) {
  Camera camera;
  camera.isPerspective = inViewpoint.projection != ZOR3DViewpoint::kCylindric;
  camera.eye = IsFinite(inViewpoint.origin) ? inViewpoint.origin : ZORMathVector();
  camera.forward = NormalizeOr(inViewpoint.sight, DefaultSightDirection());
  camera.right = RightOf(camera.forward, inViewpoint.up);
  camera.down = Cross(camera.forward, camera.right);
  camera.pixelSize = PixelSize(inViewpoint, inHeight);
  camera.nearPlane = PositiveOr(inViewpoint.nearPlane, 0);
  camera.farPlane = PositiveOr(inViewpoint.farPlane, 0);
  return camera;
}

const RayCaster* LoadRayCaster() {
  static std::mutex mutex;
  const std::lock_guard lock(mutex);
  static const RayCaster* rayCaster = nullptr;
  if (!rayCaster) rayCaster = FindRayCaster();
  return rayCaster;
}

bool IsPictureSize(int inWidth, int inHeight) {
  return inWidth >= 1 && inHeight >= 1 && inWidth <= kMaxPictureSize && inHeight <= kMaxPictureSize;
}

int PictureThreadCount() {
  constexpr int kMaxThreads = 64;
  const char* const wanted = std::getenv("ZOR_PICTURE_THREADS");
  int count = 1;
  if (wanted) std::from_chars(wanted, wanted + std::strlen(wanted), count);
  return std::clamp(count, 1, kMaxThreads);
}

PictureRequest MakePictureRequest(const ZOR3DRep& inRep, const ZOR3DViewpoint& inViewpoint,
                                  int inWidth, int inHeight, const ZORSupport* inSupport) {
  PictureRequest request;
  request.width = inWidth;
  request.height = inHeight;
  request.camera = MakeCamera(inViewpoint, inHeight);
  request.meshes = CollectMeshInstances(inRep);
  request.threadCount = PictureThreadCount();
  if (!inSupport) return request;
  request.hasBackground = inSupport->HasBackgroundColor();
  std::copy_n(inSupport->GetBackgroundColor(), 3, request.background);
  request.isShaded = inSupport->GetViewMode(ZORSupport::kShading) != 0;
  request.showsHiddenEdges = inSupport->GetViewMode(ZORSupport::kHiddenEdges) != 0;
  return request;
}

std::optional<std::vector<IdBufferPixel>> RenderIdBuffer(const ZOR3DRep& inRep,
                                                         const ZOR3DViewpoint& inViewpoint,
                                                         int inWidth, int inHeight) {
  if (!IsPictureSize(inWidth, inHeight)) return std::nullopt;
  const RayCaster* const rayCaster = LoadRayCaster();
  std::vector<IdBufferPixel> pixels;
  if (!rayCaster || !rayCaster->renderIdBuffer(
                        MakePictureRequest(inRep, inViewpoint, inWidth, inHeight, nullptr), pixels))
    return std::nullopt;
  return pixels;
}

}  // namespace ZORDefault
