// Product trees and providers of a real assembly.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "ZORLyraGeneralServices.h"
#include "default_platform/OpenModel.h"
#include "default_platform/system/ObjectCounters.h"
#include "platform/product_structure/ZORIAlias.h"
#include "platform/product_structure/ZORIProviders.h"
#include "support/ScopedVariable.h"

namespace {

class ProductsOfModels : public testing::Test {
 protected:
  static ZORDefault::OpenedModel OpenSample() {
    ZORDefault::ModelOptions options;
    options.useCache = false;
    return ZORDefault::OpenModel(ZOR_SOURCE_DIR "/samples/as1-oc-214.stp", options);
  }
  /// Opened once for all tests of this program.
  static void SetUpTestSuite() { model = new ZORDefault::OpenedModel(OpenSample()); }
  static void TearDownTestSuite() {
    delete model;
    model = nullptr;
    const ZORDefault::ObjectCounts documents = ZORDefault::CountsOf("ModelDocument");
    EXPECT_EQ(1, documents.built);
    EXPECT_EQ(1, documents.released);
  }

  static std::vector<std::string> ExpandedPaths() {
    ZORListValZORBaseUnknown_var list;
    ZORLyraGeneralServices::Expand(model->root.GetInterface(), list);
    std::vector<std::string> paths;
    for (int i = 1; i <= list.Size(); ++i)
      paths.push_back(ZORLyraGeneralServices::GetPathRoot(list[i]).ConvertToChar());
    return paths;
  }
  static ZORBaseUnknown_var FirstProduct() {
    ZORListValZORBaseUnknown_var list;
    ZORLyraGeneralServices::Expand(model->root.GetInterface(), list);
    return list[1];
  }

  static ZORDefault::OpenedModel* model;
};

ZORDefault::OpenedModel* ProductsOfModels::model = nullptr;

/// As the file's usages of products have it, assembly by assembly.
const std::vector<std::string> kPaths = {
    "rod-assembly_1 --++-- nut_1",
    "rod-assembly_1 --++-- nut_2",
    "rod-assembly_1 --++-- rod_1",
    "l-bracket-assembly_1 --++-- nut-bolt-assembly_1 --++-- bolt_1",
    "l-bracket-assembly_1 --++-- nut-bolt-assembly_1 --++-- nut_3",
    "l-bracket-assembly_1 --++-- nut-bolt-assembly_2 --++-- bolt_1",
    "l-bracket-assembly_1 --++-- nut-bolt-assembly_2 --++-- nut_3",
    "l-bracket-assembly_1 --++-- nut-bolt-assembly_3 --++-- bolt_1",
    "l-bracket-assembly_1 --++-- nut-bolt-assembly_3 --++-- nut_3",
    "l-bracket-assembly_1 --++-- l-bracket_1",
    "plate_1",
    "l-bracket-assembly_2 --++-- nut-bolt-assembly_1 --++-- bolt_1",
    "l-bracket-assembly_2 --++-- nut-bolt-assembly_1 --++-- nut_3",
    "l-bracket-assembly_2 --++-- nut-bolt-assembly_2 --++-- bolt_1",
    "l-bracket-assembly_2 --++-- nut-bolt-assembly_2 --++-- nut_3",
    "l-bracket-assembly_2 --++-- nut-bolt-assembly_3 --++-- bolt_1",
    "l-bracket-assembly_2 --++-- nut-bolt-assembly_3 --++-- nut_3",
    "l-bracket-assembly_2 --++-- l-bracket_1",
};

TEST_F(ProductsOfModels, ExpandListsThePartsInTheOrderOfTheTree) {
  EXPECT_EQ(kPaths, ExpandedPaths());
}

TEST_F(ProductsOfModels, ExpandListsTheSameInTheOldVisualisationMode) {
  const support::ScopedVariable mode("ZOR_NEW_VISU_MODE", "0");
  EXPECT_EQ(kPaths, ExpandedPaths());
}

TEST_F(ProductsOfModels, GetPathRootOfTheRootIsEmpty) {
  EXPECT_EQ("as1", std::string(ZORIAlias_var(model->root)->GetAlias().ConvertToChar()));
  EXPECT_EQ(0, ZORLyraGeneralServices::GetPathRoot(model->root).GetLengthInChar());
}

TEST_F(ProductsOfModels, RegisterProviderTakesAProviderForAnInterfaceOnce) {
  ZORBaseUnknown_var provider = FirstProduct();
  ZORDocument* const document = model->document.GetInterface();
  EXPECT_EQ(S_OK,
            ZORLyraGeneralServices::RegisterProvider(ZORIAlias::ClassId(), provider, document));
  EXPECT_EQ(E_FAIL,
            ZORLyraGeneralServices::RegisterProvider(ZORIAlias::ClassId(), provider, document));
  EXPECT_EQ(S_OK,
            ZORLyraGeneralServices::RegisterProvider(ZORIProduct::ClassId(), provider, document));
}

TEST_F(ProductsOfModels, RegisterProviderFindsTheDocumentOfAProduct) {
  ZORBaseUnknown_var provider = ZORBaseUnknown_var(model->root);
  EXPECT_EQ(S_OK,
            ZORLyraGeneralServices::RegisterProvider(ZORIAlias::ClassId(), provider, nullptr));
  // It is there now, so the document was found.
  EXPECT_EQ(E_FAIL, ZORLyraGeneralServices::RegisterProvider(ZORIAlias::ClassId(), provider,
                                                             model->document.GetInterface()));
}

TEST_F(ProductsOfModels, RegisterProviderRefusesAnInterfaceThatAProductLacks) {
  ZORBaseUnknown_var provider = FirstProduct();
  EXPECT_EQ(E_FAIL, ZORLyraGeneralServices::RegisterProvider(ZORIProviders::ClassId(), provider,
                                                             model->document.GetInterface()));
}

TEST_F(ProductsOfModels, RegisterProviderRefusesAProviderThatIsInNoDocument) {
  ZORBaseUnknown_var provider = ZORBaseUnknown_var(model->document);
  EXPECT_EQ(E_FAIL,
            ZORLyraGeneralServices::RegisterProvider(ZORIProviders::ClassId(), provider, nullptr));
}

}  // namespace
