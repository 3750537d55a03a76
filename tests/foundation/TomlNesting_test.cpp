#include "foundation/TomlNesting.h"

#include <gtest/gtest.h>

#include <string>

using ZORFoundation::FindTooDeepToml;

namespace {

std::string Repeated(const std::string& inText, int inCount) {
  std::string text;
  for (int i = 0; i < inCount; ++i) text += inText;
  return text;
}

std::string PlaceOf(const std::string& inText) {
  const auto place = FindTooDeepToml(inText);
  return place ? std::to_string(place->line) + ":" + std::to_string(place->column) : "";
}

}  // namespace

TEST(TomlNesting, KeysAreAllowedUpToTheirLimit) {
  EXPECT_EQ(PlaceOf(Repeated("a.", 31) + "a = 1"), "");
  EXPECT_EQ(PlaceOf("b = 1\n" + Repeated("a.", 32) + "a = 1"), "2:64");
  EXPECT_EQ(PlaceOf("[" + Repeated("a .", 32) + "a]"), "1:97");
  EXPECT_EQ(PlaceOf(Repeated("'a'.", 32) + "a = 1"), "1:128");
  EXPECT_EQ(PlaceOf("k = {" + Repeated("a.", 300'000) + "a = 1}"), "1:69");
}

TEST(TomlNesting, BracketsAreAllowedUpToTheirLimit) {
  EXPECT_EQ(PlaceOf("k = " + Repeated("[", 64) + Repeated("]", 64)), "");
  EXPECT_EQ(PlaceOf("k = " + Repeated("[", 65) + Repeated("]", 65)), "1:69");
  EXPECT_EQ(PlaceOf(Repeated("[[list]]\nk = {a = 1}\n", 1000)), "");
}

TEST(TomlNesting, PointsElsewhereAreNotCounted) {
  EXPECT_EQ(PlaceOf("k = [" + Repeated("1.5, ", 100) + "]"), "");
  EXPECT_EQ(PlaceOf("# " + Repeated("a.[", 100)), "");
  EXPECT_EQ(PlaceOf("k = \"\\\"" + Repeated("a.[", 100) + "\""), "");
  EXPECT_EQ(PlaceOf("k = '\\" + Repeated("a.[", 100) + "'"), "");
  EXPECT_EQ(PlaceOf("k = \"\"\"\n\"" + Repeated("a.[\n", 100) + "\\\"\"\"\"\"\nk = '''" +
                    Repeated(".", 100) + "''''"),
            "");
}

TEST(TomlNesting, DamagedTextEndsToo) {
  EXPECT_EQ(PlaceOf("k = \"" + Repeated("a.", 100)), "");
  EXPECT_EQ(PlaceOf("k = \"\\"), "");
  EXPECT_EQ(PlaceOf("k = '''"), "");
  EXPECT_EQ(PlaceOf(Repeated("]", 100)), "");
}
