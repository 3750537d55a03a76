#include "platform/visualisation/ZORPrint3DRepImage.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <limits>
#include <thread>

#include "default_platform/system/ObjectCounters.h"
#include "default_platform/visualisation/Pictures.h"
#include "support/MeshScenes.h"
#include "support/ScopedVariable.h"

namespace {

using pictures::Draw;
using pictures::FromFront;
using pictures::Picture;
using support::MakeBox;
using support::MakeSphere;
using support::MakeTube;
using support::MeshScene;
using support::MovedBy;
using ZORDefault::CountsOf;

typedef std::array<int, 3> Colour;

constexpr PartColour kRed{200, 30, 30, 255};
constexpr PartColour kBlue{30, 60, 200, 255};
constexpr Colour kWhite{255, 255, 255};

bool IsRed(const Colour& inColour) {
  return inColour[0] > 100 && inColour[1] < 90 && inColour[2] < 90;
}
bool IsDark(const Colour& inColour) {
  return std::max({inColour[0], inColour[1], inColour[2]}) < 110;
}

int CountPixels(const Picture& inPicture, const std::function<bool(const Colour&)>& inIsWanted) {
  int count = 0;
  for (int y = 0; y < inPicture.height; ++y)
    for (int x = 0; x < inPicture.width; ++x) count += inIsWanted(inPicture.At(x, y)) ? 1 : 0;
  return count;
}

/// Something of everything: edges, curved surfaces, two that meet.
struct MixedScene : MeshScene {
  MixedScene() : MixedScene(0, 0, 0) {}
  MixedScene(double inX, double inY, double inZ) {
    Add(MakeBox(40, 30, 20), MovedBy(inX, inY, inZ), kRed);
    Add(MakeSphere(14, 24), MovedBy(inX + 15, inY - 10, inZ + 12), kBlue);
    Add(MakeTube(6, 60, 40), support::TurnedAndMoved(0.3, inX - 10, inY, inZ), {90, 200, 90, 255});
  }
};

TEST(ZORPrint3DRepImage, RasterizeFramesTheWholeScene) {
  MixedScene scene;
  const Picture picture = Draw(scene.Bag(), 120, 90, &pictures::White);
  ASSERT_FALSE(picture.pixels.empty());
  EXPECT_TRUE(IsRed(picture.At(60, 50)));
  for (int x = 0; x < 120; ++x) {
    EXPECT_EQ(picture.At(x, 0), kWhite);
    EXPECT_EQ(picture.At(x, 89), kWhite);
  }
}

TEST(ZORPrint3DRepImage, RasterizeWithoutBackgroundColourShowsAVerticalGradient) {
  ZOR3DBagRep* const bag = new ZOR3DBagRep;
  const Picture picture = Draw(bag, 40, 60);
  for (int y = 1; y < 60; ++y) {
    EXPECT_GE(picture.At(0, y)[0], picture.At(0, y - 1)[0]);
    EXPECT_EQ(picture.At(39, y), picture.At(0, y));
  }
  EXPECT_GT(picture.At(0, 59)[0], picture.At(0, 0)[0] + 40);
  bag->Destroy();
}

TEST(ZORPrint3DRepImage, RasterizeOfNothingShowsTheBackgroundAsGiven) {
  ZOR3DBagRep* const bag = new ZOR3DBagRep;
  const Picture picture = Draw(bag, 3, 2, [](ZORPrint3DRepImage& ioImage) {
    ioImage.GetSupport()->SetBackgroundColor(1, 0.4F, -3);
  });
  EXPECT_EQ(picture.At(2, 1), (Colour{255, 102, 0}));
  bag->Destroy();
}

TEST(ZORPrint3DRepImage, RasterizeOfAnImpossibleSizeGivesNull) {
  MixedScene scene;
  for (const auto& [width, height] : {std::pair(0, 10), {10, 0}, {-1, 10}, {16385, 1}})
    EXPECT_TRUE(Draw(scene.Bag(), width, height).pixels.empty()) << width << " x " << height;
  EXPECT_FALSE(Draw(scene.Bag(), 1, 1).pixels.empty());
  EXPECT_FALSE(Draw(scene.Bag(), 16384, 1).pixels.empty());
}

TEST(ZORPrint3DRepImage, RasterizeWithoutRepresentationGivesNull) {
  EXPECT_TRUE(Draw(nullptr, 10, 10).pixels.empty());
}

TEST(ZORPrint3DRepImage, RasterizeAgainGivesTheSameBytes) {
  MixedScene scene;
  const Picture first = Draw(scene.Bag(), 200, 150);
  EXPECT_EQ(Draw(scene.Bag(), 200, 150).pixels, first.pixels);
  MixedScene other;  // with structures of its own
  EXPECT_EQ(Draw(other.Bag(), 200, 150).pixels, first.pixels);
}

TEST(ZORPrint3DRepImage, RasterizeWithSeveralThreadsGivesTheSameBytes) {
  MixedScene scene;
  const Picture one = Draw(scene.Bag(), 200, 150);
  for (const char* const count : {"2", "3", "64", "0", "many"}) {
    const support::ScopedVariable variable("ZOR_PICTURE_THREADS", count);
    EXPECT_EQ(Draw(scene.Bag(), 200, 150).pixels, one.pixels) << count;
  }
}

TEST(ZORPrint3DRepImage, RasterizeOfOneSceneInSeveralThreadsAtOnceGivesTheSameBytes) {
  MixedScene scene;
  std::vector<Picture> drawn(4);
  std::vector<std::thread> threads;
  for (Picture& picture : drawn)
    threads.emplace_back([&] { picture = Draw(scene.Bag(), 120, 90); });
  for (std::thread& thread : threads) thread.join();
  for (const Picture& picture : drawn) EXPECT_EQ(picture.pixels, drawn[0].pixels);
  EXPECT_FALSE(drawn[0].pixels.empty());
}

TEST(ZORPrint3DRepImage, RasterizeFarFromTheOriginShowsTheSamePicture) {
  MixedScene here;
  MixedScene there(1e7, -1e7, 1e7);  // ten kilometres off in each direction
  const Picture near = Draw(here.Bag(), 200, 150, &pictures::White);
  const Picture far = Draw(there.Bag(), 200, 150, &pictures::White);
  int differing = 0;
  for (std::size_t i = 0; i < near.pixels.size(); ++i)
    differing += std::abs(near.pixels[i] - far.pixels[i]) > 8 ? 1 : 0;
  EXPECT_LT(differing, 30);
}

TEST(ZORPrint3DRepImage, RasterizeShowsNoCracksBetweenTriangles) {
  MeshScene scene;
  scene.Add(MakeSphere(45, 200), MovedBy(1e7, 0, 0), kRed);
  const Picture picture = Draw(scene.Bag(), 100, 100, FromFront(1, {1e7, 0, 0}));
  for (int y = 0; y < 100; ++y)
    for (int x = 0; x < 100; ++x)
      if (std::hypot(x - 49.5, y - 49.5) < 42) {
        EXPECT_TRUE(IsRed(picture.At(x, y))) << x << ' ' << y;
      }
}

TEST(ZORPrint3DRepImage, EdgesAreDarkUnbrokenAndOfEvenWidth) {
  MeshScene scene;
  scene.Add(MakeBox(60.3F, 10, 60.3F), MovedBy(0.2, 0, 0.1), kRed);
  const Picture picture = Draw(scene.Bag(), 100, 100, FromFront(1));
  const auto ink = [&](int inX, int inY) { return 255 - picture.At(inX, inY)[0]; };
  // Across the upper edge, in each column between the corners: the same ink.
  std::vector<int> inks;
  for (int x = 25; x < 75; ++x) {
    int darkest = 0;
    for (int y = 15; y < 25; ++y) darkest = std::max(darkest, ink(x, y));
    inks.push_back(darkest);
  }
  const auto [least, most] = std::ranges::minmax(inks);
  EXPECT_GT(least, 130);
  EXPECT_LE(most - least, 2);
}

TEST(ZORPrint3DRepImage, EdgesBehindSurfacesAreHidden) {
  MeshScene scene;
  scene.Add(MakeBox(60, 10, 60), MovedBy(0, 0, 0), kRed);
  scene.Add(MakeBox(20, 10, 20), MovedBy(0, 30, 0), kBlue);
  const Picture picture = Draw(scene.Bag(), 100, 100, FromFront(1));
  const Colour middle = picture.At(50, 50);
  for (int y = 25; y < 75; ++y)
    for (int x = 25; x < 75; ++x)
      for (std::size_t i = 0; i < 3; ++i) EXPECT_NEAR(picture.At(x, y)[i], middle[i], 3);
}

TEST(ZORPrint3DRepImage, ViewModeTwoShowsHiddenEdgesFaintly) {
  MeshScene scene;
  scene.Add(MakeBox(60, 10, 60), MovedBy(0, 0, 0), kRed);
  scene.Add(MakeBox(20, 10, 20), MovedBy(0, 30, 0), kBlue);
  const Picture picture = Draw(scene.Bag(), 100, 100, [](ZORPrint3DRepImage& ioImage) {
    FromFront(1)(ioImage);
    ioImage.GetSupport()->SetViewMode(2, 1);
  });
  const int inEdge = std::min(picture.At(39, 50)[0], picture.At(40, 50)[0]);
  EXPECT_LT(inEdge, picture.At(50, 50)[0] - 8);
  EXPECT_GT(inEdge, 80);
}

TEST(ZORPrint3DRepImage, ViewModeOneOffDrawsEdgesAlone) {
  MeshScene scene;
  scene.Add(MakeBox(60, 10, 60), MovedBy(0, 0, 0), kRed);
  const Picture picture = Draw(scene.Bag(), 100, 100, [](ZORPrint3DRepImage& ioImage) {
    FromFront(1)(ioImage);
    ioImage.GetSupport()->SetViewMode(1, 0);
  });
  EXPECT_EQ(picture.At(50, 50), kWhite);
  EXPECT_TRUE(IsDark(picture.At(20, 50)) || IsDark(picture.At(19, 50)));
}

TEST(ZORPrint3DRepImage, CurvedSurfacesHaveAnOutline) {
  MeshScene scene;
  scene.Add(MakeSphere(30, 100), MovedBy(0, 0, 0), {250, 250, 250, 255});
  const Picture picture = Draw(scene.Bag(), 100, 100, FromFront(1));
  EXPECT_LT(std::min(picture.At(20, 50)[0], picture.At(21, 50)[0]), 170);
}

TEST(ZORPrint3DRepImage, ImposedColourTakesThePlaceOfTriangleColours) {
  MeshScene scene;
  auto box = MakeBox(60, 60, 60);
  box->colours = {kBlue};
  box->triangleColours.assign(box->triangles.size(), 0);
  scene.Add(box, MovedBy(0, 0, 0), kRed);
  EXPECT_FALSE(IsRed(Draw(scene.Bag(), 100, 100, FromFront(1)).At(50, 50)));
  scene.Bag()->SetColorRGBA(200, 30, 30, 255);
  scene.Bag()->SetInheritanceMode(4100);
  EXPECT_TRUE(IsRed(Draw(scene.Bag(), 100, 100, FromFront(1)).At(50, 50)));
}

TEST(ZORPrint3DRepImage, TrianglesWithoutOwnColourShowTheProducts) {
  MeshScene scene;
  auto box = MakeBox(60, 60, 60);
  box->colours = {kBlue};
  box->triangleColours.assign(box->triangles.size(), PartMesh::kNoColour);
  scene.Add(box, MovedBy(0, 0, 0), kRed);
  EXPECT_TRUE(IsRed(Draw(scene.Bag(), 100, 100, FromFront(1)).At(50, 50)));
}

TEST(ZORPrint3DRepImage, TransparentSurfacesShowWhatLiesBehind) {
  MeshScene scene;
  scene.Add(MakeBox(60, 1, 60), MovedBy(0, -20, 0), {255, 255, 255, 40});
  scene.Add(MakeBox(30, 10, 30), MovedBy(0, 20, 0), kRed);
  const Picture picture = Draw(scene.Bag(), 100, 100, FromFront(1));
  const Colour through = picture.At(50, 50);
  EXPECT_GT(through[0], through[1] + 40);
  EXPECT_GT(through[1], 60);
}

TEST(ZORPrint3DRepImage, FlushFacesShowTheFirstProductEverywhere) {
  for (const bool isPerspective : {true, false}) {
    MeshScene scene;
    scene.Add(MakeBox(50, 30, 50), support::TurnedAndMoved(0.5, 3.3, 0, 0), kRed);
    scene.Add(MakeBox(60, 30, 60), support::TurnedAndMoved(0.5, 3.3, 0, 0), kBlue);
    const Picture picture = Draw(scene.Bag(), 100, 100, [&](ZORPrint3DRepImage& ioImage) {
      FromFront(1)(ioImage);
      if (isPerspective) ioImage.GetViewpoint()->projection = ZOR3DViewpoint::kConic;
      ioImage.GetViewpoint()->sight = {-0.1, 1, 0.02};
      ioImage.GetViewpoint()->Reframe(100, 100, 1.5F, 1.5F);
    });
    for (int y = 35; y < 65; ++y)
      for (int x = 40; x < 60; ++x) EXPECT_TRUE(IsRed(picture.At(x, y))) << x << ' ' << y;
  }
}

TEST(ZORPrint3DRepImage, WhatIsDrawnOverIsSeenBehindSurfaces) {
  for (const bool isPerspective : {true, false}) {
    MeshScene scene;
    scene.Add(MakeBox(60, 10, 60), MovedBy(0, 0, 0), kBlue);
    PlacedMeshRep* const marker = scene.Add(MakeSphere(8, 24), MovedBy(0, 40, 0), kRed);
    scene.Add(MakeBox(60, 10, 60), MovedBy(0, -80, 0), kBlue);
    const auto draw = [&] {
      return Draw(scene.Bag(), 100, 100, [&](ZORPrint3DRepImage& ioImage) {
        FromFront(1)(ioImage);
        if (isPerspective) ioImage.GetViewpoint()->projection = ZOR3DViewpoint::kConic;
        ioImage.GetViewpoint()->Reframe(100, 100, 1, 1);
      });
    };
    const Picture hidden = draw();
    EXPECT_FALSE(IsRed(hidden.At(50, 50)));
    marker->SetOverlay(true);
    const Picture over = draw();
    EXPECT_TRUE(IsRed(over.At(50, 50)));
    EXPECT_EQ(over.At(30, 50), hidden.At(30, 50));
  }
}

TEST(ZORPrint3DRepImage, BackFacesAreShadedLikeFrontFaces) {
  MeshScene scene;
  auto inside = MakeBox(60, 60, 60);
  for (auto& triangle : inside->triangles) std::swap(triangle[0], triangle[1]);
  for (auto& normal : inside->normals)
    for (float& component : normal) component = -component;
  scene.Add(inside, MovedBy(0, 0, 0), kRed);
  MeshScene usual;
  usual.Add(MakeBox(60, 60, 60), MovedBy(0, 0, 0), kRed);
  EXPECT_EQ(Draw(scene.Bag(), 100, 100, FromFront(1)).At(50, 50),
            Draw(usual.Bag(), 100, 100, FromFront(1)).At(50, 50));
}

TEST(ZORPrint3DRepImage, PartsSmallerThanAPixelLeaveATrace) {
  for (const double place : {0.0, 0.21, 0.5, 0.77}) {
    MeshScene scene;
    scene.Add(MakeSphere(0.05, 8), MovedBy(place, 0, place), kRed);
    const Picture picture = Draw(scene.Bag(), 100, 100, FromFront(1));
    EXPECT_GT(CountPixels(picture, [](const Colour& c) { return c[1] < 220; }), 0) << place;
  }
}

TEST(ZORPrint3DRepImage, ThinPartsAreNotBroken) {
  MeshScene scene;
  scene.Add(MakeBox(80, 0.01F, 0.01F), support::TurnedAndMoved(0, 0, 0, 0.3), kRed);
  const Picture picture = Draw(scene.Bag(), 100, 100, FromFront(1));
  for (int x = 12; x < 88; ++x) {
    int darkest = 255;
    for (int y = 45; y < 55; ++y) darkest = std::min(darkest, picture.At(x, y)[1]);
    EXPECT_LT(darkest, 160) << x;
  }
}

TEST(ZORPrint3DRepImage, WhatCannotBePlacedIsLeftOut) {
  MeshScene scene;
  scene.Add(MakeBox(60, 60, 60), MovedBy(0, 0, 0), kRed);
  const Picture alone = Draw(scene.Bag(), 100, 100, FromFront(1));
  scene.Add(MakeBox(60, 60, 60), MovedBy(std::numeric_limits<double>::quiet_NaN(), 0, 0), kBlue);
  scene.Add(MakeBox(60, 60, 60), MovedBy(std::numeric_limits<double>::infinity(), 0, 0), kBlue);
  scene.Add(MakeBox(60, 60, 60), MovedBy(0, 0, 1e300), kBlue);
  EXPECT_EQ(Draw(scene.Bag(), 100, 100, FromFront(1)).pixels, alone.pixels);
}

TEST(ZORPrint3DRepImage, BrokenMeshesAreDrawnAsFarAsTheyGo) {
  MeshScene scene;
  auto mesh = MakeBox(60, 60, 60);
  mesh->triangles.push_back({0, 1, 4000000000U});
  mesh->triangles.push_back({7777, 1, 2});
  mesh->lineStarts.push_back(1000);
  mesh->normals.clear();
  mesh->triangleColours = {0};
  scene.Add(mesh, MovedBy(0, 0, 0), kRed);
  scene.Add(std::make_shared<PartMesh>(), MovedBy(0, 0, 0), kRed);
  EXPECT_TRUE(IsRed(Draw(scene.Bag(), 100, 100, FromFront(1)).At(50, 50)));
}

TEST(ZORPrint3DRepImage, ViewpointInsideTheScenePaintsWhatIsInFront) {
  MeshScene scene;
  scene.Add(MakeBox(60, 60, 60), MovedBy(0, 0, 0), kRed);
  const Picture picture = Draw(scene.Bag(), 50, 50, [](ZORPrint3DRepImage& ioImage) {
    pictures::White(ioImage);
    ioImage.GetViewpoint()->origin = {1, 2, 3};
  });
  EXPECT_EQ(CountPixels(picture, [](const Colour& c) { return c == kWhite; }), 0);
}

TEST(ZORPrint3DRepImage, PlanesCutWhatIsNearerOrFarther) {
  MeshScene scene;
  scene.Add(MakeBox(60, 10, 60), MovedBy(0, 0, 0), kRed);
  const auto drawBetween = [&](double inNear, double inFar) {
    return Draw(scene.Bag(), 100, 100,
                [&](ZORPrint3DRepImage& ioImage) {
                  FromFront(1)(ioImage);
                  ioImage.GetViewpoint()->nearPlane = inNear;
                  ioImage.GetViewpoint()->farPlane = inFar;
                })
        .At(50, 50);
  };
  EXPECT_TRUE(IsRed(drawBetween(900, 1100)));
  EXPECT_TRUE(IsRed(drawBetween(1000, 0)));  // the far side of the box
  EXPECT_EQ(drawBetween(1006, 0), kWhite);
  EXPECT_EQ(drawBetween(0, 990), kWhite);
}

TEST(ZORPrint3DRepImage, ReframeWithoutSphereFramesTheWholeScene) {
  MixedScene scene;
  const Picture usual = Draw(scene.Bag(), 100, 80);
  const Picture moved = Draw(scene.Bag(), 100, 80, [](ZORPrint3DRepImage& ioImage) {
    ioImage.GetViewpoint()->origin = {5000, 0, 0};
    ioImage.GetViewpoint()->Reframe(100, 80, 1, 1);
  });
  EXPECT_EQ(moved.pixels, usual.pixels);
}

TEST(ZORPrint3DRepImage, AssignedViewpointIsDrawnUnchanged) {
  MixedScene scene;
  ZOR3DViewpoint far;
  far.Reframe(100, 80, 1, 1, {{0, 0, 0}, 1000});
  const Picture picture = Draw(scene.Bag(), 100, 80, [&](ZORPrint3DRepImage& ioImage) {
    pictures::White(ioImage);
    *ioImage.GetViewpoint() = far;
  });
  EXPECT_GT(CountPixels(picture, [](const Colour& c) { return c == kWhite; }), 7900);
  EXPECT_LT(CountPixels(picture, [](const Colour& c) { return c == kWhite; }), 8000);
}

TEST(ZORPrint3DRepImage, AllThatIsBuiltIsReleased) {
  const auto open = [](const char* inClass) {
    return CountsOf(inClass).built - CountsOf(inClass).released;
  };
  const char* const classes[] = {"ZORPrint3DRepImage", "ZORPixelImage", "ZOR3DViewpoint",
                                 "ZOR3DBagRep", "MeshBvh"};
  std::vector<long> before;
  for (const char* const name : classes) before.push_back(open(name));
  {
    MixedScene scene;
    const long structures = CountsOf("MeshBvh").built;
    Draw(scene.Bag(), 40, 30);
    Draw(scene.Bag(), 40, 30);
    EXPECT_EQ(CountsOf("MeshBvh").built, structures + 3);  // once for each mesh
    EXPECT_EQ(open("MeshBvh"), before[4] + 3);
  }
  for (std::size_t i = 0; i < before.size(); ++i) EXPECT_EQ(open(classes[i]), before[i]);
}

TEST(ZORPrint3DRepImage, StructureIsSharedByAllThatShowTheMesh) {
  MeshScene scene;
  const auto box = MakeBox(10, 10, 10);
  for (int i = 0; i < 20; ++i) scene.Add(box, MovedBy(20 * i, 0, 0), kRed);
  const long before = CountsOf("MeshBvh").built;
  Draw(scene.Bag(), 40, 30);
  EXPECT_EQ(CountsOf("MeshBvh").built, before + 1);
}

TEST(ZORPrint3DRepImage, ImageThatIsNotReleasedIsCountedAsSuch) {
  const auto before = CountsOf("ZORPrint3DRepImage");
  auto* const image = new ZORPrint3DRepImage(nullptr, 1, 1);
  EXPECT_EQ(CountsOf("ZORPrint3DRepImage").built, before.built + 1);
  EXPECT_EQ(CountsOf("ZORPrint3DRepImage").released, before.released);
  image->Release();
  EXPECT_EQ(CountsOf("ZORPrint3DRepImage").released, before.released + 1);
}

TEST(PartMesh, CopyOfADrawnMeshIsDrawnAnew) {
  MeshScene scene, copies;
  const auto box = MakeBox(60, 60, 60);
  scene.Add(box, MovedBy(0, 0, 0), kRed);
  Draw(scene.Bag(), 100, 100, FromFront(1));
  auto copy = std::make_shared<PartMesh>(*box);
  for (auto& point : copy->points) point[0] += 30;
  copies.Add(copy, MovedBy(0, 0, 0), kRed);
  const Picture picture = Draw(copies.Bag(), 100, 100, FromFront(1));
  EXPECT_TRUE(IsRed(picture.At(90, 55)));
  EXPECT_FALSE(IsRed(picture.At(35, 55)));
}

TEST(ZORSupport, ModesAreKeptAndUnknownOnesPassedOver) {
  ZORSupport support;
  EXPECT_EQ(support.GetViewMode(1), 1);
  EXPECT_EQ(support.GetViewMode(2), 0);
  support.SetViewMode(2, 5);
  support.SetViewMode(99, 1);
  EXPECT_EQ(support.GetViewMode(2), 5);
  EXPECT_EQ(support.GetViewMode(99), 0);
  EXPECT_FALSE(support.HasBackgroundColor());
}

// Run in a process whose platform library has no drawing library beside it.
TEST(WithoutDrawingLibrary, DISABLED_RasterizeGivesNull) {
  MixedScene scene;
  EXPECT_TRUE(Draw(scene.Bag(), 20, 20).pixels.empty());
}

TEST(WithoutDrawingLibrary, DISABLED_WriteFails) {
  ZORPixelImage image(1, 1, {1, 2, 3});
  EXPECT_EQ(image.Write("PNG", (testing::TempDir() + "none.png").c_str()), E_FAIL);
}

}  // namespace
