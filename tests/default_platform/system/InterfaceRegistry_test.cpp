#include "default_platform/system/InterfaceRegistry.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "platform/knowledge/ZORParmDictionary.h"
#include "support/KnownInterfaces.h"

using support::InterfacesOf;
using support::KnownInterfaces;
using testing::ElementsAre;
using ZORDefault::FindInterface;
using ZORDefault::IdentifierOfName;

namespace {

/// A component that is a product and has an alias.
class Sample final : public ZORDefault::FacetedComponent {
 public:
  struct ProductFacet : ZORDefault::Facet<ZORIProduct> {
    using Facet::Facet;
    ZORListValZORBaseUnknown_var* GetChildren(const char*) override { return nullptr; }
    ZORIProduct_var GetFatherProduct() override { return {}; }
  };
  struct AliasFacet : ZORDefault::Facet<ZORIAlias> {
    using Facet::Facet;
    ZORUnicodeString GetAlias() override { return "alias"; }
  };

  ZORBaseUnknown* FindFacet(const IID& inInterface) override {
    if (inInterface == ZORBaseUnknown::ClassId() || inInterface == ZORIProduct::ClassId())
      return &product;
    return inInterface == ZORIAlias::ClassId() ? &alias : nullptr;
  }
  ZORMetaClass* GetClass() const override { return ZORBaseUnknown::MetaObject(); }
  unsigned int AddReference() override { return ++references; }
  unsigned int ReleaseReference() override { return --references; }

  ProductFacet product{*this};
  AliasFacet alias{*this};
  unsigned int references = 1;
};

}  // namespace

TEST(InterfaceRegistry, KnowsEveryInterfaceByNameAndIdentifier) {
  for (const auto& [name, identifier] : KnownInterfaces()) {
    ASSERT_NE(FindInterface(name), nullptr) << name;
    EXPECT_TRUE(*FindInterface(name) == identifier) << name;
    EXPECT_TRUE(IdentifierOfName(name) == identifier) << name;
  }
}

TEST(InterfaceRegistry, DoesNotKnowOtherNames) {
  EXPECT_EQ(FindInterface("ZORINothing"), nullptr);
  EXPECT_EQ(FindInterface(""), nullptr);
  EXPECT_EQ(FindInterface(nullptr), nullptr);
}

TEST(InterfaceRegistry, ClassThatImplementsIsNoInterface) {
  fct_RetrieveMetaObject("ZORSampleClass", kZORTypeImplementation, nullptr, nullptr, nullptr, 1);
  EXPECT_EQ(FindInterface("ZORSampleClass"), nullptr);
}

TEST(InterfaceRegistry, RegisteredInterfaceIsKnownFromThenOn) {
  EXPECT_EQ(FindInterface("ZORISample"), nullptr);
  const IID& identifier = ZORDefault::RegisterInterface("ZORISample", "Test");
  EXPECT_EQ(FindInterface("ZORISample"), &identifier);
  EXPECT_EQ(&ZORDefault::RegisterInterface("ZORISample", "Test"), &identifier);
}

TEST(Facet, LeadsToTheOthersByIdentifierAndName) {
  Sample sample;
  EXPECT_THAT(InterfacesOf(sample.product),
              ElementsAre("ZORBaseUnknown", "ZORIAlias", "ZORIProduct"));
  EXPECT_THAT(InterfacesOf(sample.alias),
              ElementsAre("ZORBaseUnknown", "ZORIAlias", "ZORIProduct"));
  EXPECT_EQ(sample.references, 1U);
}

TEST(Facet, QueryCountsAReference) {
  Sample sample;
  void* found = nullptr;
  EXPECT_EQ(sample.product.QueryInterface("ZORIAlias", &found), S_OK);
  EXPECT_EQ(found, &sample.alias);
  EXPECT_EQ(sample.references, 2U);
}

TEST(Facet, QueryForAnUnknownInterfaceGivesNull) {
  Sample sample;
  void* found = &found;
  EXPECT_EQ(sample.product.QueryInterface("ZORINothing", &found), E_NOINTERFACE);
  EXPECT_EQ(found, nullptr);
  EXPECT_EQ(sample.product.QueryInterface("ZORIAlias", nullptr), E_INVALIDARG);
  EXPECT_EQ(sample.product.QueryInterface(static_cast<const char*>(nullptr), &found),
            E_NOINTERFACE);
}

TEST(Facet, IsOneObjectWithTheOthers) {
  Sample sample;
  EXPECT_EQ(sample.product.IsEqual(&sample.alias), 1);
  EXPECT_EQ(sample.product.GetImpl(), sample.alias.GetImpl());
}

TEST(Interfaces, OfMagnitudesAndUnitsAreFoundByName) {
  const ZORICkeMagnitude_var length = ZORParmDictionary::FindMagnitude("LENGTH");
  EXPECT_THAT(InterfacesOf(*length.GetInterface()),
              ElementsAre("ZORBaseUnknown", "ZORICkeMagnitude"));
  EXPECT_THAT(InterfacesOf(*length->Unit().GetInterface()),
              ElementsAre("ZORBaseUnknown", "ZORICkeUnit"));
}
