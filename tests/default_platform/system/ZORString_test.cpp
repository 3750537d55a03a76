#include "platform/system/ZORString.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>

TEST(ZORString, DefaultAndNullAreEmpty) {
  EXPECT_STREQ(ZORString().CastToCharPtr(), "");
  EXPECT_STREQ(ZORString(static_cast<const char*>(nullptr)).CastToCharPtr(), "");
  EXPECT_EQ(ZORString(nullptr, 5).GetLengthInChar(), 0);
  EXPECT_EQ(ZORString("abc", -1).GetLengthInChar(), 0);
}

TEST(ZORString, LengthCountsBytes) {
  EXPECT_EQ(ZORString("\xC3\xA9").GetLengthInChar(), 2);
  EXPECT_EQ(ZORString("a\0b", 3).GetLengthInChar(), 3);
}

TEST(ZORString, ElementsAreSigned) {
  const ZORString text("a\x01\xE9");
  EXPECT_EQ(text[0].SignedValue(), 'a');
  EXPECT_EQ(text[1].SignedValue(), 1);
  EXPECT_EQ(text[2].SignedValue(), 0xE9 - 256);
  EXPECT_EQ(static_cast<char>(text[2]), '\xE9');
}

TEST(ZORString, ElementOutsideIsZero) {
  EXPECT_EQ(ZORString("a")[1].SignedValue(), 0);
  EXPECT_EQ(ZORString("a")[-1].SignedValue(), 0);
  EXPECT_EQ(ZORString()[0].SignedValue(), 0);
}

TEST(ZORString, AppendAlsoOfItself) {
  ZORString text("ab");
  text.Append("c").Append(text);
  EXPECT_STREQ(text.CastToCharPtr(), "abcabc");
}

TEST(ZORString, MoveLeavesTheSourceEmpty) {
  ZORString first("a text that is too long to lie inside"), second("x");
  second = std::move(first);
  EXPECT_STREQ(first.CastToCharPtr(), "");
  const ZORString third(std::move(second));
  EXPECT_STREQ(second.CastToCharPtr(), "");
  EXPECT_TRUE(third == "a text that is too long to lie inside");
}

TEST(ZORString, ComparisonIsOfAllBytes) {
  EXPECT_TRUE(ZORString("a") == ZORString("a"));
  EXPECT_TRUE(ZORString("a") != ZORString("a\0b", 3));
}
