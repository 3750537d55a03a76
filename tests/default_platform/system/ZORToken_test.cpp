#include "platform/system/ZORToken.h"

#include <gtest/gtest.h>

TEST(ZORToken, GivesThePartsInOrder) {
  ZORToken tokens("a b c");
  EXPECT_TRUE(tokens.GetNextToken(" ") == "a");
  EXPECT_TRUE(tokens.GetNextToken(" ") == "b");
  EXPECT_TRUE(tokens.GetNextToken(" ") == "c");
}

TEST(ZORToken, IsEmptyWhenTheTextIsUsedUp) {
  ZORToken tokens("a");
  tokens.GetNextToken("\n");
  EXPECT_TRUE(tokens.GetNextToken("\n") == "");
  EXPECT_TRUE(tokens.GetNextToken("\n") == "");
}

TEST(ZORToken, ConsecutiveSeparatorsCountAsOne) {
  ZORToken tokens("\n\na\n\n\nb\n");
  EXPECT_TRUE(tokens.GetNextToken("\n") == "a");
  EXPECT_TRUE(tokens.GetNextToken("\n") == "b");
  EXPECT_TRUE(tokens.GetNextToken("\n") == "");
}

TEST(ZORToken, EachCharacterSeparates) {
  ZORToken tokens("a,;b");
  EXPECT_TRUE(tokens.GetNextToken(";,") == "a");
  EXPECT_TRUE(tokens.GetNextToken(";,") == "b");
}

TEST(ZORToken, SeparatorsMayChangeBetweenCalls) {
  ZORToken tokens("k=a b");
  EXPECT_TRUE(tokens.GetNextToken("=") == "k");
  EXPECT_TRUE(tokens.GetNextToken("") == "=a b");
}

TEST(ZORToken, OfNothingOrOnlySeparatorsIsEmpty) {
  EXPECT_TRUE(ZORToken("").GetNextToken(" ") == "");
  EXPECT_TRUE(ZORToken("   ").GetNextToken(" ") == "");
}

TEST(ZORToken, KeepsItsOwnCopyOfTheText) {
  ZORUnicodeString text("a b");
  ZORToken tokens(text);
  text = "other";
  EXPECT_TRUE(tokens.GetNextToken(" ") == "a");
}
