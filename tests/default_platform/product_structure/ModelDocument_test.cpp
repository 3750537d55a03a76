#include <gtest/gtest.h>

#include "default_platform/product_structure/OpenedModels.h"
#include "default_platform/system/ObjectCounters.h"
#include "platform/product_structure/ZORIAlias.h"
#include "platform/product_structure/ZORILinkableObject.h"
#include "platform/product_structure/ZORIProviders.h"

using ZORDefault::CountsOf;

namespace {
ZORDefault::OpenedModel OpenSample() {
  return products::OpenAnew(products::Sample("as1-oc-214.stp"));
}

long Living(const char* inClassName) {
  const auto counts = CountsOf(inClassName);
  return counts.built - counts.released;
}
}  // namespace

TEST(ModelDocument, EndsWithItsLastHandle) {
  const long documents = Living("ModelDocument"), products = Living("Product");
  {
    const auto model = OpenSample();
    EXPECT_EQ(Living("ModelDocument"), documents + 1);
    EXPECT_EQ(Living("Product"), products + 28);  // 18 leaves, 9 assemblies, the root
  }
  EXPECT_EQ(Living("ModelDocument"), documents);
  EXPECT_EQ(Living("Product"), products);
}

TEST(ModelDocument, HandleOnOneProductKeepsTheWholeTree) {
  const long documents = Living("ModelDocument");
  {
    ZORIAlias_var leaf;
    {
      const auto model = OpenSample();
      leaf = products::Leaves(model.root).back();
    }
    EXPECT_EQ(Living("ModelDocument"), documents + 1);
    const ZORIProduct_var product = leaf;
    EXPECT_STREQ(leaf->GetAlias().ConvertToChar(), "l-bracket_1");
    EXPECT_EQ(products::AliasOf(product->GetFatherProduct()), "l-bracket-assembly_2");
  }
  EXPECT_EQ(Living("ModelDocument"), documents);
}

TEST(ModelDocument, AnswersProviders) {
  const auto model = OpenSample();
  EXPECT_FALSE(ZORIProviders_var(model.document).IsNull());
  EXPECT_TRUE(ZORIProduct_var(model.document).IsNull());
  EXPECT_STREQ(model.document->IsA(), "ZORModelDocument");
}

TEST(ModelDocument, ProviderIsKeptUntilTheEnd) {
  auto* const provider = new ZORBaseUnknown();
  {
    const auto model = OpenSample();
    EXPECT_EQ(ZORIProviders_var(model.document)->AddProvider(ZORIAlias::ClassId(), provider), S_OK);
    EXPECT_EQ(provider->AddRef(), 3u);
    provider->Release();
  }
  EXPECT_EQ(provider->Release(), 0u);
}

TEST(ModelDocument, ProviderIsTakenOnceForAnInterface) {
  ZORBaseUnknown provider;  // must outlive the document, which keeps it
  const auto model = OpenSample();
  const ZORIProviders_var providers = model.document;
  EXPECT_EQ(providers->AddProvider(ZORIAlias::ClassId(), &provider), S_OK);
  EXPECT_EQ(providers->AddProvider(ZORIAlias::ClassId(), &provider), E_FAIL);
  EXPECT_EQ(providers->AddProvider(ZORIProduct::ClassId(), &provider), S_OK);
}

TEST(ModelDocument, NullProviderIsRefused) {
  const auto model = OpenSample();
  EXPECT_EQ(ZORIProviders_var(model.document)->AddProvider(ZORIAlias::ClassId(), nullptr),
            E_INVALIDARG);
}

TEST(ModelDocument, ProviderOfItsOwnTreeDoesNotKeepItAlive) {
  const long documents = Living("ModelDocument");
  {
    const auto model = OpenSample();
    const ZORIProviders_var providers = model.document;
    EXPECT_EQ(providers->AddProvider(ZORIAlias::ClassId(), model.root.GetInterface()), S_OK);
    EXPECT_EQ(providers->AddProvider(ZORIAlias::ClassId(), model.root.GetInterface()), E_FAIL);
  }
  EXPECT_EQ(Living("ModelDocument"), documents);
}
