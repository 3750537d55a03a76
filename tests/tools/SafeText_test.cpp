#include "lyra/terminal/SafeText.h"

#include <gtest/gtest.h>

using lyra::Cut;
using lyra::DisplayWidth;
using lyra::EscapedForJson;
using lyra::Fitted;
using lyra::Printable;

TEST(Printable, KeepsOrdinaryTextOfAnyScript) {
  EXPECT_EQ(Printable("a \"b\" \\ é 日本語 😀"), "a \"b\" \\ é 日本語 😀");
  EXPECT_EQ(Printable(""), "");
}

TEST(Printable, ShowsControlCharacters) {
  EXPECT_EQ(Printable("a\tb\nc\033[1m\x7F"), "a\\u{9}b\\u{A}c\\u{1B}[1m\\u{7F}");
  EXPECT_EQ(Printable(std::string("a\0b", 3)), "a\\u{0}b");
  EXPECT_EQ(Printable("\u0080\u009b\u009f\u00a0"), "\\u{80}\\u{9B}\\u{9F}\u00a0");
}

TEST(Printable, ShowsWhatTurnsTheDirectionOfWriting) {
  EXPECT_EQ(Printable("\u202e\u2066\u2069\u200f\u061c\u2028"),
            "\\u{202E}\\u{2066}\\u{2069}\\u{200F}\\u{61C}\\u{2028}");
  EXPECT_EQ(Printable("\U000E0041"), "\\u{E0041}");
}

TEST(Printable, ReplacesBytesThatAreNoText) {
  EXPECT_EQ(Printable("a\xFF"
                      "b"),
            "a\uFFFDb");
}

TEST(EscapedForJson, LeavesPlainJsonAlone) {
  EXPECT_EQ(EscapedForJson("{\"a\":\"é😀\\n\"}"), "{\"a\":\"é😀\\n\"}");
}

TEST(EscapedForJson, EscapesAsUtf16) {
  EXPECT_EQ(EscapedForJson("\"\x7F\u009b\u202e\U000E0041\""),
            "\"\\u007f\\u009b\\u202e\\udb40\\udc41\"");
}

TEST(DisplayWidth, CountsColumns) {
  EXPECT_EQ(DisplayWidth("abc"), 3);
  EXPECT_EQ(DisplayWidth("é"), 1);
  EXPECT_EQ(DisplayWidth("e\u0301"), 1);
  EXPECT_EQ(DisplayWidth("日本"), 4);
}

TEST(Fitted, KeepsWhatFits) { EXPECT_EQ(Fitted("abc", 3, Cut::kEnd), "abc"); }

TEST(Fitted, CutsAtTheChosenEnd) {
  EXPECT_EQ(Fitted("abcdef", 4, Cut::kEnd), "abc…");
  EXPECT_EQ(Fitted("abcdef", 4, Cut::kStart), "…def");
}

TEST(Fitted, DoesNotSplitAWideCharacter) {
  EXPECT_EQ(Fitted("日本語", 4, Cut::kEnd), "日…");
  EXPECT_EQ(Fitted("日本語", 4, Cut::kStart), "…語");
}
