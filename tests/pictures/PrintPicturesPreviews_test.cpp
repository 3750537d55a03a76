// The preview of one product, and pictures of given scenes.
#include <gtest/gtest.h>

#include "PrintPictures.h"
#include "default_platform/system/ObjectCounters.h"
#include "pictures/FakeObjects.h"
#include "platform/visualisation/ZOR3DBagRep.h"
#include "support/AbandonedMemory.h"

namespace {

constexpr char kWritten[] = "rasterise;prepare 2;write PNG a.png;pixels released;";

class Previews : public testing::Test {
 protected:
  Previews() {
    recorded = {};
    recorded.findRep = [this](const std::string&) { return product.rep; };
  }
  void Preview(const ZORIProduct_var& inProduct, int inViewMode = 0, int inKeepBackground = 1) {
    PrintPictures::PrintListVisuToFilePreview(inProduct, "Top/a", "a.png", "PNG", 40, 30,
                                              inViewMode, inKeepBackground);
  }
  PictureProduct product{"a"};
};

TEST_F(Previews, ShowsTheProductsBagItselfAndDeletesThePathBeforeTheBuilder) {
  product.Withdraw(ZORIVisProperties::ClassId());
  Preview(product.Handle());
  EXPECT_EQ("(a)", recorded.scenes);
  EXPECT_EQ("builder 0;path of Top/a;image 40x30;" + std::string(kWritten) +
                "image released;path deleted;builder deleted;",
            recorded.calls);
}

TEST_F(Previews, LeavesTheProductsRepresentationAndEndsItsBag) {
  const ZORDefault::ObjectCounts before = ZORDefault::CountsOf("ZOR3DBagRep");
  Preview(product.Handle());
  const ZORDefault::ObjectCounts after = ZORDefault::CountsOf("ZOR3DBagRep");
  EXPECT_EQ(1, after.built - before.built);
  EXPECT_EQ(1, after.released - before.released);
  EXPECT_EQ(std::string::npos, recorded.calls.find("a destroyed"));
}

TEST_F(Previews, NullProductWritesNothing) {
  Preview(ZORIProduct_var());
  EXPECT_EQ("", recorded.calls);
}

TEST_F(Previews, ProductWithoutVisualisationIsLookedUpAllTheSame) {
  product.Withdraw(ZORI3DGeoVisu::ClassId());
  Preview(product.Handle());
  EXPECT_EQ("(a)", recorded.scenes);
}

TEST_F(Previews, ProductThatIsNotFoundShowsAnEmptyBag) {
  recorded.pathResult = E_FAIL;
  Preview(product.Handle());
  EXPECT_EQ("()", recorded.scenes);
  EXPECT_NE(std::string::npos, recorded.calls.find("write PNG a.png"));
}

TEST_F(Previews, PathWithoutRepresentationShowsAnEmptyBag) {
  recorded.findRep = [](const std::string&) { return nullptr; };
  product.SetColour(1, 2, 3, true);
  Preview(product.Handle());
  EXPECT_EQ("()", recorded.scenes);
}

TEST_F(Previews, ImposesTheProductsColour) {
  product.SetColour(10, 20, 30, true);
  Preview(product.Handle());
  EXPECT_EQ("10,20,30,255 0x1004", product.ShownColour());
}

TEST_F(Previews, ReleasesThePrintImageThatGivesNoPicture) {
  recorded.canRasterize = false;
  Preview(product.Handle());
  EXPECT_NE(std::string::npos, recorded.calls.find("rasterise;image released;"));
}

TEST_F(Previews, ModesAndBackgroundFollowTheirFlags) {
  Preview(product.Handle(), 1, 0);
  EXPECT_NE(std::string::npos, recorded.calls.find("image 40x30;white;mode 1=1;mode 2=0;raster"));
  for (const int mode : {0, 2, -1}) {
    recorded.calls.clear();
    Preview(product.Handle(), mode, mode == 0 ? 2 : -1);
    EXPECT_NE(std::string::npos, recorded.calls.find("image 40x30;rasterise;")) << mode;
  }
}

TEST_F(Previews, GenerateJoinsDirectoryAndNameByOneBackslash) {
  PrintPictures::GeneratePicturesPreview(product.Handle(), "Top/a", "C:\\rep", "a.jpg", "JPEG", 7,
                                         9, 1, 0);
  EXPECT_NE(std::string::npos, recorded.calls.find("path of Top/a;"));
  EXPECT_NE(std::string::npos, recorded.calls.find("image 7x9;white;mode 1=1;mode 2=0;"));
  EXPECT_NE(std::string::npos, recorded.calls.find("write JPEG C:\\rep\\a.jpg;"));
}

TEST_F(Previews, GenerateAddsASecondBackslash) {
  PrintPictures::GeneratePicturesPreview(product.Handle(), "Top/a", "C:\\rep\\", "a.jpg", "JPEG", 7,
                                         9, 1, 0);
  EXPECT_NE(std::string::npos, recorded.calls.find("write JPEG C:\\rep\\\\a.jpg;"));
}

TEST_F(Previews, TakeRepImageFramesTheWholeScene) {
  auto* const bag = new ZOR3DBagRep;
  bag->AddChild(product.rep);
  PrintPictures::TakeRepImage(bag, "a.png", "PNG", 40, 30, 0, 1);
  ZOR3DViewpoint framed;
  framed.Reframe(40, 30, 1, 1, {{}, 1});
  EXPECT_DOUBLE_EQ(framed.origin.x, recorded.eye.x);
  bag->Destroy();
}

TEST_F(Previews, TakeRepImageThroughAViewpointCopiesItUnchanged) {
  ZOR3DViewpoint viewpoint;
  viewpoint.origin = {7, 8, 9};
  viewpoint.focusDistance = 11;
  PrintPictures::TakeRepImage(product.rep, "a.png", &viewpoint, "PNG", 40, 30, 0, 1);
  EXPECT_EQ(7, recorded.eye.x);
  EXPECT_EQ(11, recorded.focusDistance);
  EXPECT_EQ("image 40x30;" + std::string(kWritten) + "image released;", recorded.calls);
}

TEST_F(Previews, TakeRepImageThroughAViewpointLeavesAFailedPrintImage) {
  recorded.canRasterize = false;
  const support::AbandonedMemory abandoned;
  ZOR3DViewpoint viewpoint;
  PrintPictures::TakeRepImage(product.rep, "a.png", &viewpoint, "PNG", 40, 30, 1, 0);
  EXPECT_EQ("image 40x30;white;mode 1=1;mode 2=0;rasterise;", recorded.calls);
}

TEST_F(Previews, TakeRepImageOfANullSceneDoesNothing) {
  PrintPictures::TakeRepImage(nullptr, "a.png", "PNG", 40, 30, 1, 0);
  PrintPictures::TakeRepImage(nullptr, "a.png", static_cast<ZOR3DViewpoint*>(nullptr), "PNG", 40,
                              30, 1, 0);
  EXPECT_EQ("", recorded.calls);
}

}  // namespace
