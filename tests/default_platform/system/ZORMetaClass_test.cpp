#include "platform/system/ZORMetaClass.h"

#include <gtest/gtest.h>

#include "platform/system/ZORBaseUnknown.h"

namespace {

ZORMetaClass* Retrieve(const char* inName, const ZORMetaClass* inBase = nullptr) {
  return fct_RetrieveMetaObject(inName, kZORTypeImplementation, inBase, "ZORNull", "Pelinor", 48);
}

}  // namespace

TEST(ZORMetaClass, KeepsWhatItWasMadeWith) {
  const ZORMetaClass* const meta = Retrieve("Wheel", ZORBaseUnknown::MetaObject());
  ASSERT_NE(meta, nullptr);
  EXPECT_STREQ(meta->IsA(), "Wheel");
  EXPECT_EQ(meta->GetTypeOfClass(), 1);
  EXPECT_EQ(meta->GetBase(), ZORBaseUnknown::MetaObject());
  EXPECT_STREQ(meta->GetExtendedClass(), "ZORNull");
  EXPECT_STREQ(meta->GetFramework(), "Pelinor");
  EXPECT_EQ(meta->GetInstanceSize(), 48u);
}

TEST(ZORMetaClass, ThereIsOneForAName) {
  EXPECT_EQ(Retrieve("Once"), Retrieve("Once"));
  EXPECT_NE(Retrieve("Once"), Retrieve("Twice"));
}

TEST(ZORMetaClass, NoneForNoName) {
  EXPECT_EQ(Retrieve(nullptr), nullptr);
  EXPECT_EQ(Retrieve(""), nullptr);
}

TEST(ZORMetaClass, MissingTextsHaveDefaults) {
  const ZORMetaClass* const meta =
      fct_RetrieveMetaObject("Bare", kZORTypeInterface, nullptr, nullptr, nullptr, 0);
  EXPECT_STREQ(meta->GetExtendedClass(), "ZORNull");
  EXPECT_STREQ(meta->GetFramework(), "");
}

TEST(ZORMetaClass, IsAKindOfAllItsBases) {
  const ZORMetaClass* const top = Retrieve("Top");
  const ZORMetaClass* const leaf = Retrieve("Leaf", Retrieve("Middle", top));
  EXPECT_EQ(leaf->IsAKindOf("Leaf"), 1);
  EXPECT_EQ(leaf->IsAKindOf("Middle"), 1);
  EXPECT_EQ(leaf->IsAKindOf("Top"), 1);
  EXPECT_EQ(top->IsAKindOf("Leaf"), 0);
  EXPECT_EQ(leaf->IsAKindOf("leaf"), 0);
  EXPECT_EQ(leaf->IsAKindOf(nullptr), 0);
}

// The published hash of the name.
TEST(ZORMetaClass, IdentifierIsTheHashOfTheName) {
  const CLSID abc = {0x06b05ab6, 0x733a, 0x6185, {0x78, 0xaf, 0x5f, 0x94, 0x89, 0x2f, 0x39, 0x50}};
  EXPECT_TRUE(Retrieve("abc")->GetClassId() == abc);
  EXPECT_TRUE(Retrieve("a")->GetClassId() != abc);
}
