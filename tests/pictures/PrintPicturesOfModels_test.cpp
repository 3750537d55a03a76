// Interferences of real clash results, drawn by the platform itself.
#include <gtest/gtest.h>

#include <array>
#include <string>
#include <vector>

#include "PrintPictures.h"
#include "default_platform/system/ObjectCounters.h"
#include "support/PlatformFolder.h"
#include "support/ResultOnModel.h"
#include "support/ScopedVariable.h"

namespace {

using support::ResultOnModel;
using ZORDefault::InterferenceScene;

constexpr char kSamples[] = ZOR_SOURCE_DIR "/samples/";

const ResultOnModel& Assembly() {
  static const ResultOnModel sample(kSamples + std::string("as1-oc-214.stp"),
                                    kSamples + std::string("as1.clash.xml"));
  return sample;
}
const ResultOnModel& FrenchResult() {
  static const ResultOnModel sample(kSamples + std::string("dissonance_assembly.step"),
                                    kSamples + std::string("dissonance.clash.xml"));
  return sample;
}

/// A third of the pictures of reports each way, for speed.
constexpr int kWidth = 252, kHeight = 168;
/// What makes 200 pixels of a product, and 50 of markers, in reports.
constexpr int kEnoughOfProduct = 23, kEnoughOfMarkers = 6;

/// @return how many pictures are framed; outGood: how many of them show all three things.
int CountFramed(const ResultOnModel& inSample, int& outGood) {
  int framed = 0;
  outGood = 0;
  for (std::size_t i = 0; i < inSample.Count(); ++i) {
    const auto seen = support::SeenWhereFramed(inSample.Scene(i), kWidth, kHeight);
    if (!seen) continue;
    ++framed;
    const auto& [first, second, markers] = *seen;
    if (first >= kEnoughOfProduct && second >= kEnoughOfProduct && markers >= kEnoughOfMarkers)
      ++outGood;
    else
      std::printf("interference %zu: %d %d %d pixels\n", i + 1, first, second, markers);
  }
  return framed;
}

void Print(const InterferenceScene& inScene, const std::string& inPath, const char* inFormat) {
  PrintPictures::PrintListVisuToFile(inScene.products[0], "", inScene.products[1], "",
                                     inScene.interference, inPath.c_str(), inFormat, 756, 506, 1,
                                     0);
}

/// Width and height in a PNG file's header.
std::pair<int, int> SizeOfPng(const std::string& inBytes) {
  const auto number = [&](std::size_t inAt) {
    int value = 0;
    for (std::size_t i = inAt; i < inAt + 4; ++i)
      value = 256 * value + static_cast<unsigned char>(inBytes.at(i));
    return value;
  };
  EXPECT_EQ("\x89PNG", inBytes.substr(0, 4));
  return {number(16), number(20)};
}

TEST(PicturesOfModels, BothProductsAreSeenInFramedPictures) {
  int good = 0;
  const int framed = CountFramed(Assembly(), good);
  EXPECT_EQ(16, framed);
  EXPECT_EQ(framed, good);
}

TEST(PicturesOfModels, BothProductsAreSeenWhereTheModelsPlacesAreTaken) {
  int good = 0;
  const int framed = CountFramed(FrenchResult(), good);
  EXPECT_EQ(10, framed);
  EXPECT_EQ(framed, good);
}

TEST(PicturesOfModels, PlacementsWithDecimalCommasAreNotTrusted) {
  for (std::size_t i = 0; i < FrenchResult().Count(); ++i)
    EXPECT_TRUE(FrenchResult().Resolved(i).whyAsInModel.ends_with(
        ": its numbers are cut at a decimal comma"));
}

TEST(PicturesOfModels, AllInterferencesOfAResultAreWrittenAndEverythingIsReleased) {
  const support::TemporaryFolder folder;
  const auto alive = [](const char* inClass) {
    const ZORDefault::ObjectCounts counts = ZORDefault::CountsOf(inClass);
    return counts.built - counts.released;
  };
  const char* const kClasses[] = {"ZOR3DBagRep",   "ZOR3DViewpoint",  "ZORPrint3DRepImage",
                                  "ZORPixelImage", "InterferenceRep", "Interference",
                                  "PlacedProduct", "ZORRepPath",      "ZORLyraRepPathBuilder"};
  std::vector<long> before;
  for (const char* const name : kClasses) before.push_back(alive(name));
  const long images = ZORDefault::CountsOf("ZORPrint3DRepImage").built;
  for (std::size_t i = 0; i < Assembly().Count(); ++i) {
    const std::string path = folder.FilePath(std::to_string(i) + ".png");
    Print(Assembly().Scene(i), path, "PNG");
    EXPECT_EQ(std::pair(756, 506), SizeOfPng(support::ReadFile(path))) << i;
  }
  EXPECT_EQ(32, ZORDefault::CountsOf("ZORPrint3DRepImage").built - images);
  for (std::size_t i = 0; i < before.size(); ++i)
    EXPECT_EQ(before[i], alive(kClasses[i])) << kClasses[i];
}

TEST(PicturesOfModels, SamePictureHasTheSameBytes) {
  const support::TemporaryFolder folder;
  const std::string first = folder.FilePath("1.jpg"), second = folder.FilePath("2.jpg");
  Print(Assembly().Scene(0), first, "JPEG");
  Print(Assembly().Scene(0), second, "JPEG");
  EXPECT_EQ("\xFF\xD8", support::ReadFile(first).substr(0, 2));
  EXPECT_TRUE(support::ReadFile(first) == support::ReadFile(second));
}

TEST(PicturesOfModels, ZoomChangesWhatIsFramed) {
  const support::PlatformFolder folder;
  Print(Assembly().Scene(0), folder.FilePath("close.png"), "PNG");
  folder.WriteSettings("ClashPublish", "PictureZoom = 1\n");
  Print(Assembly().Scene(0), folder.FilePath("all.png"), "PNG");
  EXPECT_FALSE(support::ReadFile(folder.FilePath("close.png")) ==
               support::ReadFile(folder.FilePath("all.png")));
}

TEST(PicturesOfModels, PartsAreWrittenAsThumbnails) {
  const support::PlatformFolder folder;
  const support::ScopedVariable wanted("TRX_VELD_SUBINTERF", "TRUE");
  folder.WriteFile("system/Clash.toml", "ModeOfSubInterf = 1\n");
  Print(Assembly().Scene(0), folder.FilePath("itf.png"), "PNG");
  EXPECT_EQ(std::pair(72, 50), SizeOfPng(support::ReadFile(folder.FilePath("itf_SubItf_1.png"))));
  EXPECT_FALSE(std::filesystem::exists(folder.FilePath("itf_SubItf_2.png")));
}

TEST(PicturesOfModels, PreviewShowsOneProduct) {
  const support::TemporaryFolder folder;
  const InterferenceScene scene = Assembly().Scene(0);
  const std::string path = folder.FilePath("preview.png");
  PrintPictures::PrintListVisuToFilePreview(scene.products[0], "", path.c_str(), "PNG", 120, 80, 1,
                                            0);
  const std::string bytes = support::ReadFile(path);
  EXPECT_EQ(std::pair(120, 80), SizeOfPng(bytes));
  PrintPictures::PrintListVisuToFilePreview(scene.products[1], "", path.c_str(), "PNG", 120, 80, 1,
                                            0);
  EXPECT_FALSE(bytes == support::ReadFile(path));
}

TEST(PicturesOfModels, UnknownFormatWritesNothing) {
  const support::TemporaryFolder folder;
  Print(Assembly().Scene(0), folder.FilePath("itf.bmp"), "BMP");
  EXPECT_TRUE(std::filesystem::is_empty(folder.path));
}

}  // namespace
