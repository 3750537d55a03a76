// Whole pictures against those that were looked at and kept.
#include <gtest/gtest.h>

#include <string>

#include "default_platform/OpenModel.h"
#include "default_platform/visualisation/GoldenPicture.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"
#include "support/MeshScenes.h"

namespace {

using pictures::CompareWithGolden;
using pictures::Picture;
using support::MeshScene;

Picture DrawModel(const std::string& inFile, const pictures::SetUp& inSetUp) {
  ZORDefault::ModelOptions options;
  options.useCache = false;
  const auto model =
      ZORDefault::OpenModel(std::string(ZOR_SOURCE_DIR) + "/samples/" + inFile, options);
  const ZORI3DGeoVisu_var shown = model.root;
  return pictures::Draw(dynamic_cast<ZOR3DRep*>(shown->GetRep()), 756, 506, inSetUp);
}

void FillWithShapes(MeshScene& ioScene) {
  ioScene.Add(support::MakeBox(60, 60, 6), support::MovedBy(0, 0, -13), {150, 155, 160, 255});
  ioScene.Add(support::MakeBox(24, 24, 20), support::TurnedAndMoved(0.4, -12, -10, 0),
              {200, 60, 50, 255});
  ioScene.Add(support::MakeSphere(12, 48), support::MovedBy(14, -12, 2), {60, 110, 200, 255});
  ioScene.Add(support::MakeTube(7, 40, 48), support::MovedBy(8, 16, 10), {230, 190, 60, 255});
  ioScene.Add(support::MakeBox(14, 14, 30), support::MovedBy(-18, 18, 5), {120, 220, 140, 110});
}

TEST(GoldenPictures, ShapesOnTheDefaultBackground) {
  MeshScene scene;
  FillWithShapes(scene);
  CompareWithGolden("shapes", pictures::Draw(scene.Bag(), 480, 360));
}

TEST(GoldenPictures, ShapesCylindricWithHiddenEdges) {
  MeshScene scene;
  FillWithShapes(scene);
  CompareWithGolden("shapes-hidden-edges",
                    pictures::Draw(scene.Bag(), 480, 360, [](ZORPrint3DRepImage& ioImage) {
                      pictures::White(ioImage);
                      ioImage.GetSupport()->SetViewMode(2, 1);
                      ioImage.GetViewpoint()->projection = ZOR3DViewpoint::kCylindric;
                      ioImage.GetViewpoint()->Reframe(480, 360, 1, 1);
                    }));
}

TEST(GoldenPictures, ShapesAsLines) {
  MeshScene scene;
  FillWithShapes(scene);
  CompareWithGolden("shapes-lines",
                    pictures::Draw(scene.Bag(), 480, 360, [](ZORPrint3DRepImage& ioImage) {
                      pictures::White(ioImage);
                      ioImage.GetSupport()->SetViewMode(1, 0);
                    }));
}

TEST(GoldenPictures, ModelOnWhite) {
  CompareWithGolden("dissonance", DrawModel("dissonance_assembly.step", &pictures::White));
}

}  // namespace
