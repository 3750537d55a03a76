#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "default_platform/product_structure/ModelDocument.h"

using testing::ElementsAre;
using ZORDefault::AliasesOf;
using ZORDefault::ModelData;
using ZORDefault::ReplaceInvalidXmlChars;

namespace {
/// A root with one child for each name; all children are instances of one part.
ModelData Siblings(const std::u16string& inPartName, const std::vector<std::u16string>& inNames) {
  ModelData model;
  model.parts.resize(2);
  model.parts[0].name = u"Root";
  model.parts[1].name = inPartName;
  model.products.resize(1);
  for (const std::u16string& name : inNames) {
    auto& product = model.products.emplace_back();
    product.name = name;
    product.parent = 0;
    product.part = 1;
  }
  return model;
}
}  // namespace

TEST(Aliases, InstanceNameComesFirst) {
  EXPECT_THAT(AliasesOf(Siblings(u"bolt", {u"bolt_1"}), u"file"), ElementsAre(u"Root", u"bolt_1"));
}

TEST(Aliases, PartNameStandsForAnEmptyInstanceName) {
  EXPECT_THAT(AliasesOf(Siblings(u"bolt", {u""}), u"file"), ElementsAre(u"Root", u"bolt"));
}

TEST(Aliases, ComponentWithoutAnyName) {
  EXPECT_THAT(AliasesOf(Siblings(u"", {u""}), u"file"), ElementsAre(u"Root", u"Component"));
}

TEST(Aliases, RootWithoutNameTakesTheFileName) {
  ModelData model = Siblings(u"bolt", {u"a"});
  model.parts[0].name.clear();
  EXPECT_THAT(AliasesOf(model, u"file"), ElementsAre(u"file", u"a"));
}

TEST(Aliases, SiblingsWithOneNameAreAllNumberedInOrder) {
  EXPECT_THAT(AliasesOf(Siblings(u"bolt", {u"a", u"b", u"a", u"a"}), u"file"),
              ElementsAre(u"Root", u"a.1", u"b", u"a.2", u"a.3"));
}

TEST(Aliases, PartNameAndInstanceNameMayMeet) {
  EXPECT_THAT(AliasesOf(Siblings(u"bolt", {u"", u"bolt"}), u"file"),
              ElementsAre(u"Root", u"bolt.1", u"bolt.2"));
}

TEST(Aliases, NumbersPassOverASiblingsName) {
  EXPECT_THAT(AliasesOf(Siblings(u"bolt", {u"a", u"a.1", u"a"}), u"file"),
              ElementsAre(u"Root", u"a.2", u"a.1", u"a.3"));
}

TEST(Aliases, CousinsMayShareAName) {
  ModelData model = Siblings(u"bolt", {u"a", u"b", u"nut", u"nut"});
  model.products[3].parent = 1;
  model.products[4].parent = 2;
  EXPECT_THAT(AliasesOf(model, u"file"), ElementsAre(u"Root", u"a", u"b", u"nut", u"nut"));
}

TEST(Aliases, NamesThatXmlMakesAlikeAreToldApart) {
  EXPECT_THAT(AliasesOf(Siblings(u"bolt", {u"a\x01", u"a\x02"}), u"file"),
              ElementsAre(u"Root", u"a\uFFFD.1", u"a\uFFFD.2"));
}

TEST(ReplaceInvalidXmlChars, KeepsWhatXmlCarries) {
  const std::u16string text = u"\t\n\r <&>\"' \u00e9 \U0001F600 \uFFFD";
  EXPECT_EQ(ReplaceInvalidXmlChars(text), text);
}

TEST(ReplaceInvalidXmlChars, ReplacesControlsAndNonCharacters) {
  const std::u16string text = {u'a', 0, 0x1F, 0xFFFE, 0xFFFF, u'b'};
  EXPECT_EQ(ReplaceInvalidXmlChars(text), u"a\uFFFD\uFFFD\uFFFD\uFFFDb");
}

TEST(ReplaceInvalidXmlChars, ReplacesLoneSurrogates) {
  const std::u16string text = {0xD83D, u'a', 0xDE00, 0xD83D};
  EXPECT_EQ(ReplaceInvalidXmlChars(text), u"\uFFFDa\uFFFD\uFFFD");
}
