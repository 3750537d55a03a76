#include <gtest/gtest.h>

#include <climits>
#include <clocale>
#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <limits>
#include <string>

#include "platform/system/ZORUnicodeString.h"

namespace {

int ToInt(const char* inText, const char* inFormat = "%d", int inStart = -99) {
  ZORUnicodeString(inText).ConvertToNum(&inStart, inFormat);
  return inStart;
}

double ToDouble(const char* inText, const char* inFormat = "%le", double inStart = -99) {
  ZORUnicodeString(inText).ConvertToNum(&inStart, inFormat);
  return inStart;
}

template <class Number>
std::string Built(Number inNumber, const char* inFormat) {
  ZORUnicodeString text("before");
  const HRESULT result = text.BuildFromNum(inNumber, inFormat);
  EXPECT_EQ(SUCCEEDED(result), !(text == "before")) << inFormat;
  return text.ConvertToChar();
}

}  // namespace

TEST(ZORUnicodeString, ConvertToNumReadsInts) {
  EXPECT_EQ(ToInt("0"), 0);
  EXPECT_EQ(ToInt("-15"), -15);
  EXPECT_EQ(ToInt("+7"), 7);
  EXPECT_EQ(ToInt(" \t\n\v\f\r42"), 42);
  EXPECT_EQ(ToInt("007"), 7);
}

TEST(ZORUnicodeString, ConvertToNumStopsAtWhatDoesNotFit) {
  EXPECT_EQ(ToInt("12.9"), 12);
  EXPECT_EQ(ToInt("3abc"), 3);
  EXPECT_EQ(ToDouble("1.5mm"), 1.5);
  EXPECT_EQ(ToDouble("1,5"), 1.0);
  EXPECT_EQ(ToDouble("3\xC3\xA9"), 3.0);
}

TEST(ZORUnicodeString, ConvertToNumWithoutNumberLeavesTheTarget) {
  for (const char* const text : {"", " ", "abc", "-", "+", "--1", "+-1", "- 1", "\u00A01"}) {
    int number = 17;
    double real = 17.5;
    EXPECT_EQ(ZORUnicodeString(text).ConvertToNum(&number), 0) << text;
    EXPECT_EQ(ZORUnicodeString(text).ConvertToNum(&real), 0) << text;
    EXPECT_EQ(number, 17) << text;
    EXPECT_EQ(real, 17.5) << text;
  }
}

TEST(ZORUnicodeString, ConvertToNumSaturatesInts) {
  EXPECT_EQ(ToInt("2147483647"), INT_MAX);
  EXPECT_EQ(ToInt("2147483648"), INT_MAX);
  EXPECT_EQ(ToInt("-2147483648"), INT_MIN);
  EXPECT_EQ(ToInt("-2147483649"), INT_MIN);
  EXPECT_EQ(ToInt("99999999999999999999999999"), INT_MAX);
  EXPECT_EQ(ToInt("-99999999999999999999999999", "%i"), INT_MIN);
}

TEST(ZORUnicodeString, ConvertToNumDetectsTheBaseWithI) {
  EXPECT_EQ(ToInt("0x1F", "%i"), 31);
  EXPECT_EQ(ToInt("010", "%i"), 8);
  EXPECT_EQ(ToInt("10", "%i"), 10);
}

TEST(ZORUnicodeString, ConvertToNumTakesTextAndWidthInFormats) {
  EXPECT_EQ(ToInt("no. 12", "no. %d"), 12);
  EXPECT_EQ(ToInt("123456", "%3d"), 123);
  EXPECT_EQ(ToInt("50%", "%d%%"), 50);
  EXPECT_EQ(ToDouble("x=2.5", "x=%lf"), 2.5);
}

TEST(ZORUnicodeString, ConvertToNumReadsDoubles) {
  EXPECT_EQ(ToDouble("0.1"), 0.1);
  EXPECT_EQ(ToDouble("-1.25e-3"), -0.00125);
  EXPECT_EQ(ToDouble(" +5"), 5.0);
  EXPECT_EQ(ToDouble(".5"), 0.5);
  EXPECT_EQ(ToDouble("5."), 5.0);
  EXPECT_EQ(ToDouble("0x1p3"), 8.0);
  EXPECT_TRUE(std::signbit(ToDouble("-0")));
  EXPECT_EQ(ToDouble("2.5", "%lf"), 2.5);
  EXPECT_EQ(ToDouble("2.5", "%lg"), 2.5);
}

TEST(ZORUnicodeString, ConvertToNumReadsDoublesBeyondTheirRange) {
  EXPECT_EQ(ToDouble("1e999"), HUGE_VAL);
  EXPECT_EQ(ToDouble("-1e999"), -HUGE_VAL);
  EXPECT_EQ(ToDouble("1e-999"), 0.0);
  EXPECT_EQ(ToDouble("inf"), HUGE_VAL);
  EXPECT_TRUE(std::isnan(ToDouble("nan")));
}

TEST(ZORUnicodeString, ConvertToNumReadsLongNumbers) {
  EXPECT_EQ(ToDouble(("0." + std::string(200, '0') + "1e201").c_str()), 1.0);
  EXPECT_EQ(ToDouble((std::string(100, '1') + "e-99").c_str()), 1.1111111111111112);
}

TEST(ZORUnicodeString, ConvertToNumRefusesFormatsOfOtherTypes) {
  for (const char* const format :
       {"%s",   "%n", "%ld", "%hd", "%hhd", "%u",  "%x", "%c",     "%*d",     "%d%d",
        "%d%n", "12", "",    "%",   "%%",   "%le", "%p", "%[0-9]", "%99999d", "%md"}) {
    int number = 17;
    EXPECT_EQ(ZORUnicodeString("12").ConvertToNum(&number, format), 0) << format;
    EXPECT_EQ(number, 17) << format;
  }
  for (const char* const format : {"%e", "%f", "%Lf", "%d", "%s", "%*le", "%le%le", "%lle"}) {
    double number = 17.5;
    EXPECT_EQ(ZORUnicodeString("12").ConvertToNum(&number, format), 0) << format;
    EXPECT_EQ(number, 17.5) << format;
  }
}

TEST(ZORUnicodeString, ConvertToNumRefusesNull) {
  int number = 17;
  EXPECT_EQ(ZORUnicodeString("12").ConvertToNum(static_cast<int*>(nullptr)), 0);
  EXPECT_EQ(ZORUnicodeString("12").ConvertToNum(static_cast<double*>(nullptr)), 0);
  EXPECT_EQ(ZORUnicodeString("12").ConvertToNum(&number, nullptr), 0);
  EXPECT_EQ(number, 17);
}

TEST(ZORUnicodeString, BuildFromNumWritesInts) {
  EXPECT_EQ(Built(0, "%d"), "0");
  EXPECT_EQ(Built(-15, "%d"), "-15");
  EXPECT_EQ(Built(-7, "%i"), "-7");
  EXPECT_EQ(Built(INT_MIN, "%d"), "-2147483648");
  EXPECT_EQ(Built(INT_MAX, "%i"), "2147483647");
  EXPECT_EQ(Built(5, "%03d"), "005");
  EXPECT_EQ(Built(5, "n\xC2\xB0 %d %%"), "n\xC2\xB0 5 %");
}

TEST(ZORUnicodeString, BuildFromNumWritesDoubles) {
  EXPECT_EQ(Built(0.0, "%f"), "0.000000");
  EXPECT_EQ(Built(2.5, "%f"), "2.500000");
  EXPECT_EQ(Built(-0.0001, "%f"), "-0.000100");
  EXPECT_EQ(Built(1e20, "%f"), "100000000000000000000.000000");
  EXPECT_EQ(Built(0.1, "%g"), "0.1");
  EXPECT_EQ(Built(1234.5, "%le"), "1.234500e+03");
  EXPECT_EQ(Built(1.0 / 3, "%.3lf"), "0.333");
}

TEST(ZORUnicodeString, BuildFromNumWritesTheSignOfNoNumber) {
  const double nan = std::numeric_limits<double>::quiet_NaN(), negative = std::copysign(nan, -1);
  for (const char* const format : {"%f", "%g", "%le", "%.3f"}) {
    EXPECT_EQ(Built(nan, format), "nan");
    EXPECT_EQ(Built(negative, format), "-nan");
  }
  EXPECT_EQ(Built(nan, "inf %+8G%%"), "inf     +NAN%");
  EXPECT_EQ(Built(negative, "%%<%-8.2E>"), "%<-NAN    >");
}

TEST(ZORUnicodeString, BuildFromNumWritesTheLongestNumbers) {
  EXPECT_EQ(Built(-std::numeric_limits<double>::max(), "%f").size(), 317u);
  EXPECT_EQ(Built(1.0, "%.2000f"), "1." + std::string(2000, '0'));
}

TEST(ZORUnicodeString, BuildFromNumRefusesOtherFormats) {
  for (const char* const format :
       {"%s", "%n", "%ld", "%*d", "%d%d", "12", "", "%", "%%", "%f", "%99999d", "%.99999d", "%"}) {
    ZORUnicodeString text("before");
    EXPECT_EQ(text.BuildFromNum(1, format), E_INVALIDARG) << format;
    EXPECT_TRUE(text == "before") << format;
  }
  for (const char* const format : {"%d", "%s", "%Lf", "%n", "%f%f", "%*f", "%.*f"}) {
    ZORUnicodeString text("before");
    EXPECT_EQ(text.BuildFromNum(1.0, format), E_INVALIDARG) << format;
    EXPECT_TRUE(text == "before") << format;
  }
  ZORUnicodeString text("before");
  EXPECT_EQ(text.BuildFromNum(1, nullptr), E_INVALIDARG);
  EXPECT_EQ(text.BuildFromNum(1.0, nullptr), E_INVALIDARG);
  EXPECT_TRUE(text == "before");
}

#ifdef _WIN32
// Chooses a locale with a decimal comma for the process.
class CommaLocale : public testing::Test {
 protected:
  void SetUp() override {
    if (!std::setlocale(LC_ALL, "German"))
      GTEST_SKIP() << "there is no locale with a decimal comma";
  }
  void TearDown() override { std::setlocale(LC_ALL, "C"); }
};
#else
// Chooses a locale with a decimal comma for the process, made from the C library's own sources.
class CommaLocale : public testing::Test {
 protected:
  void SetUp() override {
    std::string pattern = testing::TempDir() + "zor_locale_XXXXXX";
    ASSERT_NE(mkdtemp(pattern.data()), nullptr);
    folder_ = pattern;
    const std::string make =
        "localedef -i de_DE -f UTF-8 " + (folder_ / "de_DE.UTF-8").string() + " >/dev/null 2>&1";
    const bool isMade = std::system(make.c_str()) >= 0;
    setenv("LOCPATH", folder_.c_str(), 1);
    if (!isMade || !std::setlocale(LC_ALL, "de_DE.UTF-8"))
      GTEST_SKIP() << "no locale with a decimal comma can be had here";
  }
  void TearDown() override {
    std::setlocale(LC_ALL, "C");
    unsetenv("LOCPATH");
    std::filesystem::remove_all(folder_);
  }

 private:
  std::filesystem::path folder_;
};
#endif

TEST_F(CommaLocale, NumbersKeepTheirPoint) {
  ASSERT_DOUBLE_EQ(std::strtod("1,5", nullptr), 1.5) << "the locale does not do what it is for";
  EXPECT_EQ(ToDouble("1.5"), 1.5);
  EXPECT_EQ(ToDouble("1,5"), 1.0);
  EXPECT_EQ(ToDouble("0x1.8p0"), 1.5);
  EXPECT_EQ(ToDouble("1.5", "%4le"), 1.5);
  EXPECT_EQ(Built(1.5, "%f"), "1.500000");
  EXPECT_EQ(Built(1.5, "%g"), "1.5");
  EXPECT_EQ(Built(1234567.0, "%.1f"), "1234567.0");
  EXPECT_DOUBLE_EQ(std::strtod("1,5", nullptr), 1.5) << "the process's locale has changed";
}
