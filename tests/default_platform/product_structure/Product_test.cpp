#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "default_platform/PartMesh.h"
#include "default_platform/product_structure/OpenedModels.h"
#include "default_platform/visualisation/SceneGraph.h"
#include "platform/product_structure/ZORIAlias.h"
#include "platform/product_structure/ZORILinkableObject.h"
#include "platform/product_structure/ZORIProductInSession.h"
#include "platform/product_structure/ZORIProviders.h"
#include "platform/product_structure/ZORISpecObject.h"
#include "platform/visualisation/ZOR3DBagRep.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"
#include "platform/visualisation/ZORIVisProperties.h"

using products::ChildrenOf;
using products::FactsOf;
using products::FindByAliasPath;
using testing::DoubleNear;

namespace {
/// The assembly of a plate, brackets, a rod, bolts and nuts.
class Product : public testing::Test {
 protected:
  static void SetUpTestSuite() {
    model_ = new ZORDefault::OpenedModel(products::OpenAnew(products::Sample("as1-oc-214.stp")));
  }
  static void TearDownTestSuite() { delete model_; }
  static ZORIProduct_var Root() { return model_->root; }
  static ZORIProduct_var Find(const std::string& inPath) {
    return FindByAliasPath(model_->root, inPath);
  }
  static ZORIProduct_var Nut() { return Find("rod-assembly_1 --++-- nut_1"); }
  static ZORIProduct_var RodAssembly() { return Find("rod-assembly_1"); }

  static ZORDefault::OpenedModel* model_;
};
ZORDefault::OpenedModel* Product::model_ = nullptr;
}  // namespace

TEST_F(Product, ChildrenStandInTheFilesOrder) {
  std::vector<std::string> names;
  for (const auto& child : ChildrenOf(Root())) names.push_back(products::AliasOf(child));
  EXPECT_THAT(names, testing::ElementsAre("rod-assembly_1", "l-bracket-assembly_1", "plate_1",
                                          "l-bracket-assembly_2"));
}

TEST_F(Product, ChildrenOfALeafAreAnEmptyList) {
  const std::unique_ptr<ZORListValZORBaseUnknown_var> list(Nut()->GetChildren("ZORIProduct"));
  ASSERT_NE(list, nullptr);
  EXPECT_EQ(list->Size(), 0);
}

TEST_F(Product, ChildrenForAnUnknownInterfaceAreNull) {
  EXPECT_EQ(Root()->GetChildren("ZORINothing"), nullptr);
  EXPECT_EQ(Root()->GetChildren(nullptr), nullptr);
}

TEST_F(Product, ChildrenForAnInterfaceOfDocumentsAreAnEmptyList) {
  const std::unique_ptr<ZORListValZORBaseUnknown_var> list(Root()->GetChildren("ZORIProviders"));
  ASSERT_NE(list, nullptr);
  EXPECT_EQ(list->Size(), 0);
}

TEST_F(Product, ChildrenForAnotherInterfaceOfferIt) {
  const std::unique_ptr<ZORListValZORBaseUnknown_var> list(Root()->GetChildren("ZORIAlias"));
  ASSERT_EQ(list->Size(), 4);
  EXPECT_STREQ(ZORIAlias_var((*list)[3])->GetAlias().ConvertToChar(), "plate_1");
}

TEST_F(Product, FatherOfTheRootIsEmpty) {
  EXPECT_TRUE(Root()->GetFatherProduct().IsNull());
  EXPECT_EQ(ZORISpecObject_var(Root())->GetFather(), nullptr);
}

TEST_F(Product, FatherOfAChildIsItsProduct) {
  EXPECT_TRUE(Nut()->GetFatherProduct() == RodAssembly());
  ZORISpecObject* const father = ZORISpecObject_var(Nut())->GetFather();
  ASSERT_NE(father, nullptr);
  EXPECT_TRUE(ZORIProduct_var(ZORISpecObject_var(father)) == RodAssembly());
  father->Release();
}

TEST_F(Product, QueryReachesEveryInterfaceFromEveryOther) {
  const ZORBaseUnknown_var facets[] = {
      ZORIProduct_var(Nut()),       ZORIProductInSession_var(Nut()), ZORIAlias_var(Nut()),
      ZORISpecObject_var(Nut()),    ZORILinkableObject_var(Nut()),   ZORI3DGeoVisu_var(Nut()),
      ZORIVisProperties_var(Nut()), ZORBaseUnknown_var(Nut())};
  for (const ZORBaseUnknown_var& facet : facets) {
    ASSERT_FALSE(facet.IsNull());
    for (const char* name :
         {"ZORIProduct", "ZORIProductInSession", "ZORIAlias", "ZORISpecObject",
          "ZORILinkableObject", "ZORI3DGeoVisu", "ZORIVisProperties", "ZORBaseUnknown"}) {
      void* found = nullptr;
      ASSERT_EQ(facet->QueryInterface(name, &found), S_OK) << name;
      auto* const interface = static_cast<ZORBaseUnknown*>(found);
      EXPECT_EQ(interface->IsEqual(facet.GetInterface()), 1) << name;
      interface->Release();
    }
  }
}

TEST_F(Product, QueryForAnInterfaceOfDocumentsIsRefused) {
  void* found = &found;
  EXPECT_EQ(Nut()->QueryInterface(ZORIProviders::ClassId(), &found), E_NOINTERFACE);
  EXPECT_EQ(found, nullptr);
  EXPECT_EQ(Nut()->QueryInterface("ZORINothing", &found), E_NOINTERFACE);
  EXPECT_EQ(Nut()->QueryInterface(ZORIAlias::ClassId(), nullptr), E_INVALIDARG);
}

TEST_F(Product, OtherInstancesOfThePartAreOtherProducts) {
  EXPECT_EQ(Nut()->IsEqual(Find("rod-assembly_1 --++-- nut_2").GetInterface()), 0);
}

TEST_F(Product, InstancesShareOneMesh) {
  EXPECT_NE(FactsOf(Nut()).mesh, nullptr);
  EXPECT_EQ(FactsOf(Nut()).mesh,
            FactsOf(Find("l-bracket-assembly_2 --++-- nut-bolt-assembly_3 --++-- nut_3")).mesh);
  EXPECT_EQ(FactsOf(Nut()).part, FactsOf(Find("rod-assembly_1 --++-- nut_2")).part);
}

TEST_F(Product, ClassIsNamed) {
  EXPECT_STREQ(Nut()->IsA(), "ZORModelProduct");
  EXPECT_EQ(ZORIAlias_var(Nut())->IsAKindOf("ZORBaseUnknown"), 1);
}

TEST_F(Product, FactsTellNamesAndPlacements) {
  const auto facts = FactsOf(Nut());
  EXPECT_STREQ(facts.alias.ConvertToChar(), "nut_1");
  EXPECT_STREQ(facts.partName.ConvertToChar(), "nut");
  EXPECT_FALSE(facts.isAssembly);
  EXPECT_NEAR(facts.rootFromProduct.GetVector().x, 175, 1e-6);
  EXPECT_NEAR(facts.parentFromProduct.GetVector().x, -10, 1e-6);
  EXPECT_GT(facts.triangles, 100u);
  EXPECT_FALSE(facts.failedToTessellate);
}

TEST_F(Product, FactsOfAForeignProductAreRefused) {
  ZORDefault::ProductInfo facts;
  facts.triangles = 5;
  EXPECT_FALSE(ZORDefault::GetProductInfo(nullptr, facts));
  EXPECT_EQ(facts.triangles, 5u);
}

TEST_F(Product, RepresentationNameOfALeafIsItsParts) {
  int state = 7;
  ZORUnicodeString name;
  EXPECT_EQ(ZORIProductInSession_var(Nut())->GetRepresentationName(state, 1, name), S_OK);
  EXPECT_EQ(state, 1);
  EXPECT_STREQ(name.ConvertToChar(), "nut");
}

TEST_F(Product, RepresentationNameOfAnAssemblyIsEmpty) {
  int state = 7;
  ZORUnicodeString name("old");
  EXPECT_EQ(ZORIProductInSession_var(Root())->GetRepresentationName(state, 1, name), S_OK);
  EXPECT_EQ(state, 0);
  EXPECT_EQ(name.GetLengthInChar(), 0);
}

TEST_F(Product, RepresentationOfALeafIsAHandle) {
  int state = 0;
  ZORBaseUnknown_var rep;
  EXPECT_EQ(ZORIProductInSession_var(Nut())->GetRepresentation(state, 1, rep), S_OK);
  EXPECT_EQ(state, 1);
  EXPECT_FALSE(ZORI3DGeoVisu_var(rep).IsNull());
}

TEST_F(Product, RepresentationOfAnAssemblyFails) {
  int state = 0;
  ZORBaseUnknown_var rep(Nut());
  EXPECT_EQ(ZORIProductInSession_var(Root())->GetRepresentation(state, 1, rep), E_FAIL);
  EXPECT_TRUE(rep.IsNull());
}

TEST_F(Product, RepresentationForAnotherSelectorIsRefused) {
  int state = 0;
  ZORUnicodeString name;
  ZORBaseUnknown_var rep;
  EXPECT_EQ(ZORIProductInSession_var(Nut())->GetRepresentationName(state, 2, name), E_INVALIDARG);
  EXPECT_EQ(ZORIProductInSession_var(Nut())->GetRepresentation(state, 0, rep), E_INVALIDARG);
}

TEST_F(Product, DocumentIsTheModels) {
  ZORDocument* const document = ZORILinkableObject_var(Nut())->GetDocument();
  ASSERT_NE(document, nullptr);
  EXPECT_TRUE(ZORDocument_var(document) == model_->document);
}

TEST_F(Product, RepOfALeafIsItsPlacedMesh) {
  const auto* const rep = dynamic_cast<PlacedMeshRep*>(ZORI3DGeoVisu_var(Nut())->GetRep());
  ASSERT_NE(rep, nullptr);
  EXPECT_EQ(rep->GetMesh(), FactsOf(Nut()).mesh);
  EXPECT_NEAR(rep->GetRootFromPart().GetVector().x, 175, 1e-6);
  unsigned int colour[4];
  rep->GetColorRGBA(colour);
  EXPECT_THAT(colour, testing::ElementsAre(255, 0, 0, 255));
}

TEST_F(Product, RepIsMadeOnce) {
  EXPECT_EQ(ZORI3DGeoVisu_var(Nut())->GetRep(), ZORI3DGeoVisu_var(Nut())->GetRep());
}

TEST_F(Product, RepOfAnAssemblyHoldsItsChildren) {
  const auto* const bag = dynamic_cast<ZOR3DBagRep*>(ZORI3DGeoVisu_var(RodAssembly())->GetRep());
  ASSERT_NE(bag, nullptr);
  ASSERT_EQ(bag->GetChildren().size(), 3u);
  EXPECT_EQ(bag->GetChildren()[0], ZORI3DGeoVisu_var(Nut())->GetRep());
}

TEST_F(Product, RepOfTheRootSpansTheModel) {
  const auto* const rep = dynamic_cast<ZOR3DRep*>(ZORI3DGeoVisu_var(Root())->GetRep());
  ASSERT_NE(rep, nullptr);
  const ZOR3DBoundingSphere sphere = rep->GetShowBoundingElement();
  EXPECT_NEAR(sphere.centre.y, 75, 5);
  EXPECT_NEAR(sphere.radius, 125, 15);
}

TEST_F(Product, ColourOfAPartIsNotImposed) {
  ZORVisPropertiesValues values;
  ASSERT_EQ(ZORIVisProperties_var(Nut())->GetPropertiesAtt(values, 11, 5), S_OK);
  unsigned int flag = 9, red = 0, green = 0, blue = 9;
  EXPECT_EQ(values.GetInheritance(ZORVisPropertiesValues::kColour, flag), S_OK);
  EXPECT_EQ(flag, 0u);
  EXPECT_EQ(values.GetColor(red, green, blue), S_OK);
  EXPECT_EQ(red, 255u);
  EXPECT_EQ(blue, 0u);
}

TEST_F(Product, ColourOfAnAssemblyIsNotSet) {
  ZORVisPropertiesValues values;
  ASSERT_EQ(ZORIVisProperties_var(Root())->GetPropertiesAtt(values, 11, 5), S_OK);
  unsigned int flag = 9, red = 1, green = 2, blue = 3;
  EXPECT_EQ(values.GetInheritance(ZORVisPropertiesValues::kColour, flag), E_FAIL);
  EXPECT_EQ(values.GetColor(red, green, blue), E_FAIL);
  EXPECT_EQ(values.GetInheritance(1, flag), E_INVALIDARG);
}

TEST_F(Product, PropertiesForOtherSelectorsAreRefused) {
  ZORVisPropertiesValues values;
  EXPECT_EQ(ZORIVisProperties_var(Nut())->GetPropertiesAtt(values, 10, 5), E_INVALIDARG);
  EXPECT_EQ(ZORIVisProperties_var(Nut())->GetPropertiesAtt(values, 11, 4), E_INVALIDARG);
}

TEST_F(Product, ColourSetInTheSessionIsShown) {
  const auto plate = Find("plate_1");
  ZORVisPropertiesValues values;
  values.SetColor(1, 2, 3);
  values.SetInheritance(ZORVisPropertiesValues::kColour, 1);
  ASSERT_EQ(ZORIVisProperties_var(plate)->SetPropertiesAtt(values), S_OK);
  ZORVisPropertiesValues read;
  ASSERT_EQ(ZORIVisProperties_var(plate)->GetPropertiesAtt(read, 11, 5), S_OK);
  unsigned int flag = 0, colour[4];
  EXPECT_EQ(read.GetInheritance(ZORVisPropertiesValues::kColour, flag), S_OK);
  EXPECT_EQ(flag, 1u);
  const ZORRep* const rep = ZORI3DGeoVisu_var(plate)->GetRep();
  rep->GetColorRGBA(colour);
  EXPECT_THAT(colour, testing::ElementsAre(1, 2, 3, 255));
  EXPECT_EQ(rep->GetInheritanceMode(), ZORRep::kImposeColour | ZORRep::kOwnColour);
}

TEST(NewVisuMode, IsNewUnlessSwitchedOff) {
  EXPECT_EQ(ZORPrdNewVisuMode(), 1);
  const support::ScopedVariable old("ZOR_NEW_VISU_MODE", "0");
  EXPECT_EQ(ZORPrdNewVisuMode(), 0);
}

TEST_F(Product, FindProductFollowsAliases) {
  EXPECT_TRUE(ZORDefault::FindProduct(Root(), "rod-assembly_1 --++-- nut_1") == Nut());
  EXPECT_TRUE(ZORDefault::FindProduct(Root(), "rod-assembly_1") == RodAssembly());
  EXPECT_TRUE(ZORDefault::FindProduct(RodAssembly(), "nut_1") == Nut());
}

TEST_F(Product, FindProductAnswersNothingForAnotherPath) {
  for (const char* path : {"", "as1", "nut_1", "rod-assembly_1 --++-- ", "rod-assembly_1 --++-- x",
                           "rod-assembly_1--++--nut_1", "=>[0:1:1:2]"})
    EXPECT_TRUE(ZORDefault::FindProduct(Root(), path).IsNull()) << path;
  EXPECT_TRUE(ZORDefault::FindProduct(ZORIProduct_var(), "nut_1").IsNull());
}
