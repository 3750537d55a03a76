#include "toolkit/records/RecordFilter.h"

#include <gtest/gtest.h>

#include "toolkit/records/Glob.h"

namespace {

using namespace ZORToolkit;

InterferenceRecord Record() {
  InterferenceRecord record;
  record.result = "set";
  record.type = "Clash";
  record.status = "Not inspected";
  record.products[1].alias = "Straße";
  return record;
}

TEST(CaseFolded, MakesLettersOfAllCasesEqual) {
  EXPECT_EQ(CaseFolded("ABC é"), CaseFolded("abc É"));
  EXPECT_EQ(CaseFolded("ΣΣ"), CaseFolded("σς"));
  EXPECT_NE(CaseFolded("a"), CaseFolded("b"));
  EXPECT_EQ("😀", CaseFolded("😀"));
}

TEST(MatchesGlob, TakesCharactersNotBytes) {
  EXPECT_TRUE(MatchesGlob("Stra?e*", "Straße 1"));
  EXPECT_TRUE(MatchesGlob("*a*b", "aabab"));
  EXPECT_TRUE(MatchesGlob("**", ""));
  EXPECT_FALSE(MatchesGlob("Stra??e", "Straße"));
  EXPECT_FALSE(MatchesGlob("?", ""));
  EXPECT_FALSE(MatchesGlob("a", "ab"));
}

TEST(RecordFilter, WithoutConditionsAcceptsAll) { EXPECT_TRUE(RecordFilter().Accepts({})); }

TEST(RecordFilter, WordsOfOneKindAreAlternatives) {
  RecordFilter filter;
  filter.SetTypes({"contact", "CLASH"});
  filter.SetStatuses({"not-inspected"});
  EXPECT_TRUE(filter.Accepts(Record()));
  filter.SetTypes({"contact"});
  EXPECT_FALSE(filter.Accepts(Record()));
}

TEST(RecordFilter, ResultIsMeantExactly) {
  RecordFilter filter;
  filter.SetResult("set");
  EXPECT_TRUE(filter.Accepts(Record()));
  filter.SetResult("SET");
  EXPECT_FALSE(filter.Accepts(Record()));
}

TEST(RecordFilter, ProductHoldsATextInAnyLetterCase) {
  RecordFilter filter;
  EXPECT_FALSE(filter.NeedsLabels());
  filter.SetProduct("STRA");
  EXPECT_TRUE(filter.NeedsLabels());
  EXPECT_TRUE(filter.Accepts(Record()));
  filter.SetProduct("other");
  EXPECT_FALSE(filter.Accepts(Record()));
}

}  // namespace
