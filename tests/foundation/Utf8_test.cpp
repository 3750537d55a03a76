#include "foundation/Utf8.h"

#include <gtest/gtest.h>

#include <random>
#include <string>

using namespace ZORFoundation;

namespace {

std::u16string Decoded(std::string_view inBytes) {
  std::u16string units(inBytes.size(), u'\0');
  units.resize(DecodeUtf8(inBytes, units.data()));
  return units;
}

std::string Encoded(std::u16string_view inUnits) {
  std::string bytes(Utf8Length(inUnits), '\0');
  EXPECT_EQ(EncodeUtf8(inUnits, bytes.data()), bytes.size());
  return bytes;
}

}  // namespace

TEST(Utf8, TextOfEachLengthIsDecodedAndEncoded) {
  EXPECT_EQ(Decoded("a\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80"), u"a\u00E9\u20AC\U0001F600");
  EXPECT_EQ(Encoded(u"a\u00E9\u20AC\U0001F600"), "a\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80");
}

TEST(Utf8, BoundsOfEachLengthComeBack) {
  for (const char32_t character :
       {0x0, 0x7F, 0x80, 0x7FF, 0x800, 0xD7FF, 0xE000, 0xFFFD, 0xFFFF, 0x10000, 0x10FFFF}) {
    char bytes[4];
    const std::string utf8(bytes, EncodeCharacter(character, bytes));
    const std::u16string units = Decoded(utf8);
    std::size_t position = 0;
    EXPECT_EQ(NextCharacter(units, position), character);
    EXPECT_EQ(position, units.size());
    EXPECT_EQ(Encoded(units), utf8);
    EXPECT_TRUE(IsUtf8(utf8));
  }
}

// The examples of the Unicode Standard, tables 3-8 to 3-11.
TEST(Utf8, EachMaximalPartOfAnIllFormedSequenceIsOneReplacement) {
  EXPECT_EQ(Decoded("\xC0\xAF\xE0\x80\xBF\xF0\x81\x82\x41"),
            u"\uFFFD\uFFFD\uFFFD\uFFFD\uFFFD\uFFFD\uFFFD\uFFFDA");
  EXPECT_EQ(Decoded("\xED\xA0\x80\xED\xBF\xBF\xED\xAF\x41"),
            u"\uFFFD\uFFFD\uFFFD\uFFFD\uFFFD\uFFFD\uFFFD\uFFFDA");
  EXPECT_EQ(Decoded("\xF4\x91\x92\x93\xFF\x41\x80\xBF\x42"),
            u"\uFFFD\uFFFD\uFFFD\uFFFD\uFFFDA\uFFFD\uFFFDB");
  EXPECT_EQ(Decoded("\xE1\x80\xE2\xF0\x91\x92\xF1\xBF\x41"), u"\uFFFD\uFFFD\uFFFD\uFFFDA");
}

TEST(Utf8, IncompleteEndIsOneReplacement) {
  for (const char* bytes : {"\xC3", "\xE2\x82", "\xF0\x9F\x98", "\xF0\x9F", "\xE2"}) {
    EXPECT_EQ(Decoded(bytes), u"\uFFFD") << bytes;
    EXPECT_FALSE(IsUtf8(bytes));
  }
}

TEST(Utf8, LoneSurrogateIsAReplacement) {
  EXPECT_EQ(Encoded(u"\xD800"), "\xEF\xBF\xBD");
  EXPECT_EQ(Encoded(u"\xDC00\xD800"
                    u"a"),
            "\xEF\xBF\xBD\xEF\xBF\xBD"
            "a");
}

TEST(Utf8, EmptyTextIsEmpty) {
  EXPECT_EQ(Decoded(""), u"");
  EXPECT_EQ(Encoded(u""), "");
  EXPECT_TRUE(IsUtf8(""));
}

// Whether a character lies in a block of ASCII, beside one or over the end of one.
TEST(Utf8, PositionMakesNoDifference) {
  for (std::size_t before = 0; before < 20; ++before)
    for (std::size_t after = 0; after < 20; ++after) {
      const std::string bytes =
          std::string(before, 'b') + "\xE2\x82\xAC\xFF" + std::string(after, 'a');
      const std::u16string units =
          std::u16string(before, u'b') + u"\u20AC\uFFFD" + std::u16string(after, u'a');
      EXPECT_EQ(Decoded(bytes), units);
    }
}

TEST(Utf8, RandomUnitsComeBackWithReplacements) {
  std::mt19937 random(3);
  for (int i = 0; i < 2000; ++i) {
    std::u16string units(random() % 40, u'\0');
    for (char16_t& unit : units)
      unit = static_cast<char16_t>(random() % 3 == 0 ? 0xD700 + random() % 0xA00 : random() % 200);
    std::u16string expected;
    for (std::size_t position = 0; position < units.size();) {
      const std::size_t start = position;
      const bool isReplaced = NextCharacter(units, position) == kReplacementCharacter;
      expected += isReplaced ? std::u16string(1, kReplacementCharacter)
                             : units.substr(start, position - start);
    }
    EXPECT_EQ(Decoded(Encoded(units)), expected);
  }
}

TEST(Utf8, CharactersAreTakenOneByOne) {
  const std::string_view bytes = "a\xE2\x82\xAC\xE2\x82z";
  std::size_t position = 0;
  for (const char32_t expected : {U'a', U'\u20AC', U'\uFFFD', U'z'})
    EXPECT_EQ(NextCharacter(bytes, position), expected);
  EXPECT_EQ(position, bytes.size());
}
