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
using ZORDefault::SceneProduct;

ZORMathVector TranslationOf(const ZORIProduct_var& inProduct) {
  return ZORDefault::CollectMeshInstances(*RepOf(inProduct)).front().rootFromPart.GetVector();
}
void ExpectAt(const ZORMathVector& inExpected, const ZORIProduct_var& inProduct) {
  const ZORMathVector found = TranslationOf(inProduct);
  EXPECT_NEAR(inExpected.x, found.x, 1e-9);
  EXPECT_NEAR(inExpected.y, found.y, 1e-9);
  EXPECT_NEAR(inExpected.z, found.z, 1e-9);
}
InterferenceScene Scene(const char* inFirst, const char* inSecond) {
  return MakeInterferenceScene(
      At({}), {SceneProduct{Product(inFirst), Moved()}, {Product(inSecond), Moved()}});
}

TEST(InterferenceScene, ProductsArePlacedAsGiven) {
  const InterferenceScene scene = Scene(kNut, kRod);
  ExpectAt({1, 2, 3}, scene.products[0]);
  ExpectAt({1, 2, 3}, scene.products[1]);
}

TEST(InterferenceScene, PartsOfAnAssemblyMoveWithIt) {
  const ZORIProduct_var assembly = Product("rod-assembly_1");
  const InterferenceScene scene = Scene("rod-assembly_1", kRod);
  const auto before = ZORDefault::CollectMeshInstances(*RepOf(assembly));
  const auto after = ZORDefault::CollectMeshInstances(*RepOf(scene.products[0]));
  ASSERT_EQ(3u, before.size());
  ASSERT_EQ(3u, after.size());
  // The same point of the assembly, seen from each part.
  const ZORMathTransformation model = Info(assembly).rootFromProduct;
  const ZORMathVector inAssembly(5, 6, 7);
  const ZORMathVector moved = Moved() * inAssembly, stood = model * inAssembly;
  for (std::size_t i = 0; i < 3; ++i) {
    const ZORMathVector a = before[i].rootFromPart.GetVector(),
                        b = after[i].rootFromPart.GetVector();
    const double was = std::hypot(a.x - stood.x, a.y - stood.y, a.z - stood.z);
    const double is = std::hypot(b.x - moved.x, b.y - moved.y, b.z - moved.z);
    EXPECT_NEAR(was, is, 1e-9);
  }
}

TEST(InterferenceScene, WithoutPlacementsProductsArePlacedAsInTheModel) {
  const InterferenceScene scene = NutAndRod();
  ExpectAt(Info(Product(kNut)).rootFromProduct.GetVector(), scene.products[0]);
  ExpectAt(Info(Product(kRod)).rootFromProduct.GetVector(), scene.products[1]);
}

TEST(InterferenceScene, MissingProductIsEmpty) {
  const InterferenceScene scene = Scene("gone", kRod);
  EXPECT_TRUE(scene.products[0].IsNull());
  EXPECT_FALSE(scene.products[1].IsNull());
  EXPECT_FALSE(scene.interference.IsNull());
}

TEST(InterferenceScene, PlacedProductIsTheModelsInAllElse) {
  const InterferenceScene scene = Scene(kNut, kRod);
  EXPECT_TRUE(ZORIAlias_var(scene.products[0])->GetAlias() == "nut_1");
  EXPECT_EQ(Product("rod-assembly_1"), scene.products[0]->GetFatherProduct());
  EXPECT_EQ(Info(Product(kNut)).part, Info(scene.products[0]).part);
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
  const InterferenceScene scene = Scene(kNut, "rod-assembly_1 --++-- nut_2");
  EXPECT_EQ(999u, ImposedRed(scene.products[0]));
  EXPECT_NE(999u, ImposedRed(scene.products[1]));
  EXPECT_EQ(999u, ImposedRed(Product("rod-assembly_1 --++-- nut_2")));
}

TEST(InterferenceScene, ColoursThatAreGivenAreTaken) {
  ZORDefault::SceneColours colours;
  colours.imposedOnSecond = {1, 2, 3, 255};
  const InterferenceScene scene = MakeInterferenceScene(
      At({}), {SceneProduct{Product(kNut), {}}, {Product(kRod), {}}}, colours);
  EXPECT_EQ(1u, ImposedRed(scene.products[1]));
}

TEST(InterferenceScene, ColoursOfMissingProductsAreThoseOfMarkersAlone) {
  const ZORDefault::SceneColours colours = ZORDefault::ChooseColours({});
  EXPECT_FALSE(colours.imposedOnSecond);
  EXPECT_EQ(255, colours.markers[3]);
}

TEST(InterferenceScene, EverythingEndsWithItsHandles) {
  const auto alive = [](const char* inClass) {
    const ZORDefault::ObjectCounts counts = ZORDefault::CountsOf(inClass);
    return counts.built - counts.released;
  };
  const long products = alive("PlacedProduct"), interferences = alive("Interference");
  const long bags = alive("ZOR3DBagRep"), built = ZORDefault::CountsOf("PlacedProduct").built;
  { const InterferenceScene scene = Scene(kNut, kRod); }
  EXPECT_EQ(2, ZORDefault::CountsOf("PlacedProduct").built - built);
  EXPECT_EQ(products, alive("PlacedProduct"));
  EXPECT_EQ(interferences, alive("Interference"));
  EXPECT_EQ(bags, alive("ZOR3DBagRep"));
}

}  // namespace
