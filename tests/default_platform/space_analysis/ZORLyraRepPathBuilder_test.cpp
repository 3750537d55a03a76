#include "platform/visualisation/ZORLyraRepPathBuilder.h"

#include <gtest/gtest.h>

#include "default_platform/space_analysis/Assembly.h"
#include "default_platform/system/ObjectCounters.h"

namespace {

using assembly::kNut;
using assembly::kRod;
using assembly::Product;
using assembly::RepOf;
using assembly::Root;

ZORRep* Built(const ZORIProduct_var& inProduct, const char* inPath) {
  ZORLyraRepPathBuilder builder(0);
  ZORRepPath* path = nullptr;
  if (FAILED(builder.GetRepPathFromSpecObjV4(inProduct, inPath, path))) return nullptr;
  path->Rewind();
  return path->NextChildRep();
}

TEST(ZORLyraRepPathBuilder, PathTextNamesTheProduct) {
  ASSERT_NE(nullptr, RepOf(Product(kNut)));
  EXPECT_EQ(RepOf(Product(kNut)), Built(Product(kNut), kNut));
  EXPECT_EQ(RepOf(Product(kNut)), Built(Root(), kNut));
  EXPECT_EQ(RepOf(Product(kRod)), Built(Product(kNut), kRod));
}

TEST(ZORLyraRepPathBuilder, WithoutPathTextTheProductItselfIsMeant) {
  EXPECT_EQ(RepOf(Product(kRod)), Built(Product(kRod), ""));
  EXPECT_EQ(RepOf(Root()), Built(Root(), ""));
}

TEST(ZORLyraRepPathBuilder, ProductThatStandsElsewhereHasItsOwnRepresentation) {
  const auto scene = assembly::NutAndRod();
  ASSERT_NE(RepOf(Product(kNut)), RepOf(scene.products[0]));
  EXPECT_EQ(RepOf(scene.products[0]), Built(scene.products[0], kNut));
  EXPECT_EQ(RepOf(scene.products[0]), Built(scene.products[0], ""));
}

TEST(ZORLyraRepPathBuilder, UnknownPathFails) {
  ZORLyraRepPathBuilder builder(0);
  ZORRepPath* path = reinterpret_cast<ZORRepPath*>(&builder);
  EXPECT_EQ(E_FAIL, builder.GetRepPathFromSpecObjV4(Root(), "nowhere", path));
  EXPECT_EQ(nullptr, path);
}

TEST(ZORLyraRepPathBuilder, NullProductIsRefused) {
  ZORLyraRepPathBuilder builder(0);
  ZORRepPath* path = nullptr;
  EXPECT_EQ(E_INVALIDARG, builder.GetRepPathFromSpecObjV4(ZORIProduct_var(), kNut, path));
  EXPECT_EQ(nullptr, path);
}

TEST(ZORLyraRepPathBuilder, PathEndsAfterItsRepresentationAndRewinds) {
  ZORLyraRepPathBuilder builder(0);
  ZORRepPath* path = nullptr;
  ASSERT_EQ(S_OK, builder.GetRepPathFromSpecObjV4(Root(), kNut, path));
  ZORRep* const first = path->NextChildRep();
  EXPECT_NE(nullptr, first);
  EXPECT_EQ(nullptr, path->NextChildRep());
  path->Rewind();
  EXPECT_EQ(first, path->NextChildRep());
}

TEST(ZORLyraRepPathBuilder, EndsThePathsThatNobodyDeleted) {
  const ZORDefault::ObjectCounts before = ZORDefault::CountsOf("ZORRepPath");
  {
    ZORLyraRepPathBuilder builder(0);
    ZORRepPath *kept = nullptr, *deleted = nullptr;
    builder.GetRepPathFromSpecObjV4(Root(), kNut, kept);
    builder.GetRepPathFromSpecObjV4(Root(), kRod, deleted);
    delete deleted;
    EXPECT_EQ(1, ZORDefault::CountsOf("ZORRepPath").released - before.released);
  }
  const ZORDefault::ObjectCounts after = ZORDefault::CountsOf("ZORRepPath");
  EXPECT_EQ(2, after.built - before.built);
  EXPECT_EQ(2, after.released - before.released);
}

}  // namespace
