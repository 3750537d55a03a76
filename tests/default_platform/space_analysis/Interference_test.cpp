#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cmath>
#include <memory>
#include <vector>

#include "default_platform/space_analysis/Assembly.h"
#include "default_platform/system/ObjectCounters.h"
#include "default_platform/visualisation/Rendering.h"
#include "default_platform/visualisation/SceneGraph.h"
#include "platform/space_analysis/ZORISiSubInterference.h"
#include "platform/visualisation/ZOR3DBagRep.h"
#include "support/KnownInterfaces.h"
#include "support/ScopedVariable.h"

namespace {

using assembly::NutAndRod;
using assembly::RepOf;
using ZORDefault::InterferenceScene;

using assembly::At;
using assembly::kTouch;

const std::vector<ZORMathVector> kTwoPoints = {kTouch, {178, 75, 55}};

/// Looks along y.
ZORDefault::InterferenceGeometry WithViewpoint(ZOR3DViewpoint::Projection inProjection) {
  ZORDefault::InterferenceGeometry geometry = At({{1, 2, 3}});
  geometry.viewpoint = {inProjection, {10.5, 20, 30}, {0, 2, 0}, 200, 30, 2000};
  return geometry;
}

struct Destroyer {
  void operator()(ZORRep* inRep) const { inRep->Destroy(); }
};
typedef std::unique_ptr<ZOR3DRep, Destroyer> OwnRep;

std::size_t TrianglesOf(const InterferenceScene& inScene) {
  const OwnRep rep(RepOf(inScene.interference));
  return rep ? ZORDefault::CollectMeshInstances(*rep).front().mesh->triangles.size() : 0;
}

TEST(Interference, ElementsAreThePointsThatDiffer) {
  EXPECT_EQ(1, NutAndRod(At({kTouch, kTouch})).interference->GetElementCount());
  EXPECT_EQ(2, NutAndRod(At(kTwoPoints)).interference->GetElementCount());
  EXPECT_EQ(0, NutAndRod(At({})).interference->GetElementCount());
}

TEST(Interference, GeometryHoldsTheCoordinates) {
  const auto scene = NutAndRod(At({{1.5, 2, -30}}));
  const std::unique_ptr<double[]> geometry(scene.interference->GetGeometricResult());
  ASSERT_TRUE(geometry);
  EXPECT_EQ(1.5, geometry[0]);
  EXPECT_EQ(2, geometry[1]);
  EXPECT_EQ(-30, geometry[2]);
}

TEST(Interference, WithoutPointsThereIsNothingToShow) {
  const auto scene = NutAndRod(At({}));
  EXPECT_EQ(nullptr, scene.interference->GetGeometricResult());
  EXPECT_EQ(nullptr, RepOf(scene.interference));
  ZOR3DViewpoint viewpoint;
  EXPECT_NE(1, scene.interference->FillViewpoint(&viewpoint));
}

TEST(Interference, FlagsSayWhichElementsAreShown) {
  const auto scene = NutAndRod(At(kTwoPoints));
  const std::unique_ptr<int[]> flags(scene.interference->GetFlags());
  EXPECT_EQ(1, flags[0]);
  EXPECT_EQ(1, flags[2]);
  const std::size_t both = TrianglesOf(scene);
  flags[1] = 0;
  scene.interference->SetFlags(flags.get());
  EXPECT_EQ(both, 2 * TrianglesOf(scene));
  flags[2] = 0;  // that of the interference as a whole
  scene.interference->SetFlags(flags.get());
  EXPECT_EQ(0u, TrianglesOf(scene));
  scene.interference->SetFlags(nullptr);
  EXPECT_EQ(0u, TrianglesOf(scene));
}

TEST(Interference, PointsThatNearlyCoincideAreOneBall) {
  const std::vector<ZORMathVector> near = {kTouch, {178.0001, 75, 65}};
  EXPECT_EQ(2, NutAndRod(At(near)).interference->GetElementCount());
  EXPECT_EQ(TrianglesOf(NutAndRod()), TrianglesOf(NutAndRod(At(near))));
}

TEST(Interference, VeryManyPointsAreShownByASample) {
  std::vector<ZORMathVector> points;
  constexpr int kCount = 20000;
  for (int i = 0; i < kCount; ++i)
    points.push_back({1.0 * (i % 25), 1.0 * (i / 25 % 25), 1.0 * (i / 625)});
  const auto scene = NutAndRod(At(points));
  EXPECT_EQ(kCount, scene.interference->GetElementCount());
  const OwnRep rep(RepOf(scene.interference));
  const auto mesh = ZORDefault::CollectMeshInstances(*rep).front().mesh;
  EXPECT_GT(mesh->triangles.size(), 64u * 100);
  EXPECT_LE(mesh->triangles.size(), 64u * 1000);
  // They reach about as far as the points: the last one is 46 from the first.
  EXPECT_GT(mesh->sphere.radius, 40);
}

TEST(Interference, RepresentationIsANewOneEachTime) {
  const auto scene = NutAndRod();
  const ZORDefault::ObjectCounts before = ZORDefault::CountsOf("InterferenceRep");
  { const OwnRep first(RepOf(scene.interference)), second(RepOf(scene.interference)); }
  const ZORDefault::ObjectCounts after = ZORDefault::CountsOf("InterferenceRep");
  EXPECT_EQ(after.built - before.built, after.released - before.released);
  EXPECT_GE(after.built - before.built, 2);
}

TEST(Interference, DimensionLineJoinsTwoPointsAlone) {
  const auto trianglesOf = [](const std::vector<ZORMathVector>& inPoints) {
    ZORDefault::InterferenceGeometry geometry = At(inPoints);
    geometry.markers = ZORDefault::MarkerKind::kDimension;
    return TrianglesOf(NutAndRod(geometry));
  };
  EXPECT_NE(TrianglesOf(NutAndRod(At(kTwoPoints))), trianglesOf(kTwoPoints));
  EXPECT_EQ(TrianglesOf(NutAndRod()), trianglesOf({kTouch}));
}

TEST(Interference, MarkersAreAnOverlay) {
  const auto scene = NutAndRod();
  const OwnRep rep(RepOf(scene.interference));
  EXPECT_TRUE(ZORDefault::CollectMeshInstances(*rep).front().isOverlay);
}

TEST(Interference, StoredViewpointIsFilledIn) {
  const auto scene = NutAndRod(WithViewpoint(ZOR3DViewpoint::kCylindric));
  ZOR3DViewpoint viewpoint;
  ASSERT_EQ(1, scene.interference->FillViewpoint(&viewpoint));
  EXPECT_EQ(ZOR3DViewpoint::kCylindric, viewpoint.projection);
  EXPECT_EQ(10.5, viewpoint.origin.x);
  EXPECT_EQ(1, viewpoint.sight.y);
  EXPECT_EQ(1, viewpoint.up.z);
  EXPECT_EQ(200, viewpoint.focusDistance);
  EXPECT_EQ(30, viewpoint.nearPlane);
  EXPECT_EQ(2000, viewpoint.farPlane);
  EXPECT_NEAR(2 * 200 * std::tan(viewpoint.viewAngle / 2), viewpoint.viewHeight, 1e-9);
}

TEST(Interference, SightStraightDownHasAnotherUp) {
  auto geometry = WithViewpoint(ZOR3DViewpoint::kConic);
  geometry.viewpoint->sight = {0, 0, -1};
  ZOR3DViewpoint viewpoint;
  ASSERT_EQ(1, NutAndRod(geometry).interference->FillViewpoint(&viewpoint));
  EXPECT_EQ(1, viewpoint.up.y);
}

TEST(Interference, NearPlaneRightBeforeTheEyeOfAPerspectiveViewIsLeftOut) {
  auto geometry = WithViewpoint(ZOR3DViewpoint::kConic);
  ZOR3DViewpoint viewpoint;
  ASSERT_EQ(1, NutAndRod(geometry).interference->FillViewpoint(&viewpoint));
  EXPECT_EQ(30, viewpoint.nearPlane);
  geometry.viewpoint->nearPlane = 1;
  ASSERT_EQ(1, NutAndRod(geometry).interference->FillViewpoint(&viewpoint));
  EXPECT_EQ(0, viewpoint.nearPlane);
}

TEST(Interference, SubInterferencesAreClosePicturesOfThePoints) {
  const auto scene = NutAndRod(At(kTwoPoints));
  ZORListValZORISpecObject_var list;
  scene.interference->GetSubInterferences(list);
  ASSERT_EQ(2, list.Size());
  EXPECT_EQ(2, scene.interference->GetSubInterferenceCount());
  ZOR3DViewpoint first, second;
  EXPECT_NE(0, ZORISiSubInterference_var(list[1])->FillViewpoint(&first));
  EXPECT_NE(0, ZORISiSubInterference_var(list[2])->FillViewpoint(&second));
  EXPECT_NEAR(10, first.origin.z - second.origin.z, 1e-9);
  EXPECT_NEAR(0, first.origin.x - second.origin.x, 1e-9);
}

TEST(Interference, InterfacesAreFoundByIdentifierAndName) {
  const auto scene = NutAndRod(At(kTwoPoints));
  EXPECT_THAT(support::InterfacesOf(*scene.interference.GetInterface()),
              testing::ElementsAre("ZORBaseUnknown", "ZORI3DGeoVisu", "ZORISiInterference",
                                   "ZORISpecObject"));
  ZORListValZORISpecObject_var list;
  scene.interference->GetSubInterferences(list);
  EXPECT_THAT(support::InterfacesOf(*list[1].GetInterface()),
              testing::ElementsAre("ZORBaseUnknown", "ZORISiSubInterference", "ZORISpecObject"));
  EXPECT_THAT(support::InterfacesOf(*scene.products[0].GetInterface()),
              testing::IsSupersetOf({"ZORI3DGeoVisu", "ZORIAlias", "ZORIProduct"}));
}

TEST(Interference, SubInterferenceKnowsAndKeepsItsFather) {
  const ZORDefault::ObjectCounts before = ZORDefault::CountsOf("Interference");
  ZORListValZORISpecObject_var list;
  NutAndRod().interference->GetSubInterferences(list);
  EXPECT_EQ(before.released, ZORDefault::CountsOf("Interference").released);
  ZORISpecObject* const father = list[1]->GetFather();
  ASSERT_NE(nullptr, father);
  EXPECT_FALSE(ZORISiInterference_var(ZORISpecObject_var(father)).IsNull());
  father->Release();
  list.RemoveAll();
  EXPECT_EQ(before.released + 1, ZORDefault::CountsOf("Interference").released);
}

TEST(Interference, WithoutProductsItIsFramedFromTheDefaultDirection) {
  const auto scene = ZORDefault::MakeInterferenceScene(At({kTouch}), {});
  ZOR3DViewpoint usual, viewpoint;
  EXPECT_NE(1, scene.interference->FillViewpoint(&viewpoint));
  EXPECT_NEAR(usual.sight.x, viewpoint.sight.x, 1e-12);
  const OwnRep rep(RepOf(scene.interference));
  EXPECT_NEAR(178, rep->GetShowBoundingElement().centre.x, 1e-9);
  EXPECT_GT(rep->GetShowBoundingElement().radius, 0);
}

}  // namespace
