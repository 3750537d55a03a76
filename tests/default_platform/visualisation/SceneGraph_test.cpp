#include "default_platform/visualisation/SceneGraph.h"

#include <gtest/gtest.h>

#include "support/MeshScenes.h"

namespace {

using support::MakeBox;
using support::MeshScene;
using ZORDefault::CollectMeshInstances;
using ZORDefault::MeshInstance;

constexpr PartColour kGreen{0, 255, 0, 255};
constexpr PartColour kDefault{210, 210, 210, 255};
constexpr PartColour kRed{255, 0, 0, 255};
constexpr PartColour kBlue{0, 0, 255, 255};
constexpr unsigned int kImposed = ZORRep::kImposeColour | ZORRep::kOwnColour;

MeshInstance OnlyMeshOf(const MeshScene& inScene) {
  const auto meshes = CollectMeshInstances(*inScene.Bag());
  EXPECT_EQ(meshes.size(), 1u);
  return meshes.empty() ? MeshInstance() : meshes[0];
}

/// A bag with a green box, in another bag.
struct NestedScene {
  NestedScene() {
    box = inner.Add(MakeBox(1, 1, 1), ZORMathTransformation(), kGreen);
    outer.Bag()->AddChild(inner.Bag());
  }
  MeshScene inner, outer;
  PlacedMeshRep* box;
};

TEST(SceneGraph, OwnColourIsShown) {
  MeshScene scene;
  scene.Add(MakeBox(1, 1, 1), ZORMathTransformation(), kGreen);
  EXPECT_EQ(OnlyMeshOf(scene).colour, kGreen);
  EXPECT_FALSE(OnlyMeshOf(scene).isColourImposed);
}

TEST(SceneGraph, WithoutAnyColourTheDefaultGreyIsShown) {
  MeshScene scene;
  scene.Add(MakeBox(1, 1, 1), ZORMathTransformation(), kGreen)->SetInheritanceMode(0);
  EXPECT_EQ(OnlyMeshOf(scene).colour, kDefault);
}

TEST(SceneGraph, ColourOfABagWithoutModeIsNotShown) {
  NestedScene scene;
  scene.outer.Bag()->SetColorRGBA(255, 0, 0, 255);
  EXPECT_EQ(OnlyMeshOf(scene.outer).colour, kGreen);
}

TEST(SceneGraph, ColourOfABagIsShownWhereNothingBelowHasOne) {
  NestedScene scene;
  scene.inner.Bag()->SetColorRGBA(255, 0, 0, 255);
  scene.inner.Bag()->SetInheritanceMode(ZORRep::kOwnColour);
  EXPECT_EQ(OnlyMeshOf(scene.outer).colour, kGreen);
  scene.box->SetInheritanceMode(0);
  EXPECT_EQ(OnlyMeshOf(scene.outer).colour, kRed);
}

TEST(SceneGraph, ImposedColourWinsOverAllBelow) {
  NestedScene scene;
  scene.inner.Bag()->SetColorRGBA(255, 0, 0, 255);
  scene.inner.Bag()->SetInheritanceMode(kImposed);
  EXPECT_EQ(OnlyMeshOf(scene.outer).colour, kRed);
  EXPECT_TRUE(OnlyMeshOf(scene.outer).isColourImposed);
}

TEST(SceneGraph, TopmostImposedColourWins) {
  NestedScene scene;
  scene.box->SetInheritanceMode(kImposed);
  scene.inner.Bag()->SetColorRGBA(255, 0, 0, 255);
  scene.inner.Bag()->SetInheritanceMode(kImposed);
  scene.outer.Bag()->SetColorRGBA(0, 0, 255, 255);
  scene.outer.Bag()->SetInheritanceMode(4100);
  EXPECT_EQ(OnlyMeshOf(scene.outer).colour, kBlue);
}

TEST(SceneGraph, ImposingEndsWithTheBag) {
  MeshScene first, second, both;
  first.Add(MakeBox(1, 1, 1), ZORMathTransformation(), kGreen);
  second.Add(MakeBox(1, 1, 1), ZORMathTransformation(), kBlue);
  first.Bag()->SetColorRGBA(255, 0, 0, 255);
  first.Bag()->SetInheritanceMode(kImposed);
  both.Bag()->AddChild(first.Bag());
  both.Bag()->AddChild(second.Bag());
  const auto meshes = CollectMeshInstances(*both.Bag());
  ASSERT_EQ(meshes.size(), 2u);
  EXPECT_EQ(meshes[0].colour, kRed);
  EXPECT_EQ(meshes[1].colour, kBlue);
  EXPECT_FALSE(meshes[1].isColourImposed);
}

TEST(ZORRep, ColourComponentsAboveTheirRangeAreLimited) {
  MeshScene scene;
  scene.Bag()->SetColorRGBA(300, 255, 0, 70000);
  unsigned int colour[4];
  scene.Bag()->GetColorRGBA(colour);
  EXPECT_EQ(colour[0], 255u);
  EXPECT_EQ(colour[2], 0u);
  EXPECT_EQ(colour[3], 255u);
}

}  // namespace
