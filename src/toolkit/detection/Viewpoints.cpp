#include "toolkit/detection/Viewpoints.h"

#include <algorithm>
#include <map>

#include "default_platform/InterferenceScene.h"
#include "default_platform/OpenModel.h"
#include "toolkit/publishing/pictures/PictureCamera.h"
#include "toolkit/records/DocumentText.h"

namespace ZORToolkit {
namespace {

std::array<double, 3> NumbersOf(const ZORMathVector& inVector) {
  return {inVector.x, inVector.y, inVector.z};
}

DetectedViewpoint ViewpointOf(const ZORDefault::InterferenceScene& inScene) {
  // What is right before the eye hides nothing that is framed.
  constexpr double kNear = 0.01;
  const PictureCamera camera = CameraOf(inScene, PictureSize(), true);
  return {NumbersOf(camera.eye), NumbersOf(camera.sight), camera.focusDistance,
          kNear * camera.focusDistance, DepthOf(inScene, camera)};
}

}  // namespace

std::vector<std::array<double, 3>> WrittenPoints(const DetectedInterference& inFound) {
  constexpr std::size_t kMaxCurvePoints = 32;
  std::vector<std::array<double, 3>> points(inFound.points.begin(), inFound.points.end());
  const std::size_t count = std::min(inFound.curve.size(), kMaxCurvePoints);
  for (std::size_t i = 0; i < count; ++i)
    points.push_back(inFound.curve[i * inFound.curve.size() / count]);
  return points;
}

void AddViewpoints(const ZORIProduct_var& inRoot, DetectionResult& ioResult) {
  std::map<std::size_t, ZORIProduct_var> products;
  const auto productAt = [&](std::size_t inNumber) {
    const auto [place, isNew] = products.try_emplace(inNumber);
    if (isNew)
      place->second = ZORDefault::FindProduct(inRoot, FromUtf8(ioResult.products[inNumber].path));
    return ZORDefault::SceneProduct{place->second, std::nullopt};
  };
  for (DetectedInterference& found : ioResult.interferences) {
    ZORDefault::InterferenceGeometry geometry;
    for (const auto& [x, y, z] : WrittenPoints(found)) geometry.points.emplace_back(x, y, z);
    if (found.kind == DetectedInterference::Kind::kClearance)
      geometry.markers = ZORDefault::MarkerKind::kDimension;
    found.viewpoint = ViewpointOf(ZORDefault::MakeInterferenceScene(
        geometry, {productAt(found.first), productAt(found.second)}));
  }
}

}  // namespace ZORToolkit
