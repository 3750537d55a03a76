#include "pictures/ProductList.h"

#include <gtest/gtest.h>

#include <string>

#include "general_services/FakeComponent.h"

namespace {

std::string released;

/// Writes its name down when its last reference goes.
class NamedProduct : public FakeComponent {
 public:
  explicit NamedProduct(char inName) : name_(inName) {}
  ZORIProduct_var Handle() { return ZORIProduct_var(&facet_); }

 private:
  class ProductFacet : public FakeFacet<ZORIProduct> {
   public:
    explicit ProductFacet(NamedProduct& inSelf) : FakeFacet(inSelf), self_(inSelf) {}
    unsigned int Release() override {
      const unsigned int left = FakeFacet::Release();
      if (left == 0) released += self_.name_;
      return left;
    }
    ZORListValZORBaseUnknown_var* GetChildren(const char*) override { return nullptr; }
    ZORIProduct_var GetFatherProduct() override { return {}; }

   private:
    NamedProduct& self_;
  };

  char name_;
  ProductFacet facet_{*this};
};

class ProductLists : public testing::Test {
 protected:
  ProductLists() { released.clear(); }
  void Fill(ProductList& ioList, int inCount) {
    for (int i = 0; i < inCount; ++i) ioList.Append(products_[i].Handle());
    released.clear();
  }
  NamedProduct products_[5] = {NamedProduct('a'), NamedProduct('b'), NamedProduct('c'),
                               NamedProduct('d'), NamedProduct('e')};
};

TEST_F(ProductLists, EmptyHasNoPosition) {
  const ProductList list;
  EXPECT_EQ(0, list.Size());
  EXPECT_THROW(list[1], ZORFatalError);
}

TEST_F(ProductLists, HoldsWhatWasAppendedInOrder) {
  ProductList list;
  Fill(list, 5);
  ASSERT_EQ(5, list.Size());
  for (int i = 1; i <= 5; ++i) EXPECT_EQ(products_[i - 1].Handle(), list[i]) << i;
}

TEST_F(ProductLists, PositionOutsideRaisesTheFatalError) {
  ProductList list;
  Fill(list, 3);
  for (const int position : {0, 4, -1}) {
    try {
      list[position];
      ADD_FAILURE() << position;
    } catch (const ZORFatalError& error) {
      EXPECT_STREQ("AssertionFailed:iPos > 0 && iPos <= _Size", error.what());
    }
  }
}

TEST_F(ProductLists, HoldsOneReferenceOnEachHoweverOftenItGrew) {
  ProductList list;
  Fill(list, 5);
  for (const NamedProduct& product : products_) EXPECT_EQ(1, product.references);
}

TEST_F(ProductLists, ReleasesFromTheLastToTheFirst) {
  for (const auto& [count, order] :
       {std::pair(1, "a"), std::pair(2, "ba"), std::pair(5, "edcba")}) {
    {
      ProductList list;
      Fill(list, count);
    }
    EXPECT_EQ(order, released);
  }
  for (const NamedProduct& product : products_) EXPECT_EQ(0, product.references);
}

TEST_F(ProductLists, EmptyHandlesAreEntriesToo) {
  ProductList list;
  list.Append(ZORIProduct_var());
  list.Append(products_[0].Handle());
  EXPECT_TRUE(list[1].IsNull());
  EXPECT_EQ(2, list.Size());
}

}  // namespace
