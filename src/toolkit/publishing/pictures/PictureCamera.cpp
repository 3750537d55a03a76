#include "toolkit/publishing/pictures/PictureCamera.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdio>
#include <memory>
#include <sstream>

#include "foundation/Vector3.h"
#include "platform/visualisation/ZOR3DBagRep.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"

namespace ZORToolkit {
namespace {

struct Destroyer {
  void operator()(ZORRep* inRep) const { inRep->Destroy(); }
};
using OwnedRep = std::unique_ptr<ZORRep, Destroyer>;

template <class Handle>
ZORRep* RepOf(const Handle& inShown) {
  const ZORI3DGeoVisu_var visible = inShown;
  return visible.IsNull() ? nullptr : visible->GetRep();
}

ZOR3DBoundingSphere FramedSphere(const ZORDefault::InterferenceScene& inScene,
                                 bool inFramesInterference) {
  const OwnedRep markers(RepOf(inScene.interference));  // made at each call, and the caller's
  if (markers && inFramesInterference)
    return static_cast<ZOR3DRep*>(markers.get())->GetShowBoundingElement();
  auto* const bag = new ZOR3DBagRep;
  const OwnedRep owned(bag);
  for (const ZORIProduct_var& product : inScene.products)
    if (!product.IsNull()) bag->AddChild(RepOf(product));
  if (markers) bag->AddChild(markers.get());
  return bag->GetShowBoundingElement();
}

PictureCamera CameraFrom(const ZOR3DViewpoint& inViewpoint) {
  PictureCamera camera;
  camera.isPerspective = inViewpoint.projection == ZOR3DViewpoint::kConic;
  camera.eye = inViewpoint.origin;
  camera.sight = inViewpoint.sight;
  camera.up = inViewpoint.up;
  camera.focusDistance = inViewpoint.focusDistance;
  camera.angle = inViewpoint.viewAngle;
  camera.height = inViewpoint.viewHeight;
  camera.nearPlane = inViewpoint.nearPlane;
  camera.farPlane = inViewpoint.farPlane;
  return camera;
}

void Reframe(ZOR3DViewpoint& ioViewpoint, PictureSize inSize, const ZOR3DBoundingSphere& inSphere) {
  ioViewpoint.Reframe(static_cast<float>(inSize.width), static_cast<float>(inSize.height), 1, 1,
                      inSphere);
}

}  // namespace

PictureCamera CameraOf(const ZORDefault::InterferenceScene& inScene, PictureSize inSize,
                       bool inFramesInterference) {
  ZOR3DViewpoint viewpoint;
  if (inScene.interference->FillViewpoint(&viewpoint) != 1)
    Reframe(viewpoint, inSize, FramedSphere(inScene, inFramesInterference));
  return CameraFrom(viewpoint);
}

double DepthOf(const ZORDefault::InterferenceScene& inScene, const PictureCamera& inCamera) {
  using namespace ZORFoundation;
  const ZOR3DBoundingSphere all = FramedSphere(inScene, false);
  return std::max(inCamera.focusDistance, Dot(all.centre - inCamera.eye, inCamera.sight)) +
         all.radius;
}

PictureCamera OverviewCamera(const ZOR3DRep& inRep, PictureSize inSize) {
  ZOR3DViewpoint viewpoint;
  Reframe(viewpoint, inSize, inRep.GetShowBoundingElement());
  return CameraFrom(viewpoint);
}

std::optional<std::array<double, 2>> Seen(const PictureCamera& inCamera, PictureSize inSize,
                                          const ZORMathVector& inPoint) {
  using namespace ZORFoundation;
  const ZORMathVector sight = inCamera.sight;
  const ZORMathVector right = Normalised(Cross(sight, inCamera.up)), up = Cross(right, sight);
  const ZORMathVector from = inPoint - inCamera.eye;
  const double depth = Dot(from, sight);
  const double halfHeight =
      inCamera.isPerspective ? depth * std::tan(inCamera.angle / 2) : inCamera.height / 2;
  if (!(halfHeight > 0)) return std::nullopt;
  const double halfWidth = halfHeight * inSize.width / inSize.height;
  const double x = 0.5 + Dot(from, right) / halfWidth / 2, y = 0.5 - Dot(from, up) / halfHeight / 2;
  if (!(x >= 0 && x <= 1 && y >= 0 && y <= 1)) return std::nullopt;
  return std::array<double, 2>{x, y};
}

std::string TextOf(const PictureCamera& inCamera) {
  std::string text = inCamera.isPerspective ? "perspective" : "orthographic";
  for (const ZORMathVector* const vector : {&inCamera.eye, &inCamera.sight, &inCamera.up})
    for (const double number : {vector->x, vector->y, vector->z}) {
      char digits[40];
      std::snprintf(digits, sizeof digits, " %.17g", number);
      text += digits;
    }
  for (const double number : {inCamera.focusDistance, inCamera.angle, inCamera.height,
                              inCamera.nearPlane, inCamera.farPlane}) {
    char digits[40];
    std::snprintf(digits, sizeof digits, " %.17g", number);
    text += digits;
  }
  return text;
}

std::optional<PictureCamera> CameraFrom(const std::string& inText) {
  std::istringstream stream(inText);
  std::string projection;
  std::array<double, 14> numbers{};
  stream >> projection;
  for (double& number : numbers) stream >> number;
  if (!stream) return std::nullopt;
  PictureCamera camera;
  camera.isPerspective = projection == "perspective";
  camera.eye = {numbers[0], numbers[1], numbers[2]};
  camera.sight = {numbers[3], numbers[4], numbers[5]};
  camera.up = {numbers[6], numbers[7], numbers[8]};
  camera.focusDistance = numbers[9];
  camera.angle = numbers[10];
  camera.height = numbers[11];
  camera.nearPlane = numbers[12];
  camera.farPlane = numbers[13];
  return camera;
}

}  // namespace ZORToolkit
