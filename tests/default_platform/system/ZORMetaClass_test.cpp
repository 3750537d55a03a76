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

// The published test values of the 128-bit FNV-1a hash.
TEST(ZORMetaClass, IdentifierIsTheHashOfTheName) {
  const CLSID a = {0xd228cb69, 0x6f1a, 0x8caf, {0x78, 0x91, 0x2b, 0x70, 0x4e, 0x4a, 0x89, 0x64}};
  const CLSID abc = {0xa68d622c, 0xec8b, 0x5822, {0x83, 0x6d, 0xbc, 0x79, 0x77, 0xaf, 0x7f, 0x3b}};
  EXPECT_TRUE(Retrieve("a")->GetClassId() == a);
  EXPECT_TRUE(Retrieve("abc")->GetClassId() == abc);
  EXPECT_TRUE(Retrieve("a")->GetClassId() != abc);
}
