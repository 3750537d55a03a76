#include "platform/system/ZORUnicodeString.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>

namespace {

ZORUnicodeString FromUnits(std::u16string_view inUnits) {
  ZORUnicodeString text;
  text.BuildFromUTF16(inUnits.data(), inUnits.size());
  return text;
}

std::u16string UnitsOf(const ZORUnicodeString& inText) {
  if (!inText.ConvertToUCChar()) return {};
  return {inText.ConvertToUCChar(), static_cast<std::size_t>(inText.GetLengthInChar())};
}

std::u16string Decoded(std::string_view inBytes) {
  ZORUnicodeString text;
  text.BuildFromUTF8(inBytes.data(), inBytes.size());
  return UnitsOf(text);
}

}  // namespace

TEST(ZORUnicodeString, DefaultIsEmpty) {
  const ZORUnicodeString text;
  EXPECT_EQ(text.GetLengthInChar(), 0);
  EXPECT_STREQ(text.ConvertToChar(), "");
  EXPECT_EQ(text.ConvertToString().GetLengthInChar(), 0);
}

TEST(ZORUnicodeString, ConvertToUCCharIsNullWhenEmpty) {
  ZORUnicodeString text("a");
  ASSERT_NE(text.ConvertToUCChar(), nullptr);
  EXPECT_EQ(text.ConvertToUCChar()[0], u'a');
  text.BuildFromUTF16(nullptr, 0);
  EXPECT_EQ(text.ConvertToUCChar(), nullptr);
}

TEST(ZORUnicodeString, ConstructionFromNullIsEmpty) {
  EXPECT_EQ(ZORUnicodeString(static_cast<const char*>(nullptr)).GetLengthInChar(), 0);
}

TEST(ZORUnicodeString, ConstructionReadsUtf8) {
  EXPECT_EQ(UnitsOf(ZORUnicodeString("Non inspect\xC3\xA9")), u"Non inspect\u00E9");
  EXPECT_EQ(UnitsOf(ZORUnicodeString("\xE5\xB9\xB2\xE6\xB8\x89")), u"\u5E72\u6E09");
}

TEST(ZORUnicodeString, ConstructionFromNarrowStringKeepsZeros) {
  EXPECT_EQ(ZORUnicodeString(ZORString("a\0b", 3)).GetLengthInChar(), 3);
}

TEST(ZORUnicodeString, CharactersPastTheBasicPlaneAreTwoUnits) {
  const ZORUnicodeString text("\xF0\x9F\x94\xA7");
  EXPECT_EQ(UnitsOf(text), u"\U0001F527");
  EXPECT_EQ(text.GetLengthInChar(), 2);
  EXPECT_STREQ(text.ConvertToChar(), "\xF0\x9F\x94\xA7");
}

TEST(ZORUnicodeString, OverlongFormsAreReplaced) {
  EXPECT_EQ(Decoded("\xC0\xAF"), u"\uFFFD\uFFFD");
  EXPECT_EQ(Decoded("\xE0\x80\xAF"), u"\uFFFD\uFFFD\uFFFD");
}

TEST(ZORUnicodeString, Utf8SurrogatesAreReplaced) {
  EXPECT_EQ(Decoded("\xED\xA0\x80"), u"\uFFFD\uFFFD\uFFFD");
}

TEST(ZORUnicodeString, NumbersPastUnicodeAreReplaced) {
  EXPECT_EQ(Decoded("\xF4\x90\x80\x80"), u"\uFFFD\uFFFD\uFFFD\uFFFD");
  EXPECT_EQ(Decoded("\xF4\x8F\xBF\xBF"), u"\U0010FFFF");
}

TEST(ZORUnicodeString, AMaximalPartOfASequenceIsReplacedOnce) {
  EXPECT_EQ(Decoded("\xF0\x9F\x94z"), u"\uFFFDz");
  EXPECT_EQ(Decoded("a\xE5\xB9"), u"a\uFFFD");
  EXPECT_EQ(Decoded("\x80\xBFz"), u"\uFFFD\uFFFDz");
}

TEST(ZORUnicodeString, BuildFromUTF8TakesItsOwnNarrowForm) {
  ZORUnicodeString text("caf\xC3\xA9");
  text.BuildFromUTF8(text.ConvertToChar(), 3);
  EXPECT_EQ(UnitsOf(text), u"caf");
}

TEST(ZORUnicodeString, LoneSurrogatesStayInUtf16AndAreReplacedInUtf8) {
  const ZORUnicodeString text = FromUnits(std::u16string{u'a', 0xD800, u'b', 0xDC00});
  EXPECT_EQ(text.GetLengthInChar(), 4);
  EXPECT_EQ(text.ConvertToUCChar()[1], 0xD800);
  EXPECT_STREQ(text.ConvertToChar(),
               "a\xEF\xBF\xBD"
               "b\xEF\xBF\xBD");
}

TEST(ZORUnicodeString, ConvertToUTF8WritesCountAndNoTerminator) {
  const ZORUnicodeString text(
      "\xC3\xA9"
      "a");
  char bytes[] = "??????";
  std::size_t count = 99;
  EXPECT_EQ(text.ConvertToUTF8(bytes, &count), S_OK);
  EXPECT_EQ(count, 3u);
  EXPECT_STREQ(bytes,
               "\xC3\xA9"
               "a???");
}

TEST(ZORUnicodeString, ConvertToUTF8OfEmptyTextWritesNothing) {
  char byte = '?';
  std::size_t count = 99;
  EXPECT_EQ(ZORUnicodeString().ConvertToUTF8(&byte, &count), S_OK);
  EXPECT_EQ(count, 0u);
  EXPECT_EQ(byte, '?');
}

TEST(ZORUnicodeString, ConvertToUTF8RefusesNull) {
  char byte = '?';
  std::size_t count = 99;
  EXPECT_EQ(ZORUnicodeString("a").ConvertToUTF8(nullptr, &count), E_INVALIDARG);
  EXPECT_EQ(ZORUnicodeString("a").ConvertToUTF8(&byte, nullptr), E_INVALIDARG);
}

TEST(ZORUnicodeString, ConvertToWCharJoinsPairsAndTerminates) {
  wchar_t wide[8] = L"???????";
  EXPECT_EQ(ZORUnicodeString("a\xF0\x9F\x94\xA7").ConvertToWChar(wide), S_OK);
  EXPECT_STREQ(wide, L"a\U0001F527");
}

TEST(ZORUnicodeString, ConvertToWCharReplacesLoneSurrogates) {
  wchar_t wide[4] = L"???";
  FromUnits(std::u16string{0xDC00}).ConvertToWChar(wide);
  EXPECT_STREQ(wide, L"\uFFFD");
}

TEST(ZORUnicodeString, ConvertToWCharRefusesNull) {
  EXPECT_EQ(ZORUnicodeString("a").ConvertToWChar(nullptr), E_INVALIDARG);
}

TEST(ZORUnicodeString, NarrowFormFollowsChanges) {
  ZORUnicodeString text("a");
  EXPECT_STREQ(text.ConvertToChar(), "a");
  text += ZORUnicodeChar('b');
  EXPECT_STREQ(text.ConvertToChar(), "ab");
  text.Append("c");
  EXPECT_STREQ(text.ConvertToChar(), "abc");
  text.Insert(0, "0");
  EXPECT_STREQ(text.ConvertToChar(), "0abc");
  text.ReplaceSubString("0a", "x");
  EXPECT_STREQ(text.ConvertToChar(), "xbc");
  text.AppendUTF16(u"\u00E9", 1);
  EXPECT_STREQ(text.ConvertToChar(), "xbc\xC3\xA9");
  text.BuildFromNum(7);
  EXPECT_STREQ(text.ConvertToChar(), "7");
  text = ZORUnicodeString("new");
  EXPECT_STREQ(text.ConvertToChar(), "new");
}

TEST(ZORUnicodeString, MoveLeavesTheSourceEmpty) {
  ZORUnicodeString first("a text that is too long to lie inside the string");
  first.ConvertToChar();
  const ZORUnicodeString second(std::move(first));
  EXPECT_EQ(first.GetLengthInChar(), 0);  // NOLINT(bugprone-use-after-move): empty then
  EXPECT_STREQ(first.ConvertToChar(), "");
  EXPECT_TRUE(second == "a text that is too long to lie inside the string");
}

TEST(ZORUnicodeString, MoveAssignmentLeavesTheSourceEmpty) {
  ZORUnicodeString source("ab"), target("xyz");
  target.ConvertToChar();
  target = std::move(source);
  EXPECT_EQ(source.GetLengthInChar(), 0);  // NOLINT(bugprone-use-after-move): empty then
  EXPECT_STREQ(target.ConvertToChar(), "ab");
}

TEST(ZORUnicodeString, SelfAssignmentKeepsTheText) {
  ZORUnicodeString text("abc");
  ZORUnicodeString& same = text;
  text = same;
  EXPECT_TRUE(text == "abc");
  text = std::move(same);
  EXPECT_TRUE(text == "abc");
}

TEST(ZORUnicodeString, CopyIsIndependent) {
  const ZORUnicodeString first("abc");
  ZORUnicodeString second(first);
  second += "d";
  EXPECT_TRUE(first == "abc");
  EXPECT_TRUE(second == "abcd");
}

TEST(ZORUnicodeString, AppendOfItselfDoubles) {
  ZORUnicodeString text("0123456789");
  text.Append(text);
  EXPECT_TRUE(text == "01234567890123456789");
}

TEST(ZORUnicodeString, InsertPutsTextBeforeAPosition) {
  ZORUnicodeString text("ad");
  text.Insert(1, "bc");
  EXPECT_TRUE(text == "abcd");
}

TEST(ZORUnicodeString, InsertOutsideGoesToTheNearerEnd) {
  ZORUnicodeString text("b");
  text.Insert(-5, "a").Insert(99, "c");
  EXPECT_TRUE(text == "abc");
}

TEST(ZORUnicodeString, InsertOfItselfInTheMiddle) {
  ZORUnicodeString text("ab");
  text.Insert(1, text);
  EXPECT_TRUE(text == "aabb");
}

TEST(ZORUnicodeString, StripBothEndsLeavesInnerBlanks) {
  EXPECT_TRUE(ZORUnicodeString("  a b ").Strip(4, ZORUnicodeChar(' ')) == "a b");
}

TEST(ZORUnicodeString, StripOneEndOnly) {
  EXPECT_TRUE(ZORUnicodeString(" a ").Strip(ZORUnicodeString::kStripLeading) == "a ");
  EXPECT_TRUE(ZORUnicodeString(" a ").Strip(ZORUnicodeString::kStripTrailing) == " a");
}

TEST(ZORUnicodeString, StripOfOnlyThatCharacterIsEmpty) {
  EXPECT_TRUE(ZORUnicodeString("///").Strip(4, ZORUnicodeChar('/')) == "");
  EXPECT_TRUE(ZORUnicodeString().Strip() == "");
}

TEST(ZORUnicodeString, StripKeepsOtherWhiteSpace) {
  EXPECT_TRUE(ZORUnicodeString("\ta\n").Strip() == "\ta\n");
}

TEST(ZORUnicodeString, ReplaceSubStringReplacesTheFirstOnly) {
  ZORUnicodeString text("1,2,3");
  EXPECT_EQ(text.ReplaceSubString(",", "."), 1);
  EXPECT_TRUE(text == "1.2,3");
}

TEST(ZORUnicodeString, ReplaceSubStringWithLongerAndWithNothing) {
  ZORUnicodeString text("../i.jpg");
  EXPECT_EQ(text.ReplaceSubString("..", "/pub/of/a/long/path"), 0);
  EXPECT_TRUE(text == "/pub/of/a/long/path/i.jpg");
  EXPECT_EQ(text.ReplaceSubString("/i.jpg", ""), 19);
  EXPECT_TRUE(text == "/pub/of/a/long/path");
}

TEST(ZORUnicodeString, ReplaceSubStringAbsentChangesNothing) {
  ZORUnicodeString text("abc");
  EXPECT_EQ(text.ReplaceSubString("x", "y"), -1);
  EXPECT_EQ(text.ReplaceSubString("", "y"), -1);
  EXPECT_EQ(text.ReplaceSubString("abcd", "y"), -1);
  EXPECT_TRUE(text == "abc");
}

TEST(ZORUnicodeString, ReplaceSubStringByItself) {
  ZORUnicodeString text("abc");
  EXPECT_EQ(text.ReplaceSubString("b", text), 1);
  EXPECT_TRUE(text == "aabcc");
  EXPECT_EQ(text.ReplaceSubString(text, "x"), 0);
  EXPECT_TRUE(text == "x");
}

TEST(ZORUnicodeString, SearchSubStringFindsTheFirstFromAPosition) {
  const ZORUnicodeString text("abcabc");
  EXPECT_EQ(text.SearchSubString("bc", 0, 1), 1);
  EXPECT_EQ(text.SearchSubString("bc", 1, 1), 1);
  EXPECT_EQ(text.SearchSubString("bc", 2, 1), 4);
  EXPECT_EQ(text.SearchSubString("abcabc"), 0);
}

TEST(ZORUnicodeString, SearchSubStringBackwardFindsTheLastUpToAPosition) {
  const ZORUnicodeString text("abcabc");
  EXPECT_EQ(text.SearchSubString("bc", 5, 2), 4);
  EXPECT_EQ(text.SearchSubString("bc", 4, 2), 4);
  EXPECT_EQ(text.SearchSubString("bc", 3, 2), 1);
  EXPECT_EQ(text.SearchSubString("bc", 0, 2), -1);
}

TEST(ZORUnicodeString, SearchSubStringAbsentEmptyOrOutside) {
  const ZORUnicodeString text("abc");
  EXPECT_EQ(text.SearchSubString("x"), -1);
  EXPECT_EQ(text.SearchSubString(""), -1);
  EXPECT_EQ(text.SearchSubString("abcd"), -1);
  EXPECT_EQ(text.SearchSubString("a", -1), -1);
  EXPECT_EQ(text.SearchSubString("c", 3), -1);
  EXPECT_EQ(text.SearchSubString("a", 0, 3), -1);
  EXPECT_EQ(ZORUnicodeString().SearchSubString("a"), -1);
}

// Every length around the search's block size, with the text sought at every place.
TEST(ZORUnicodeString, SearchSubStringFindsAtEveryPlaceOfLongTexts) {
  for (int length = 2; length <= 70; ++length) {
    for (int place = 0; place + 2 <= length; ++place) {
      std::u16string units(static_cast<std::size_t>(length), u'a');
      units[static_cast<std::size_t>(place)] = u'\u3000';
      units[static_cast<std::size_t>(place) + 1] = u'!';
      ASSERT_EQ(FromUnits(units).SearchSubString(FromUnits(u"\u3000!")), place) << length;
    }
  }
}

TEST(ZORUnicodeString, SubStringEndsWithTheText) {
  const ZORUnicodeString text("abcdef");
  EXPECT_TRUE(text.SubString(2, 3) == "cde");
  EXPECT_TRUE(text.SubString(2) == "cdef");
  EXPECT_TRUE(text.SubString(2, 99) == "cdef");
  EXPECT_TRUE(text.SubString(2, 0) == "");
}

TEST(ZORUnicodeString, SubStringOutsideIsEmpty) {
  const ZORUnicodeString text("ab");
  EXPECT_TRUE(text.SubString(3, 1) == "");
  EXPECT_TRUE(text.SubString(2, 1) == "");
  EXPECT_TRUE(text.SubString(-1, 1) == "");
  EXPECT_TRUE(ZORUnicodeString().SubString(0) == "");
}

TEST(ZORUnicodeString, ComparisonWithNarrowText) {
  const ZORUnicodeString text("caf\xC3\xA9");
  EXPECT_TRUE(text == "caf\xC3\xA9");
  EXPECT_TRUE(text != "cafe");
  EXPECT_TRUE(text != "caf");
  EXPECT_TRUE(text != "caf\xC3\xA9s");
  EXPECT_TRUE(ZORUnicodeString() == "");
  EXPECT_TRUE(ZORUnicodeString() == static_cast<const char*>(nullptr));
  EXPECT_TRUE(text != static_cast<const char*>(nullptr));
}

TEST(ZORUnicodeString, ComparisonSeesTextAfterAZero) {
  EXPECT_TRUE(FromUnits(std::u16string_view(u"a\0b", 3)) != "a");
}

TEST(ZORUnicodeString, SumsLeaveTheirPartsAlone) {
  const ZORUnicodeString a("a"), b("b");
  EXPECT_TRUE(a + b == "ab");
  EXPECT_TRUE(a + " -- " == "a -- ");
  EXPECT_TRUE(a + static_cast<const char*>(nullptr) == "a");
  EXPECT_TRUE(a == "a" && b == "b");
}

TEST(ZORUnicodeString, AppendUTF16OfNullAddsNothing) {
  ZORUnicodeString text("a");
  text.AppendUTF16(nullptr, 5);
  EXPECT_TRUE(text == "a");
}

TEST(ZORUnicodeString, ReserveKeepsTheTextInPlaceWhileAppending) {
  ZORUnicodeString text("a");
  text.Reserve(1000);
  const ZORUC2Bytes* const before = text.ConvertToUCChar();
  for (int i = 0; i < 999; ++i) text += ZORUnicodeChar('b');
  EXPECT_EQ(text.ConvertToUCChar(), before);
  text.Reserve(0);
  EXPECT_EQ(text.GetLengthInChar(), 1000);
}

// Short texts lie in the string itself, longer ones on the heap; what is given may be part of the
// text that changes.
TEST(ZORUnicodeString, TextsOfAllLengthsChangeAndMoveAlike) {
  for (std::size_t length = 0; length <= 60; ++length) {
    std::u16string expected;
    for (std::size_t i = 0; i < length; ++i) expected += static_cast<char16_t>(u'a' + i);
    const ZORUnicodeString text = FromUnits(expected);
    const std::size_t half = length / 2;
    const std::u16string tail = expected.substr(half);

    ZORUnicodeString copy(text);
    EXPECT_EQ(UnitsOf(copy.Append(copy)), expected + expected);
    EXPECT_EQ(UnitsOf(copy = text), expected);
    EXPECT_EQ(UnitsOf(copy.AppendUTF16(copy.ConvertToUCChar(), half)),
              expected + expected.substr(0, half));
    copy = text;
    EXPECT_EQ(UnitsOf(copy.Insert(static_cast<int>(half), copy)),
              expected.substr(0, half) + expected + tail);
    copy = text;
    if (length > 0) copy.BuildFromUTF16(copy.ConvertToUCChar() + half, length - half);
    EXPECT_EQ(UnitsOf(copy), tail);

    ZORUnicodeString moved(std::move(copy));
    EXPECT_EQ(UnitsOf(moved), tail);
    EXPECT_EQ(UnitsOf(copy), u"");  // NOLINT(bugprone-use-after-move): empty then
    copy = text;
    moved = std::move(copy);
    EXPECT_EQ(UnitsOf(moved), expected);
    EXPECT_EQ(UnitsOf(copy += ZORUnicodeChar('z')), u"z");  // NOLINT(bugprone-use-after-move)
    copy = moved;
    moved += "!";
    EXPECT_EQ(UnitsOf(copy), expected);
    EXPECT_EQ(UnitsOf(moved), expected + u"!");
  }
}

TEST(ZORUnicodeString, BuildFromLatin1TakesEveryByteAsACharacter) {
  std::string bytes;
  for (int length = 0; length <= 40; ++length) {
    ZORUnicodeString text("before");
    text.BuildFromLatin1(bytes.data(), bytes.size());
    ASSERT_EQ(UnitsOf(text), std::u16string(bytes.size(), u'\u00E9'));
    bytes += '\xE9';
  }
}

TEST(ZORUnicodeChar, KeepsAnyUnit) {
  ZORUnicodeChar character;
  EXPECT_EQ(character.ConvertToUC2Bytes(), 0);
  character.BuildFromUC2Bytes(0xD800);
  EXPECT_EQ(character.ConvertToUC2Bytes(), 0xD800);
  EXPECT_EQ(ZORUnicodeChar('\xE9').ConvertToUC2Bytes(), 0xE9);
  EXPECT_TRUE(ZORUnicodeChar('a') == ZORUnicodeChar('a'));
  EXPECT_TRUE(ZORUnicodeChar('a') != ZORUnicodeChar('b'));
}
