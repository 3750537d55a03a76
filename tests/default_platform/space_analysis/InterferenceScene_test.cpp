#include "default_platform/InterferenceScene.h"

#include <gtest/gtest.h>

#include "default_platform/space_analysis/Assembly.h"
#include "default_platform/system/ObjectCounters.h"
#include "default_platform/visualisation/SceneGraph.h"
#include "platform/product_structure/ZORIAlias.h"
#include "platform/visualisation/ZORIVisProperties.h"

namespace {

using namespace assembly;
using ZORDefault::InterferenceScene;
using ZORDefault::MakeInterferenceScene;
using ZORDefault::ResultPlacements;

const ResultPlacements kGiven = {ReadMatrix(), ReadMatrix()};

ZORMathVector TranslationOf(const ZORIProduct_var& inProduct) {
  return ZORDefault::CollectMeshInstances(*RepOf(inProduct)).front().rootFromPart.GetVector();
}
void ExpectAt(const ZORMathVector& inExpected, const ZORIProduct_var& inProduct) {
  const ZORMathVector found = TranslationOf(inProduct);
  EXPECT_NEAR(inExpected.x, found.x, 1e-9);
  EXPECT_NEAR(inExpected.y, found.y, 1e-9);
  EXPECT_NEAR(inExpected.z, found.z, 1e-9);
}
InterferenceScene Scene(const std::string& inContent) {
  return MakeInterferenceScene(Root(), Interference(inContent), kGiven);
}

TEST(InterferenceScene, ProductsStandWhereTheResultSays) {
  const InterferenceScene scene = Scene(ProductText(kNut) + ProductText(kRod));
  EXPECT_EQ("", scene.whyAsInModel);
  ExpectAt({1, 2, 3}, scene.products[0]);
  ExpectAt({1, 2, 3}, scene.products[1]);
  EXPECT_TRUE(scene.paths[0] == kNut);
  EXPECT_TRUE(scene.paths[1] == kRod);
}

TEST(InterferenceScene, PartsOfAnAssemblyMoveWithIt) {
  const ZORIProduct_var assembly = Product("rod-assembly_1");
  const InterferenceScene scene = Scene(ProductText("rod-assembly_1") + ProductText(kRod));
  const auto before = ZORDefault::CollectMeshInstances(*RepOf(assembly));
  const auto after = ZORDefault::CollectMeshInstances(*RepOf(scene.products[0]));
  ASSERT_EQ(3u, before.size());
  ASSERT_EQ(3u, after.size());
  // The same point of the assembly, seen from each part.
  const ZORMathTransformation model = Facts(assembly).rootFromProduct;
  const ZORMathVector inAssembly(5, 6, 7);
  const ZORMathVector moved = ReadMatrix() * inAssembly, stood = model * inAssembly;
  for (std::size_t i = 0; i < 3; ++i) {
    const ZORMathVector a = before[i].rootFromPart.GetVector(),
                        b = after[i].rootFromPart.GetVector();
    const double was = std::hypot(a.x - stood.x, a.y - stood.y, a.z - stood.z);
    const double is = std::hypot(b.x - moved.x, b.y - moved.y, b.z - moved.z);
    EXPECT_NEAR(was, is, 1e-9);
  }
}

TEST(InterferenceScene, WithoutPlacementsProductsStandAsInTheModel) {
  const InterferenceScene scene = NutAndRod();
  EXPECT_EQ("", scene.whyAsInModel);
  ExpectAt(Facts(Product(kNut)).rootFromProduct.GetVector(), scene.products[0]);
}

TEST(InterferenceScene, OnePlacementThatIsNotTrustedPutsBothAsInTheModel) {
  const InterferenceScene scene = Scene(ProductText(kNut) + ProductText(kRod, ""));
  EXPECT_EQ(std::string(kRod) + ": the result has no matrix of it", scene.whyAsInModel);
  ExpectAt(Facts(Product(kNut)).rootFromProduct.GetVector(), scene.products[0]);
  ExpectAt(Facts(Product(kRod)).rootFromProduct.GetVector(), scene.products[1]);
}

TEST(InterferenceScene, MissingProductIsEmptyAndItsTextIsKept) {
  const InterferenceScene scene = Scene(ProductText("gone") + ProductText(kRod));
  EXPECT_TRUE(scene.products[0].IsNull());
  EXPECT_TRUE(scene.paths[0] == "gone");
  EXPECT_FALSE(scene.products[1].IsNull());
}

TEST(InterferenceScene, AliasIsThePathWhereTheIdentifierIsNone) {
  const InterferenceScene scene =
      Scene("<Product DescriptionID='A1B2' Alias='" + std::string(kNut) + "'/>");
  EXPECT_FALSE(scene.products[0].IsNull());
  EXPECT_TRUE(scene.paths[0] == kNut);
}

TEST(InterferenceScene, InterferenceWithoutProductsHasNone) {
  const InterferenceScene scene = Scene("");
  EXPECT_TRUE(scene.products[0].IsNull());
  EXPECT_TRUE(scene.products[1].IsNull());
  EXPECT_FALSE(scene.interference.IsNull());
}

TEST(InterferenceScene, StandingProductIsTheModelsInAllElse) {
  const InterferenceScene scene = Scene(ProductText(kNut) + ProductText(kRod));
  EXPECT_TRUE(ZORIAlias_var(scene.products[0])->GetAlias() == "nut_1");
  EXPECT_EQ(Product("rod-assembly_1"), scene.products[0]->GetFatherProduct());
  EXPECT_EQ(Facts(Product(kNut)).part, Facts(scene.products[0]).part);
}

unsigned int ImposedRed(const ZORIProduct_var& inProduct) {
  ZORVisPropertiesValues values;
  unsigned int flag = 0, red = 999, green = 0, blue = 0;
  EXPECT_EQ(S_OK, ZORIVisProperties_var(inProduct)->GetPropertiesAtt(values, 11, 5));
  if (FAILED(values.GetInheritance(0, flag)) || flag == 0) return 999;
  values.GetColor(red, green, blue);
  return red;
}

TEST(InterferenceScene, ProductsOfDifferentColoursKeepThem) {
  const InterferenceScene scene = NutAndRod();
  EXPECT_EQ(999u, ImposedRed(scene.products[0]));
  EXPECT_EQ(999u, ImposedRed(scene.products[1]));
}

TEST(InterferenceScene, SecondProductOfTheSameColourIsShownInAnother) {
  const InterferenceScene scene =
      Scene(ProductText(kNut) + ProductText("rod-assembly_1 --++-- nut_2"));
  EXPECT_EQ(999u, ImposedRed(scene.products[0]));
  EXPECT_NE(999u, ImposedRed(scene.products[1]));
  EXPECT_EQ(999u, ImposedRed(Product("rod-assembly_1 --++-- nut_2")));
}

TEST(InterferenceScene, EverythingEndsWithItsHandles) {
  const auto alive = [](const char* inClass) {
    const ZORDefault::ObjectCounts counts = ZORDefault::CountsOf(inClass);
    return counts.built - counts.released;
  };
  const long products = alive("StandingProduct"), interferences = alive("Interference");
  const long bags = alive("ZOR3DBagRep"), built = ZORDefault::CountsOf("StandingProduct").built;
  { const InterferenceScene scene = Scene(ProductText(kNut) + ProductText(kRod)); }
  EXPECT_EQ(2, ZORDefault::CountsOf("StandingProduct").built - built);
  EXPECT_EQ(products, alive("StandingProduct"));
  EXPECT_EQ(interferences, alive("Interference"));
  EXPECT_EQ(bags, alive("ZOR3DBagRep"));
}

}  // namespace
