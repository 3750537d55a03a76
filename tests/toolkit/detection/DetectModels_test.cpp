// Pairs whose interference is known, written to model files and found there.
#include <gtest/gtest.h>

#include <algorithm>
#include <map>

#include "toolkit/detection/Detect.h"
#include "toolkit/detection/HandMadePairs.h"
#include "toolkit/detection/ModelWriting.h"
#include "tools/Command.h"

namespace ZORToolkit {
namespace {

using namespace ZORDetection::Shapes;
using ZORDetection::ModelWriting;
using Kind = DetectedInterference::Kind;

/// How the pairs stand in the model: far from each other, so that each meets its partner only.
struct Arrangement {
  const char* unit = "MM";
  bool isSwapped = false, isReversed = false;
  gp_Trsf motion;
};

gp_Trsf Oblique() {
  gp_Trsf motion;
  motion.SetRotation(gp_Ax1(gp_Pnt(3, -4, 5), gp_Dir(0.3, 0.5, 0.7)), 1.1);
  motion.SetTranslationPart(gp_Vec(12.5, -33.1, 8.7));
  return motion;
}

/// Patterns can pick pairs by the clearance that they are about.
std::string NameOf(const PairOfShapes& inPair) {
  return std::to_string(static_cast<int>(10 * inPair.clearance)) + " " + inPair.name;
}

std::string WriteModel(const TemporaryDirectory& inFolder, const Arrangement& inArrangement) {
  std::vector<PairOfShapes> pairs = Pairs();
  if (inArrangement.isReversed) std::ranges::reverse(pairs);
  ModelWriting model;
  double x = 0;
  for (const PairOfShapes& pair : pairs) {
    gp_Trsf place;
    place.SetTranslation(gp_Vec(x += 1000, 0, 0));
    place = inArrangement.motion * place;
    std::array<const TopoDS_Shape*, 2> shapes{&pair.first, &pair.second};
    if (inArrangement.isSwapped) std::swap(shapes[0], shapes[1]);
    const char* side = " a";
    for (const TopoDS_Shape* shape : shapes) {
      // Pairs that share a shape would share a part, which has one name.
      model.Add(NameOf(pair) + side, BRepBuilderAPI_Copy(*shape).Shape(), place);
      side = " b";
    }
  }
  const std::string path = inFolder.Path("pairs.stp");
  EXPECT_TRUE(model.WriteStep(path, inArrangement.unit));
  return path;
}

/// The name of a product's pair.
std::string PairOf(const DetectedProduct& inProduct) {
  return inProduct.path.substr(0, inProduct.path.rfind(' '));
}

/// By the name of the pair.
std::map<std::string, DetectedInterference> Found(const std::string& inModel,
                                                  const DetectionOptions& inOptions) {
  const DetectionResult result = Detect(inModel, inOptions);
  EXPECT_TRUE(result.unjudged.empty());
  std::map<std::string, DetectedInterference> found;
  for (const DetectedInterference& interference : result.interferences) {
    const std::string name = PairOf(result.products[interference.first]);
    EXPECT_EQ(name, PairOf(result.products[interference.second]));
    EXPECT_TRUE(found.emplace(name, interference).second) << name;
  }
  return found;
}

Expected KindOf(const DetectedInterference& inFound) {
  constexpr Expected kKinds[] = {kClash, kContact, kClearance};
  return kKinds[static_cast<std::size_t>(inFound.kind)];
}

void ExpectAnswers(const std::string& inModel, double inClearance) {
  DetectionOptions options;
  options.clearance = inClearance;
  options.level = 1;  // parts of several solids are written as assemblies
  if (inClearance > 0) options.only = {std::to_string(static_cast<int>(10 * inClearance)) + " *"};
  const auto found = Found(inModel, options);
  std::size_t expected = 0;
  for (const PairOfShapes& pair : Pairs()) {
    if (pair.clearance != inClearance && (inClearance > 0 || pair.kind == kClearance)) continue;
    SCOPED_TRACE(pair.name);
    const auto place = found.find(NameOf(pair));
    ASSERT_EQ(place != found.end(), pair.kind != kNone);
    if (place == found.end()) continue;
    ++expected;
    EXPECT_EQ(KindOf(place->second), pair.kind);
    EXPECT_NEAR(place->second.value, pair.value, pair.kind == kClash ? 1e-3 : 1e-6);
    EXPECT_EQ(place->second.isDuplicate, pair.isDuplicate);
  }
  EXPECT_EQ(found.size(), expected);
  EXPECT_GT(expected, 0U);
}

TEST(DetectModels, PairsInMillimetres) {
  const TemporaryDirectory folder;
  const std::string model = WriteModel(folder, {});
  for (const double clearance : {0., 0.3, 1., 2.}) ExpectAnswers(model, clearance);
}

TEST(DetectModels, PairsInMetresMovedAndSwapped) {
  const TemporaryDirectory folder;
  const std::string model = WriteModel(folder, {"M", true, false, Oblique()});
  for (const double clearance : {0., 1.}) ExpectAnswers(model, clearance);
}

TEST(DetectModels, PairsInInchesInReverseOrder) {
  const TemporaryDirectory folder;
  const std::string model = WriteModel(folder, {"INCH", false, true, {}});
  for (const double clearance : {0., 1.}) ExpectAnswers(model, clearance);
}

/// Blocks that touch, and a third that enters the second by 0.5.
ModelWriting Blocks() {
  ModelWriting model;
  for (const double x : {0., 10., 19.5}) {
    gp_Trsf place;
    place.SetTranslation(gp_Vec(x, 0, 0));
    model.Add("block " + std::to_string(static_cast<int>(x)), Cube(0, 0, 0), place);
  }
  return model;
}

void ExpectBlocks(const std::string& inModel, bool inIsMesh, double inUnit = 1) {
  const DetectionResult result = Detect(inModel, {});
  EXPECT_EQ(result.productsChecked, 3U);
  ASSERT_EQ(result.interferences.size(), 2U);
  EXPECT_EQ(result.interferences[0].kind, Kind::kContact);
  EXPECT_EQ(result.interferences[1].kind, Kind::kClash);
  EXPECT_NEAR(result.interferences[1].value, -0.5 * inUnit, 1e-3);
  for (const DetectedInterference& found : result.interferences)
    EXPECT_EQ(found.meshPrecision.has_value(), inIsMesh);
}

TEST(DetectModels, IgesIsExact) {
  const TemporaryDirectory folder;
  ASSERT_TRUE(Blocks().WriteIges(folder.Path("blocks.igs")));
  ExpectBlocks(folder.Path("blocks.igs"), false);
}

TEST(DetectModels, GlbIsTriangles) {
  const TemporaryDirectory folder;
  ASSERT_TRUE(Blocks().WriteGlb(folder.Path("blocks.glb")));
  ExpectBlocks(folder.Path("blocks.glb"), true);
}

TEST(DetectModels, ObjIsTriangles) {
  const TemporaryDirectory folder;
  ASSERT_TRUE(Blocks().WriteObj(folder.Path("blocks.obj")));
  ExpectBlocks(folder.Path("blocks.obj"), true);
}

}  // namespace
}  // namespace ZORToolkit
