#include "platform/visualisation/ZOR3DBagRep.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

#include "default_platform/system/ObjectCounters.h"
#include "support/MeshScenes.h"

namespace {

using support::MakeBox;
using support::MakeSphere;
using support::MeshScene;
using support::MovedBy;

constexpr PartColour kGrey{200, 200, 200, 255};

void ExpectHolds(const ZOR3DBoundingSphere& inSphere, const ZORMathVector& inPoint) {
  const double distance = std::hypot(inPoint.x - inSphere.centre.x, inPoint.y - inSphere.centre.y,
                                     inPoint.z - inSphere.centre.z);
  EXPECT_LE(distance, inSphere.radius * (1 + 1e-12));
}

TEST(ZOR3DBagRep, EmptyBagHasTheEmptySphere) {
  ZOR3DBagRep* const bag = new ZOR3DBagRep;
  EXPECT_TRUE(bag->GetShowBoundingElement().IsEmpty());
  bag->Destroy();
}

TEST(ZOR3DBagRep, ChildrenStayInOrderAndNullIsPassedOver) {
  ZOR3DBagRep* const bag = new ZOR3DBagRep;
  ZOR3DBagRep* const first = new ZOR3DBagRep;
  ZOR3DBagRep* const second = new ZOR3DBagRep;
  bag->AddChild(first);
  bag->AddChild(nullptr);
  bag->AddChild(second);
  bag->AddChild(first);
  EXPECT_EQ(bag->GetChildren(), (std::vector<ZOR3DRep*>{first, second, first}));
  bag->RemoveChild(first);
  EXPECT_EQ(bag->GetChildren(), (std::vector<ZOR3DRep*>{second, first}));
  bag->RemoveChild(bag);
  bag->RemoveChild(nullptr);
  EXPECT_EQ(bag->GetChildren().size(), 2u);
  for (ZOR3DBagRep* const rep : {bag, first, second}) rep->Destroy();
}

TEST(ZOR3DBagRep, DestroyLeavesTheChildren) {
  const auto before = ZORDefault::CountsOf("ZOR3DBagRep");
  ZOR3DBagRep* const bag = new ZOR3DBagRep;
  ZOR3DBagRep* const child = new ZOR3DBagRep;
  bag->AddChild(child);
  bag->Destroy();
  EXPECT_EQ(ZORDefault::CountsOf("ZOR3DBagRep").built, before.built + 2);
  EXPECT_EQ(ZORDefault::CountsOf("ZOR3DBagRep").released, before.released + 1);
  EXPECT_TRUE(child->GetChildren().empty());
  child->Destroy();
}

TEST(ZOR3DBagRep, SphereOfOneSphereIsThatSphere) {
  MeshScene scene;
  scene.Add(MakeSphere(5, 16), MovedBy(1, 2, 3), kGrey);
  const ZOR3DBoundingSphere sphere = scene.Bag()->GetShowBoundingElement();
  EXPECT_NEAR(sphere.radius, 5, 1e-5);
  EXPECT_NEAR(sphere.centre.x, 1, 1e-5);
}

TEST(ZOR3DBagRep, SphereOfTwoApartTouchesBoth) {
  MeshScene scene;
  scene.Add(MakeSphere(1, 16), MovedBy(-10, 0, 0), kGrey);
  scene.Add(MakeSphere(1, 16), MovedBy(10, 0, 0), kGrey);
  const ZOR3DBoundingSphere sphere = scene.Bag()->GetShowBoundingElement();
  ExpectHolds(sphere, {-11, 0, 0});
  ExpectHolds(sphere, {11, 0, 0});
  EXPECT_LT(sphere.radius, 11.5);
}

TEST(ZOR3DBagRep, SphereHoldsAllCornersAndIsCloseToTheSmallest) {
  MeshScene scene;
  for (int i = 0; i < 5; ++i)
    scene.Add(MakeBox(20, 2, 2), support::TurnedAndMoved(0.7 * i, 3 * i, 0, i), kGrey);
  const ZOR3DBoundingSphere sphere = scene.Bag()->GetShowBoundingElement();
  for (const auto* const child : scene.Bag()->GetChildren()) {
    const auto& rep = dynamic_cast<const PlacedMeshRep&>(*child);
    for (const auto& point : rep.GetMesh()->points)
      ExpectHolds(sphere, rep.GetRootFromPart() * ZORMathVector(point[0], point[1], point[2]));
  }
  EXPECT_LT(sphere.radius, 18);
}

TEST(ZOR3DBagRep, NestedBagsAreFramedAsOne) {
  MeshScene outer, inner;
  inner.Add(MakeBox(10, 10, 10), MovedBy(0, 0, 0), kGrey);
  outer.Bag()->AddChild(inner.Bag());
  EXPECT_NEAR(outer.Bag()->GetShowBoundingElement().radius, std::sqrt(75.0), 1e-4);
  outer.Bag()->RemoveChild(inner.Bag());
}

TEST(ZOR3DBagRep, WhatIsNotFiniteIsPassedOver) {
  MeshScene scene;
  scene.Add(MakeBox(2, 2, 2), MovedBy(std::numeric_limits<double>::quiet_NaN(), 0, 0), kGrey);
  EXPECT_TRUE(scene.Bag()->GetShowBoundingElement().IsEmpty());
  scene.Add(MakeSphere(3, 16), MovedBy(0, 0, 0), kGrey);
  EXPECT_NEAR(scene.Bag()->GetShowBoundingElement().radius, 3, 1e-5);
}

}  // namespace
