// Interferences of real clash results, drawn by the platform itself.
#include <gtest/gtest.h>

#include <array>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "PrintPictures.h"
#include "ZORClashParsing.h"
#include "default_platform/InterferenceScene.h"
#include "default_platform/OpenModel.h"
#include "default_platform/system/ObjectCounters.h"
#include "default_platform/visualisation/PictureDrawing.h"
#include "platform/visualisation/ZOR3DBagRep.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"
#include "support/PlatformFolder.h"
#include "support/ScopedVariable.h"

namespace {

using ZORDefault::InterferenceScene;
using ZORDefault::SeenPixel;

/// A model, and the interferences of a result on it.
class Sample {
 public:
  Sample(const std::string& inModel, const std::string& inResult)
      : model(ZORDefault::OpenModel(ZOR_SOURCE_DIR "/samples/" + inModel, WithoutCache())),
        path_(ZOR_SOURCE_DIR "/samples/" + inResult),
        reader_(path_.data()) {
    ZORUnicodeString kind, reference, version;
    reader_.LoadSequence(kind, reference, version);
    ZORListValZORUnicodeString aliases, identifiers;
    ZORMathTransformation* placements = nullptr;
    reader_.GetReBuildSessionInfos(aliases, identifiers, placements);
    placements_.reset(placements);
    Collect(reader_.GetNodeList().item(0).getParentNode());
  }
  std::size_t Count() const { return elements_.size(); }
  InterferenceScene Scene(std::size_t inIndex) const {
    return ZORDefault::MakeInterferenceScene(
        model.root, elements_[inIndex],
        ZORDefault::ResultPlacements{placements_[2 * inIndex], placements_[2 * inIndex + 1]});
  }

  ZORDefault::OpenedModel model;

 private:
  static ZORDefault::ModelOptions WithoutCache() {
    ZORDefault::ModelOptions options;
    options.useCache = false;
    return options;
  }
  void Collect(const DOM_Node& inNode) {
    for (DOM_Node node = inNode.getFirstChild(); !node.isNull(); node = node.getNextSibling()) {
      if (node.getNodeName().equals("Interference")) elements_.push_back(node);
      if (node.getNodeName().equals("ClashResult")) Collect(node);
    }
  }

  std::string path_;
  ZORClashParsing reader_;
  std::unique_ptr<ZORMathTransformation[]> placements_;
  std::vector<DOM_Node> elements_;
};

const Sample& Assembly() {
  static const Sample sample("as1-oc-214.stp", "as1.clash.xml");
  return sample;
}
const Sample& FrenchResult() {
  static const Sample sample("dissonance_assembly.step", "dissonance.clash.xml");
  return sample;
}

ZOR3DRep* RepOf(const ZORI3DGeoVisu_var& inObject) {
  return inObject.IsNull() ? nullptr : dynamic_cast<ZOR3DRep*>(inObject->GetRep());
}

/// A third of the pictures of reports each way, for speed.
constexpr int kWidth = 252, kHeight = 168;
/// What makes 200 pixels of a product, and 50 of markers, in reports.
constexpr int kEnoughOfProduct = 23, kEnoughOfMarkers = 6;

/// Pixels of the first product, the second one and the markers in a picture that frames the
/// interference; nothing when it has a stored viewpoint.
std::optional<std::array<int, 3>> SeenIn(const InterferenceScene& inScene) {
  ZOR3DViewpoint viewpoint;
  if (inScene.interference->FillViewpoint(&viewpoint) == 1) return std::nullopt;
  ZOR3DRep* const things[3] = {RepOf(inScene.products[0]), RepOf(inScene.products[1]),
                               RepOf(inScene.interference)};
  auto* const all = new ZOR3DBagRep;
  std::vector<std::size_t> owners;
  for (std::size_t i = 0; i < 3; ++i) {
    all->AddChild(things[i]);
    owners.resize(owners.size() + ZORDefault::CollectDrawnMeshes(*things[i]).size(), i);
  }
  viewpoint.Reframe(kWidth, kHeight, 1, 1, things[2]->GetShowBoundingElement());
  std::array<int, 3> counts{};
  const auto pixels = ZORDefault::SeePixels(*all, viewpoint, kWidth, kHeight);
  for (const SeenPixel& pixel : pixels.value())
    if (pixel.mesh != SeenPixel::kNothing) ++counts[owners.at(pixel.mesh)];
  things[2]->Destroy();
  all->Destroy();
  return counts;
}

/// @return how many pictures are framed; outGood: how many of them show all three things.
int CountFramed(const Sample& inSample, int& outGood) {
  int framed = 0;
  outGood = 0;
  for (std::size_t i = 0; i < inSample.Count(); ++i) {
    const auto seen = SeenIn(inSample.Scene(i));
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
  PrintPictures::PrintListVisuToFile(inScene.products[0], inScene.paths[0], inScene.products[1],
                                     inScene.paths[1], inScene.interference, inPath.c_str(),
                                     inFormat, 756, 506, 1, 0);
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
    EXPECT_TRUE(
        FrenchResult().Scene(i).whyAsInModel.ends_with(": its numbers are cut at a decimal comma"));
}

TEST(PicturesOfModels, AllInterferencesOfAResultAreWrittenAndEverythingIsReleased) {
  const support::TemporaryFolder folder;
  const auto alive = [](const char* inClass) {
    const ZORDefault::ObjectCounts counts = ZORDefault::CountsOf(inClass);
    return counts.built - counts.released;
  };
  const char* const kClasses[] = {"ZOR3DBagRep",     "ZOR3DViewpoint",  "ZORPrint3DRepImage",
                                  "ZORPixelImage",   "InterferenceRep", "Interference",
                                  "StandingProduct", "ZORRepPath",      "ZORLyraRepPathBuilder"};
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
  PrintPictures::PrintListVisuToFilePreview(scene.products[0], scene.paths[0], path.c_str(), "PNG",
                                            120, 80, 1, 0);
  const std::string bytes = support::ReadFile(path);
  EXPECT_EQ(std::pair(120, 80), SizeOfPng(bytes));
  PrintPictures::PrintListVisuToFilePreview(scene.products[1], scene.paths[1], path.c_str(), "PNG",
                                            120, 80, 1, 0);
  EXPECT_FALSE(bytes == support::ReadFile(path));
}

TEST(PicturesOfModels, UnknownFormatWritesNothing) {
  const support::TemporaryFolder folder;
  Print(Assembly().Scene(0), folder.FilePath("itf.bmp"), "BMP");
  EXPECT_TRUE(std::filesystem::is_empty(folder.path));
}

}  // namespace
