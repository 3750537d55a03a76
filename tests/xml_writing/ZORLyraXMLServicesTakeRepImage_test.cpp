// Every call that taking a picture makes on the platform. This program's print images, supports and
// pixel images take the place of the platform's: they draw nothing and write down what they are
// asked.
#include <gtest/gtest.h>

#include <initializer_list>
#include <stdexcept>
#include <string>
#include <utility>

#include "ZORLyraXMLServices.h"
#include "platform/visualisation/ZORPrint3DRepImage.h"
#include "support/AbandonedMemory.h"

namespace {

/// What happened, in order, each followed by a semicolon.
std::string calls;
bool hasSupport = true;
bool canRasterize = true;
HRESULT writeResult = S_OK;
ZOR3DRep* shown = nullptr;
ZORMathVector eye;  // of the print image when it was rasterised

std::string raising;  // how the call begins that raises an error

void Note(const std::string& inCall) {
  calls += inCall + ";";
  if (!raising.empty() && inCall.starts_with(raising)) throw std::runtime_error(inCall);
}

std::string Numbers(std::initializer_list<double> inNumbers) {
  std::string text;
  for (double number : inNumbers) text += (text.empty() ? "" : ",") + std::to_string(number);
  return text;
}

}  // namespace

ZORPrint3DRepImage::ZORPrint3DRepImage(ZOR3DRep* inRep, int inWidth, int inHeight)
    : rep_(inRep), width_(inWidth), height_(inHeight), viewpoint_(new ZOR3DViewpoint) {
  shown = rep_;
  Note("image " + std::to_string(width_) + "x" + std::to_string(height_));
}
ZORPrint3DRepImage::~ZORPrint3DRepImage() {
  viewpoint_->Release();
  calls += "image released;";
}
ZORSupport* ZORPrint3DRepImage::GetSupport() { return hasSupport ? &support_ : nullptr; }
ZOR3DViewpoint* ZORPrint3DRepImage::GetViewpoint() { return viewpoint_; }
ZORPixelImage* ZORPrint3DRepImage::Rasterize() {
  eye = viewpoint_->origin;
  Note("rasterise");
  return canRasterize ? new ZORPixelImage(width_, height_, {}) : nullptr;
}

void ZORSupport::SetBackgroundColor(float inRed, float inGreen, float inBlue) {
  Note("background " + Numbers({inRed, inGreen, inBlue}));
}
void ZORSupport::SetViewMode(int inMode, int inValue) {
  Note("mode " + std::to_string(inMode) + "=" + std::to_string(inValue));
}

ZORPixelImage::ZORPixelImage(int inWidth, int inHeight, std::vector<std::uint8_t> inPixels)
    : width_(inWidth), height_(inHeight), pixels_(std::move(inPixels)) {}
ZORPixelImage::~ZORPixelImage() { calls += "pixels released;"; }
HRESULT ZORPixelImage::Prepare(int inDepth) {
  Note("prepare " + std::to_string(inDepth));
  return S_OK;
}
HRESULT ZORPixelImage::Write(const ZORString& inFormat, const ZORString& inPath) const {
  Note(std::string("write ") + inFormat.CastToCharPtr() + " " + inPath.CastToCharPtr());
  return writeResult;
}

namespace {

constexpr char kWhite[] = "background 1.000000,1.000000,1.000000;";
constexpr char kModes[] = "mode 1=1;mode 2=0;";
constexpr char kWritten[] = "rasterise;prepare 2;write JPEG picture.jpg;pixels released;";

class EmptyRep : public ZOR3DRep {
 public:
  ZOR3DBoundingSphere GetShowBoundingElement() const override { return {}; }
  void Accept(ZOR3DSceneVisitor&) const override {}
};

class TakeRepImage : public testing::Test {
 protected:
  TakeRepImage() {
    calls.clear();
    hasSupport = canRasterize = true;
    writeResult = S_OK;
    shown = nullptr;
  }
  ~TakeRepImage() override {
    rep->Destroy();
    viewpoint->Release();
  }

  EmptyRep* rep = new EmptyRep;
  ZOR3DViewpoint* viewpoint = new ZOR3DViewpoint;
};

TEST_F(TakeRepImage, FramedDrawsAndWritesInTheSizeOfReports) {
  ZORLyraXMLServices::TakeRepImage(rep, "picture.jpg", 0);
  EXPECT_EQ(std::string("image 756x506;") + kWhite + kModes + kWritten + "image released;", calls);
  EXPECT_EQ(rep, shown);
}

TEST_F(TakeRepImage, SizedDrawsAndWritesInTheSizeGiven) {
  ZORLyraXMLServices::TakeRepImage(rep, "picture.jpg", 31, 17, 1, 0);
  EXPECT_EQ(std::string("image 31x17;") + kWhite + kModes + kWritten + "image released;", calls);
  EXPECT_EQ(rep, shown);
}

TEST_F(TakeRepImage, ThroughAViewpointDrawsAndWritesInTheSizeOfReports) {
  ZORLyraXMLServices::TakeRepImage(rep, "picture.jpg", viewpoint, 0);
  EXPECT_EQ(std::string("image 756x506;") + kWhite + kModes + kWritten + "image released;", calls);
  EXPECT_EQ(rep, shown);
}

TEST_F(TakeRepImage, ThroughAViewpointDrawsFromItsPlace) {
  viewpoint->origin = ZORMathVector(1, 2, 3);
  ZORLyraXMLServices::TakeRepImage(rep, "picture.jpg", viewpoint, 0);
  EXPECT_EQ(1, eye.x);
  EXPECT_EQ(2, eye.y);
  EXPECT_EQ(3, eye.z);
}

TEST_F(TakeRepImage, ErrorsReachTheCallerAndLeaveNothingBehind) {
  for (const auto& [call, releases] : {std::pair{"write", "pixels released;image released;"},
                                       {"rasterise", "rasterise;image released;"},
                                       {"mode 2", "mode 2=0;image released;"}}) {
    calls.clear();
    raising = call;
    EXPECT_THROW(ZORLyraXMLServices::TakeRepImage(rep, "picture.jpg", viewpoint, 0),
                 std::runtime_error);
    raising.clear();
    EXPECT_TRUE(calls.ends_with(releases)) << calls;
  }
}

TEST_F(TakeRepImage, NullRepresentationDoesNothing) {
  ZORLyraXMLServices::TakeRepImage(nullptr, "picture.jpg", 0);
  ZORLyraXMLServices::TakeRepImage(nullptr, "picture.jpg", 756, 506, 1, 0);
  ZORLyraXMLServices::TakeRepImage(nullptr, "picture.jpg", viewpoint, 0);
  EXPECT_EQ("", calls);
}

TEST_F(TakeRepImage, NullRepresentationDoesNotLookAtTheViewpoint) {
  ZORLyraXMLServices::TakeRepImage(nullptr, "picture.jpg", static_cast<ZOR3DViewpoint*>(nullptr),
                                   0);
  EXPECT_EQ("", calls);
}

TEST_F(TakeRepImage, AnyOtherFlagThanZeroKeepsTheBackground) {
  for (int keep : {1, 2, -1}) {
    calls.clear();
    ZORLyraXMLServices::TakeRepImage(rep, "picture.jpg", keep);
    ZORLyraXMLServices::TakeRepImage(rep, "picture.jpg", 756, 506, 1, keep);
    ZORLyraXMLServices::TakeRepImage(rep, "picture.jpg", viewpoint, keep);
    const std::string one = std::string("image 756x506;") + kModes + kWritten + "image released;";
    EXPECT_EQ(one + one + one, calls) << keep;
  }
}

TEST_F(TakeRepImage, SizedSetsTheViewModesForTheFlagOneAlone) {
  for (int mode : {0, 2, -1}) {
    calls.clear();
    ZORLyraXMLServices::TakeRepImage(rep, "picture.jpg", 756, 506, mode, 0);
    EXPECT_EQ(std::string("image 756x506;") + kWhite + kWritten + "image released;", calls) << mode;
  }
}

TEST_F(TakeRepImage, WithoutSupportItDrawsAllTheSame) {
  hasSupport = false;
  ZORLyraXMLServices::TakeRepImage(rep, "picture.jpg", 0);
  ZORLyraXMLServices::TakeRepImage(rep, "picture.jpg", 756, 506, 1, 0);
  ZORLyraXMLServices::TakeRepImage(rep, "picture.jpg", viewpoint, 0);
  const std::string one = std::string("image 756x506;") + kWritten + "image released;";
  EXPECT_EQ(one + one + one, calls);
}

TEST_F(TakeRepImage, SizeIsPassedOnWhateverItIs) {
  ZORLyraXMLServices::TakeRepImage(rep, "picture.jpg", 0, -3, 0, 1);
  EXPECT_EQ(std::string("image 0x-3;") + kWritten + "image released;", calls);
}

TEST_F(TakeRepImage, PathIsTakenAsItStandsInItsNarrowForm) {
  for (const char* path : {"a.png", "no ending", "Größe/日本.jpg", ""}) {
    calls.clear();
    ZORLyraXMLServices::TakeRepImage(rep, path, 9, 9, 0, 1);
    EXPECT_EQ(std::string("image 9x9;rasterise;prepare 2;write JPEG ") + path +
                  ";pixels released;image released;",
              calls);
  }
}

TEST_F(TakeRepImage, FailedWritingIsNotLookedAt) {
  writeResult = E_FAIL;
  ZORLyraXMLServices::TakeRepImage(rep, "picture.jpg", 1);
  ZORLyraXMLServices::TakeRepImage(rep, "picture.jpg", viewpoint, 1);
  const std::string one = std::string("image 756x506;") + kModes + kWritten + "image released;";
  EXPECT_EQ(one + one, calls);
}

TEST_F(TakeRepImage, SizedReleasesThePrintImageWithoutAPicture) {
  canRasterize = false;
  ZORLyraXMLServices::TakeRepImage(rep, "picture.jpg", 756, 506, 0, 1);
  EXPECT_EQ("image 756x506;rasterise;image released;", calls);
}

/// The print images that are not released are meant to stay.
class WithoutPicture : public TakeRepImage {
 protected:
  WithoutPicture() { canRasterize = false; }
  const support::AbandonedMemory abandoned;
};

TEST_F(WithoutPicture, FramedLeavesThePrintImageUnreleased) {
  ZORLyraXMLServices::TakeRepImage(rep, "picture.jpg", 1);
  EXPECT_EQ(std::string("image 756x506;") + kModes + "rasterise;", calls);
}

TEST_F(WithoutPicture, ThroughAViewpointLeavesThePrintImageUnreleased) {
  ZORLyraXMLServices::TakeRepImage(rep, "picture.jpg", viewpoint, 1);
  EXPECT_EQ(std::string("image 756x506;") + kModes + "rasterise;", calls);
}

}  // namespace
