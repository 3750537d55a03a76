// Texts and numbers against the C library and ICU, on seeded random inputs.
#include <gtest/gtest.h>
#include <unicode/ustring.h>

#include <algorithm>
#include <bit>
#include <climits>
#include <cmath>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <random>
#include <string>
#include <vector>

#include "platform/system/ZORUnicodeString.h"

namespace {

constexpr int kTexts = 50000;
using Random = std::mt19937;

std::string RandomText(Random& ioRandom, const std::vector<std::string>& inPieces, int inMost) {
  std::string text;
  for (int left = static_cast<int>(ioRandom() % static_cast<unsigned>(inMost + 1)); left > 0;
       --left)
    text += inPieces[ioRandom() % inPieces.size()];
  return text;
}

const std::vector<std::string> kNumberPieces = {
    "0",    "1",  "2",  "5",      "9",   "12",       "37",  "999999999", "2147483648",
    "-",    "+",  ".",  ".",      "e",   "E",        "e-",  "e+3",       " ",
    "\t",   "\n", ",",  "x",      "0x",  "p",        "inf", "nan",       "infinity",
    "nan(", ")",  "mm", "000000", "308", "\xC3\xA9", "a",   "f"};

bool SameDouble(double inA, double inB) {
  if (std::isnan(inA) || std::isnan(inB)) return std::isnan(inA) && std::isnan(inB);
  return std::bit_cast<std::uint64_t>(inA) == std::bit_cast<std::uint64_t>(inB);
}

}  // namespace

TEST(ZORUnicodeStringDifferential, DoublesAreReadAsTheCLibraryDoes) {
  Random random(20251);
  int converted = 0, refused = 0;
  for (int i = 0; i < kTexts; ++i) {
    const std::string text = RandomText(random, kNumberPieces, 7);
    const char* const format = i % 3 == 0 ? "%le" : i % 3 == 1 ? "%lf" : "%5lg";
    double expected = -7, actual = -7;
    const int expectedCount = std::sscanf(text.c_str(), format, &expected) == 1;
    ASSERT_EQ(ZORUnicodeString(text.c_str()).ConvertToNum(&actual, format), expectedCount) << text;
    ASSERT_TRUE(SameDouble(actual, expected)) << text << " " << actual << " " << expected;
    ++(expectedCount ? converted : refused);
  }
  EXPECT_GT(converted, kTexts / 10);
  EXPECT_GT(refused, kTexts / 10);
}

TEST(ZORUnicodeStringDifferential, WellFormedDoublesAreReadToTheBit) {
  Random random(20252);
  for (int i = 0; i < kTexts; ++i) {
    std::uint64_t bits = (std::uint64_t{random()} << 32) | random();
    double number = 0;
    std::memcpy(&number, &bits, sizeof(number));
    char text[64];
    std::snprintf(text, sizeof(text), i % 2 ? "%.17g" : "%.9e", number);
    const double expected = std::strtod(text, nullptr);
    double actual = -7;
    ASSERT_EQ(ZORUnicodeString(text).ConvertToNum(&actual), 1) << text;
    ASSERT_TRUE(SameDouble(actual, expected)) << text;
  }
}

TEST(ZORUnicodeStringDifferential, IntsAreReadAsTheCLibraryDoesAndSaturate) {
  Random random(20253);
  int converted = 0, refused = 0, saturated = 0;
  for (int i = 0; i < kTexts; ++i) {
    const std::string text = RandomText(random, kNumberPieces, 5);
    const bool anyBase = i % 2 == 1;
    int unused = 0;
    const int expectedCount = std::sscanf(text.c_str(), anyBase ? "%i" : "%d", &unused) == 1;
    const long long wide = std::strtoll(text.c_str(), nullptr, anyBase ? 0 : 10);
    const int expected =
        expectedCount ? static_cast<int>(std::clamp<long long>(wide, INT_MIN, INT_MAX)) : -7;
    int actual = -7;
    ASSERT_EQ(ZORUnicodeString(text.c_str()).ConvertToNum(&actual, anyBase ? "%i" : "%d"),
              expectedCount)
        << text;
    ASSERT_EQ(actual, expected) << text;
    ++(expectedCount ? converted : refused);
    saturated += expectedCount && wide != expected;
  }
  EXPECT_GT(converted, kTexts / 10);
  EXPECT_GT(refused, kTexts / 10);
  EXPECT_GT(saturated, kTexts / 100);
}

TEST(ZORUnicodeStringDifferential, NumbersAreWrittenAsTheCLibraryDoes) {
  Random random(20254);
  for (int i = 0; i < kTexts; ++i) {
    const std::uint64_t bits = (std::uint64_t{random()} << 32) | random();
    double number = 0;
    std::memcpy(&number, &bits, sizeof(number));
    if (i % 2) number = static_cast<int>(bits) / 1000.0;
    for (const char* const format : {"%f", "%g", "%le", "%.3f"}) {
      char expected[512];
      std::snprintf(expected, sizeof(expected), format, number);
#ifdef _WIN32
      // Its C library makes the sign up; Unix says what is right.
      if (std::isnan(number)) std::strcpy(expected, std::signbit(number) ? "-nan" : "nan");
#endif
      ZORUnicodeString actual;
      ASSERT_EQ(actual.BuildFromNum(number, format), S_OK);
      ASSERT_STREQ(actual.ConvertToChar(), expected);
    }
    ZORUnicodeString whole;
    whole.BuildFromNum(static_cast<int>(bits));
    ASSERT_EQ(whole.ConvertToChar(), std::to_string(static_cast<int>(bits)));
  }
}

TEST(ZORUnicodeStringDifferential, Utf8IsReadAsIcuDoes) {
  const std::vector<std::string> pieces = {
      "a",    "plain text", "\xC3\xA9", "\xE5\xB9\xB2", "\xF0\x9F\x94\xA7", "\x80",    "\xBF",
      "\xC0", "\xC2",       "\xE0",     "\xE0\xA0",     "\xED\xA0",         "\xED",    "\xF0\x90",
      "\xF4", "\xF4\x90",   "\xF5",     "\xFF",         "\xEF\xBF\xBF",     "\xE1\x80"};
  Random random(20255);
  int valid = 0, invalid = 0;
  for (int i = 0; i < kTexts; ++i) {
    const std::string text = RandomText(random, pieces, i % 2 ? 2 : 12);
    std::vector<UChar> expected(text.size() + 1);
    int32_t count = 0, replaced = 0;
    UErrorCode error = U_ZERO_ERROR;
    u_strFromUTF8WithSub(expected.data(), static_cast<int32_t>(expected.size()), &count,
                         text.data(), static_cast<int32_t>(text.size()), 0xFFFD, &replaced, &error);
    ASSERT_TRUE(U_SUCCESS(error));
    ZORUnicodeString actual;
    actual.BuildFromUTF8(text.data(), text.size());
    ASSERT_EQ(actual.GetLengthInChar(), count) << testing::PrintToString(text);
    ASSERT_TRUE(std::equal(expected.begin(), expected.begin() + count, actual.ConvertToUCChar()))
        << testing::PrintToString(text);
    if (!replaced) {
      ASSERT_EQ(actual.ConvertToChar(), text);
    }
    ++(replaced ? invalid : valid);
  }
  EXPECT_GT(valid, kTexts / 20);
  EXPECT_GT(invalid, kTexts / 20);
}

TEST(ZORUnicodeStringDifferential, Utf8IsWrittenAsIcuDoes) {
  Random random(20256);
  int withLoneSurrogate = 0;
  for (int i = 0; i < kTexts; ++i) {
    std::u16string units(random() % 24, u'a');
    for (char16_t& unit : units) {
      const unsigned kind = random() % 8;
      if (kind == 0) unit = static_cast<char16_t>(0xD800 + random() % 0x800);
      if (kind == 1) unit = static_cast<char16_t>(random() % 0x10000);
      if (kind == 2) unit = static_cast<char16_t>(random() % 0x800);
    }
    char expected[100];
    int32_t count = 0, replaced = 0;
    UErrorCode error = U_ZERO_ERROR;
    u_strToUTF8WithSub(expected, sizeof(expected), &count, units.data(),
                       static_cast<int32_t>(units.size()), 0xFFFD, &replaced, &error);
    ASSERT_TRUE(U_SUCCESS(error));
    ZORUnicodeString text;
    text.BuildFromUTF16(units.data(), units.size());
    char actual[100];
    std::size_t actualCount = 0;
    ASSERT_EQ(text.ConvertToUTF8(actual, &actualCount), S_OK);
    ASSERT_EQ(std::string(actual, actualCount),
              std::string(expected, static_cast<std::size_t>(count)));
    const ZORString narrow = text.ConvertToString();
    ASSERT_EQ(
        std::string(narrow.CastToCharPtr(), static_cast<std::size_t>(narrow.GetLengthInChar())),
        std::string(actual, actualCount));
    withLoneSurrogate += replaced > 0;
  }
  EXPECT_GT(withLoneSurrogate, kTexts / 20);
}
