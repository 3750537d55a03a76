// Surface formats in all their variants, written by the geometry kernel and opened again.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <cmath>
#include <filesystem>
#include <fstream>
#include <numbers>
#include <regex>

#include "default_platform/PartMesh.h"
#include "default_platform/product_structure/ModelWriting.h"
#include "default_platform/product_structure/OpenedModels.h"

using products::FactsOf;
using products::FindByAliasPath;
using products::Folder;
using products::OwnCache;
using testing::ElementsAre;
using testing::HasSubstr;
using ZORDefault::OpenedModel;

namespace fs = std::filesystem;

namespace {

constexpr double kBlockArea = 2200, kBallArea = 100 * std::numbers::pi;
constexpr PartColour kBlue = {0, 128, 255, 255}, kYellow = {255, 255, 0, 255},
                     kRed = {255, 0, 0, 255};

std::vector<std::string> LeafPaths(const OpenedModel& inModel) {
  std::vector<std::string> paths;
  for (const auto& leaf : products::Leaves(inModel.root))
    paths.push_back(products::AliasPathOf(leaf));
  return paths;
}

ZORMathVector MiddleOf(const ZORDefault::ProductInfo& inFacts) {
  return inFacts.rootFromProduct * inFacts.mesh->origin;
}

void ExpectAt(const ZORMathVector& inPoint, double inX, double inY, double inZ,
              double inPrecision = 1e-3) {
  EXPECT_NEAR(inPoint.x, inX, inPrecision);
  EXPECT_NEAR(inPoint.y, inY, inPrecision);
  EXPECT_NEAR(inPoint.z, inZ, inPrecision);
}

/// Sizes and places are those of the frame in millimetres.
void ExpectFramesLengths(const OpenedModel& inModel) {
  const auto block = FactsOf(FindByAliasPath(inModel.root, "block_1"));
  const auto turned = FactsOf(FindByAliasPath(inModel.root, "block_2"));
  const auto ball = FactsOf(FindByAliasPath(inModel.root, "ball_1"));
  EXPECT_NEAR(block.area, kBlockArea, 1e-3);
  EXPECT_NEAR(ball.area, kBallArea, 0.02 * kBallArea);
  ASSERT_NE(block.mesh, nullptr);
  ASSERT_NE(ball.mesh, nullptr);
  EXPECT_EQ(block.mesh, turned.mesh);
  ExpectAt(MiddleOf(block), -95, 10, 15);
  ExpectAt(MiddleOf(turned), 90, 55, 15);
  ExpectAt(MiddleOf(ball), 0, 0, 60);
}

void ExpectFramesColours(const OpenedModel& inModel) {
  EXPECT_EQ(FactsOf(FindByAliasPath(inModel.root, "block_2")).colour, kBlue);
  EXPECT_EQ(FactsOf(FindByAliasPath(inModel.root, "ball_1")).colour, kRed);
  const PartMesh& block = *FactsOf(FindByAliasPath(inModel.root, "block_1")).mesh;
  ASSERT_EQ(block.triangleColours.size(), 12u);
  std::size_t yellow = 0;
  for (const std::uint16_t colour : block.triangleColours)
    yellow += colour != PartMesh::kNoColour && block.colours.at(colour) == kYellow ? 1 : 0;
  EXPECT_EQ(yellow, 2u);
}

/// Two solids of one product, each in a shape representation of its own. @return the file's path.
std::string WriteSolidsApart(const Folder& inFolder) {
  const std::string path = inFolder.GetPath() + "/apart.step";
  products::WriteStepOfTwoSolids(path);
  static const std::regex kTogether(
      R"((#\d+) = SHAPE_REPRESENTATION\('',\((#\d+),(#\d+),(#\d+)\),(#\d+)\);)");
  return inFolder.Write(
      "apart.step",
      std::regex_replace(products::ReadAll(path), kTogether,
                         "$1 = SHAPE_REPRESENTATION('',($2),$5);\n"
                         "#9001 = ADVANCED_BREP_SHAPE_REPRESENTATION('',($2,$3),$5);\n"
                         "#9002 = ADVANCED_BREP_SHAPE_REPRESENTATION('',($2,$4),$5);\n"
                         "#9003 = SHAPE_REPRESENTATION_RELATIONSHIP('','',$1,#9001);\n"
                         "#9004 = SHAPE_REPRESENTATION_RELATIONSHIP('','',$1,#9002);"));
}

std::vector<std::string> WarningsOf(const std::string& inPath) {
  std::vector<std::string> warnings;
  ZORDefault::ModelOptions options;
  options.useCache = false;
  options.warn = [&](const std::string& warning) { warnings.push_back(warning); };
  ZORDefault::OpenModel(inPath, options);
  return warnings;
}

struct Schema {
  const char* name;
  const char* inFile;
};
class StepSchemas : public testing::TestWithParam<Schema> {};

struct Unit {
  const char* name;
  const char* inStep;  // how the file says it
  const char* length;  // 100 mm in it, as the file writes it
};
class StepUnits : public testing::TestWithParam<Unit> {};

struct IgesUnit {
  const char* name;
  const char* inFile;
};
class IgesUnits : public testing::TestWithParam<IgesUnit> {};

template <class Parameter>
std::string NameOf(const testing::TestParamInfo<Parameter>& inInfo) {
  return inInfo.param.name;
}

}  // namespace

TEST_P(StepSchemas, KeepTreePlacesAndColours) {
  const Folder folder;
  const std::string path = folder.GetPath() + "/a.step";
  products::WriteStep(path, {.schema = GetParam().name});
  ASSERT_THAT(products::ReadAll(path), HasSubstr(GetParam().inFile));
  const OpenedModel model = products::OpenAnew(path);
  EXPECT_EQ(products::AliasOf(model.root), "frame");
  EXPECT_THAT(LeafPaths(model), ElementsAre("block_1", "block_2", "ball_1"));
  EXPECT_EQ(FactsOf(FindByAliasPath(model.root, "block_2")).partName, "block");
  ExpectFramesLengths(model);
  ExpectFramesColours(model);
}

INSTANTIATE_TEST_SUITE_P(Written, StepSchemas,
                         testing::Values(Schema{"AP203", "CONFIG_CONTROL_DESIGN"},
                                         Schema{"AP214IS", "AUTOMOTIVE_DESIGN"},
                                         Schema{"AP242DIS", "AP242_MANAGED_MODEL_BASED"}),
                         NameOf<Schema>);

TEST_P(StepUnits, BecomeMillimetres) {
  const Folder folder;
  const std::string path = folder.GetPath() + "/a.step";
  products::WriteStep(path, {.unit = GetParam().name});
  const std::string file = products::ReadAll(path);
  ASSERT_THAT(file, HasSubstr(GetParam().inStep));
  ASSERT_THAT(file, HasSubstr(GetParam().length));
  ExpectFramesLengths(products::OpenAnew(path));
}

INSTANTIATE_TEST_SUITE_P(Written, StepUnits,
                         testing::Values(Unit{"MM", "SI_UNIT(.MILLI.,.METRE.)", "(100.,50.,0."},
                                         Unit{"M", "SI_UNIT($,.METRE.)", "(0.1,"},
                                         Unit{"INCH", "'INCH'", "(3.937007874016,"}),
                         NameOf<Unit>);

TEST(StepSolids, OfOneProductAreOneLeaf) {
  const Folder folder;
  const std::string path = folder.GetPath() + "/a.step";
  products::WriteStepOfTwoSolids(path);
  const OpenedModel model = products::OpenAnew(path);
  EXPECT_THAT(products::AllProducts(model.root), testing::SizeIs(1));
  EXPECT_EQ(products::AliasOf(model.root), "pair");
  EXPECT_NEAR(FactsOf(model.root).area, 1200, 1e-3);
}

TEST(StepSolids, InRepresentationsOfTheirOwnAreNamelessComponents) {
  const Folder folder;
  const OpenedModel model = products::OpenAnew(WriteSolidsApart(folder));
  EXPECT_EQ(products::AliasOf(model.root), "pair");
  EXPECT_THAT(LeafPaths(model), ElementsAre("Component.1", "Component.2"));
  for (const char* name : {"Component.1", "Component.2"})
    EXPECT_NEAR(FactsOf(ZORDefault::FindProduct(model.root, name)).area, 600, 1e-3);
}

TEST(StepSolids, WithoutNameAreAlsoFoundByTheKernelsOwnNames) {
  const Folder folder;
  const OpenedModel model = products::OpenAnew(WriteSolidsApart(folder));
  const auto leaves = products::Leaves(model.root);
  ASSERT_EQ(leaves.size(), 2u);
  EXPECT_TRUE(ZORDefault::FindProduct(model.root, "=>[0:1:1:2]") == leaves[0]);
  EXPECT_TRUE(ZORDefault::FindProduct(model.root, "=>[0:1:1:3]") == leaves[1]);
  EXPECT_TRUE(ZORDefault::FindProduct(model.root, "=>[0:1:1:4]").IsNull());
}

TEST(SplitStep, OpensWithThePartsOfItsOtherFiles) {
  const Folder folder;
  const std::string path = folder.GetPath() + "/frame.step";
  products::WriteStep(path, {.isSplit = true});
  ASSERT_THAT(products::ReadAll(path), HasSubstr("'block.stp'"));
  const OpenedModel model = products::OpenAnew(path);
  EXPECT_THAT(LeafPaths(model), ElementsAre("block_1", "block_2", "ball_1"));
  ExpectFramesLengths(model);
}

TEST(SplitStep, OpensByARelativePath) {
  const Folder folder;
  products::WriteStep(folder.GetPath() + "/frame.step", {.isSplit = true});
  const fs::path before = fs::current_path();
  fs::current_path(fs::path(folder.GetPath()).parent_path());
  const OpenedModel model =
      products::OpenAnew(fs::path(folder.GetPath()).filename().string() + "/frame.step");
  fs::current_path(before);
  ExpectFramesLengths(model);
}

TEST(SplitStep, ChangedOtherFileIsReadAnew) {
  const OwnCache cache;
  const Folder folder;
  const std::string path = folder.GetPath() + "/frame.step";
  products::WriteStep(path, {.isSplit = true});
  EXPECT_FALSE(ZORDefault::OpenModel(path).isFromCache);
  EXPECT_TRUE(ZORDefault::OpenModel(path).isFromCache);
  std::ofstream(folder.GetPath() + "/block.stp", std::ios::app) << "\n";
  EXPECT_FALSE(ZORDefault::OpenModel(path).isFromCache);
}

TEST(SplitStep, MissingOtherFileLeavesItsPartWithoutTriangles) {
  const Folder folder;
  const std::string path = folder.GetPath() + "/frame.step";
  products::WriteStep(path, {.isSplit = true});
  fs::remove(folder.GetPath() + "/ball.stp");
  const OpenedModel model = products::OpenAnew(path);
  EXPECT_THAT(LeafPaths(model), ElementsAre("block_1", "block_2", "ball_1"));
  EXPECT_EQ(FactsOf(FindByAliasPath(model.root, "ball_1")).triangles, 0u);
  EXPECT_EQ(FactsOf(FindByAliasPath(model.root, "block_1")).triangles, 12u);
}

TEST(SplitStep, MissingOtherFileIsWarnedOf) {
  const Folder folder;
  const std::string path = folder.GetPath() + "/frame.step";
  products::WriteStep(path, {.isSplit = true});
  EXPECT_THAT(WarningsOf(path), testing::IsEmpty());
  fs::remove(folder.GetPath() + "/ball.stp");
  EXPECT_THAT(WarningsOf(path), ElementsAre(path + ": its file ball.stp is missing"));
}

TEST(SplitStep, PipeInPlaceOfAnotherFileIsRefused) {
  const Folder folder;
  const std::string path = folder.GetPath() + "/frame.step";
  products::WriteStep(path, {.isSplit = true});
  fs::remove(folder.GetPath() + "/ball.stp");
  ASSERT_EQ(mkfifo((folder.GetPath() + "/ball.stp").c_str(), 0600), 0);
  EXPECT_EQ(products::ReasonOf(path), "names ball.stp, which is no file");
}

TEST_P(IgesUnits, BecomeMillimetres) {
  const Folder folder;
  const std::string path = folder.GetPath() + "/a.igs";
  products::WriteIges(path, GetParam().name);
  ASSERT_THAT(products::ReadAll(path), HasSubstr(GetParam().inFile));
  const OpenedModel model = products::OpenAnew(path);
  const auto facts = FactsOf(model.root);
  const double area = 2 * kBlockArea + kBallArea;
  EXPECT_NEAR(facts.area, area, 0.01 * area);
  ASSERT_NE(facts.mesh, nullptr);
  // From x = -100 to 100, y = -5 to 60, z = 0 to 65; the ball's triangles come close to that.
  ExpectAt(MiddleOf(facts), 0, 27.5, 32.5, 0.05);
}

INSTANTIATE_TEST_SUITE_P(Written, IgesUnits,
                         testing::Values(IgesUnit{"MM", "2HMM"}, IgesUnit{"M", "1HM"},
                                         IgesUnit{"INCH", "4HINCH"}),
                         NameOf<IgesUnit>);

TEST(Iges, IsOnePartWithItsNameAndColours) {
  const Folder folder;
  const std::string path = folder.GetPath() + "/a.igs";
  products::WriteIges(path, "MM");
  const OpenedModel model = products::OpenAnew(path);
  EXPECT_THAT(products::AllProducts(model.root), testing::SizeIs(1));
  EXPECT_EQ(FactsOf(model.root).partName, "frame");
  EXPECT_THAT(FactsOf(model.root).mesh->colours,
              testing::UnorderedElementsAre(kBlue, kYellow, kRed));
}

TEST(Iges, IsKnownByItsContent) {
  const Folder folder;
  const std::string path = folder.GetPath() + "/a.stp";
  products::WriteIges(path, "MM");
  EXPECT_EQ(products::ReasonOf(path), "");
}

TEST(Iges, CutOff) {
  const Folder folder;
  const std::string path = folder.GetPath() + "/a.igs";
  products::WriteIges(path, "MM");
  const std::string whole = products::ReadAll(path);
  for (const std::size_t length : {whole.size() / 3, whole.size() - 100})
    EXPECT_EQ(products::ReasonOf(folder.Write("b.igs", whole.substr(0, length))),
              "is cut off: its IGES data has no end")
        << length;
}
