#include "platform/visualisation/ZOR3DViewpoint.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

#include "default_platform/system/ObjectCounters.h"
#include "default_platform/visualisation/Rendering.h"
#include "support/MeshScenes.h"

namespace {

using ZORDefault::Camera;
using ZORDefault::CountsOf;

constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();

double Length(const ZORMathVector& inVector) {
  return std::hypot(inVector.x, inVector.y, inVector.z);
}

void ExpectNear(const ZORMathVector& inIs, const ZORMathVector& inShould) {
  EXPECT_NEAR(inIs.x, inShould.x, 1e-9);
  EXPECT_NEAR(inIs.y, inShould.y, 1e-9);
  EXPECT_NEAR(inIs.z, inShould.z, 1e-9);
}

/// The camera that a picture of 200 by 100 pixels is drawn with.
Camera DrawnCamera(const ZOR3DViewpoint& inViewpoint) {
  ZOR3DBagRep* const bag = new ZOR3DBagRep;
  const Camera camera = ZORDefault::MakePictureRequest(*bag, inViewpoint, 200, 100, nullptr).camera;
  bag->Destroy();
  return camera;
}

TEST(ZOR3DViewpoint, DefaultLooksFromACornerConically) {
  const ZOR3DViewpoint viewpoint;
  EXPECT_EQ(viewpoint.projection, ZOR3DViewpoint::kConic);
  const double component = -1 / std::sqrt(3.0);
  ExpectNear(viewpoint.sight, {component, component, component});
  EXPECT_NEAR(Length(viewpoint.up), 1, 1e-12);
  EXPECT_GT(viewpoint.up.z, 0);
}

TEST(ZOR3DViewpoint, ReframeConicWideLimitsByHeight) {
  ZOR3DViewpoint viewpoint;
  viewpoint.sight = {0, 1, 0};
  viewpoint.viewAngle = support::kPi / 3;
  viewpoint.Reframe(200, 100, 1, 1, {{10, 20, 30}, 5});
  // The sphere touches the upper and lower sides of the view: sin(30 degrees) = 5 / 10.
  EXPECT_NEAR(viewpoint.focusDistance, 10, 1e-9);
  ExpectNear(viewpoint.origin, {10, 10, 30});
}

TEST(ZOR3DViewpoint, ReframeConicTallLimitsByWidth) {
  ZOR3DViewpoint viewpoint;
  viewpoint.sight = {0, 1, 0};
  viewpoint.viewAngle = support::kPi / 2;
  viewpoint.Reframe(100, 200, 1, 1, {{0, 0, 0}, 5});
  EXPECT_NEAR(viewpoint.focusDistance, 5 / std::sin(std::atan(0.5)), 1e-9);
}

TEST(ZOR3DViewpoint, ReframeCylindricSetsTheHeight) {
  ZOR3DViewpoint viewpoint;
  viewpoint.projection = ZOR3DViewpoint::kCylindric;
  viewpoint.Reframe(200, 100, 1, 1, {{0, 0, 0}, 5});
  EXPECT_NEAR(viewpoint.viewHeight, 10, 1e-9);
  viewpoint.Reframe(100, 200, 1, 1, {{0, 0, 0}, 5});
  EXPECT_NEAR(viewpoint.viewHeight, 20, 1e-9);
}

TEST(ZOR3DViewpoint, ReframeScalesTheRoomForTheSphere) {
  ZOR3DViewpoint viewpoint;
  viewpoint.projection = ZOR3DViewpoint::kCylindric;
  viewpoint.Reframe(100, 100, 0.5F, 0.5F, {{0, 0, 0}, 5});
  EXPECT_NEAR(viewpoint.viewHeight, 20, 1e-9);
  viewpoint.Reframe(100, 100, 1, 0.25F, {{0, 0, 0}, 5});
  EXPECT_NEAR(viewpoint.viewHeight, 40, 1e-9);
}

TEST(ZOR3DViewpoint, ReframeWithoutOwnerOrRadiusFramesOneMillimetre) {
  ZOR3DViewpoint one, other;
  one.Reframe(100, 100, 1, 1, {{0, 0, 0}, 1});
  for (const double radius : {0.0, -1.0, -5.0, kNaN}) {
    other.Reframe(100, 100, 1, 1, {{0, 0, 0}, radius});
    EXPECT_EQ(other.focusDistance, one.focusDistance) << radius;
  }
  other.Reframe(100, 100, 1, 1);
  EXPECT_EQ(other.focusDistance, one.focusDistance);
}

TEST(ZOR3DViewpoint, ReframeOnWhatIsNotFiniteStaysFinite) {
  const double infinity = std::numeric_limits<double>::infinity();
  ZOR3DViewpoint viewpoint;
  viewpoint.sight = {kNaN, 0, 0};
  viewpoint.viewAngle = kNaN;
  viewpoint.Reframe(0, std::numeric_limits<float>::quiet_NaN(), -1, 0,
                    {{kNaN, infinity, 0}, infinity});
  EXPECT_TRUE(std::isfinite(viewpoint.focusDistance));
  EXPECT_TRUE(std::isfinite(Length(viewpoint.origin)));
  EXPECT_NEAR(Length(viewpoint.sight), 1, 1e-12);
}

TEST(ZOR3DViewpoint, CopyHasItsOwnReferenceCount) {
  auto* const original = new ZOR3DViewpoint;
  original->AddRef();
  original->viewHeight = 77;
  auto* const copy = new ZOR3DViewpoint(*original);
  EXPECT_EQ(copy->viewHeight, 77);
  EXPECT_EQ(copy->Release(), 0u);
  EXPECT_EQ(original->Release(), 1u);
  EXPECT_EQ(original->Release(), 0u);
}

TEST(ZOR3DViewpoint, AssignmentKeepsTheReferenceCount) {
  auto* const target = new ZOR3DViewpoint;
  ZOR3DViewpoint source;
  source.AddRef();
  source.nearPlane = 3;
  *target = source;
  EXPECT_EQ(target->nearPlane, 3);
  EXPECT_EQ(target->Release(), 0u);
}

TEST(ZOR3DViewpoint, IsCounted) {
  const auto before = CountsOf("ZOR3DViewpoint");
  (new ZOR3DViewpoint)->Release();
  const auto after = CountsOf("ZOR3DViewpoint");
  EXPECT_EQ(after.built, before.built + 1);
  EXPECT_EQ(after.released, before.released + 1);
}

TEST(MakeCamera, AxesAreAtRightAngles) {
  ZOR3DViewpoint viewpoint;
  viewpoint.sight = {0, 2, 0};
  viewpoint.up = {0, 1, 1};
  const Camera camera = DrawnCamera(viewpoint);
  ExpectNear(camera.forward, {0, 1, 0});
  ExpectNear(camera.right, {1, 0, 0});
  ExpectNear(camera.down, {0, 0, -1});
}

TEST(MakeCamera, UpAlongTheSightIsReplaced) {
  ZOR3DViewpoint viewpoint;
  viewpoint.sight = {0, 0, -1};
  viewpoint.up = {0, 0, 1};
  const Camera camera = DrawnCamera(viewpoint);
  ExpectNear(camera.right, {1, 0, 0});
  ExpectNear(camera.down, {0, -1, 0});
}

TEST(MakeCamera, MissingDirectionsAreReplaced) {
  ZOR3DViewpoint viewpoint;
  viewpoint.sight = {0, 0, 0};
  viewpoint.up = {kNaN, 0, 0};
  viewpoint.origin = {kNaN, 0, 0};
  viewpoint.viewAngle = -1;
  const Camera camera = DrawnCamera(viewpoint);
  EXPECT_NEAR(Length(camera.forward), 1, 1e-12);
  EXPECT_NEAR(Length(camera.right), 1, 1e-12);
  ExpectNear(camera.eye, {0, 0, 0});
  EXPECT_GT(camera.pixelSize, 0);
}

TEST(MakeCamera, HugeAndTinyDirectionsKeepTheirDirection) {
  ZOR3DViewpoint viewpoint;
  viewpoint.sight = {0, 1e300, 0};
  viewpoint.up = {0, 0, 1e-300};
  const Camera camera = DrawnCamera(viewpoint);
  ExpectNear(camera.forward, {0, 1, 0});
  ExpectNear(camera.down, {0, 0, -1});
}

}  // namespace
