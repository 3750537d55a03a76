#include "BuildPath.h"

#include <gtest/gtest.h>

#include <climits>
#include <map>
#include <random>
#include <string>

#include "platform/system/ZORUnicodeChar.h"

namespace {
using Converter = void (*)(ZORUnicodeString&, ZORUnicodeString&);

std::string Text(const ZORUnicodeString& inText) { return inText.ConvertToChar(); }

std::u16string Units(const ZORUnicodeString& inText) {
  const ZORUC2Bytes* const units = inText.ConvertToUCChar();
  return units == nullptr
             ? std::u16string()
             : std::u16string(units, static_cast<std::size_t>(inText.GetLengthInChar()));
}

ZORUnicodeString FromUnits(const std::u16string& inUnits) {
  ZORUnicodeString text;
  text.BuildFromUTF16(inUnits.data(), inUnits.size());
  return text;
}

/// What a converter appends to an output that already holds inBefore.
std::string Converted(Converter inConverter, const char* inText, const char* inBefore = "") {
  ZORUnicodeString input(inText);
  ZORUnicodeString output(inBefore);
  inConverter(input, output);
  return Text(output);
}

/// The same, unit by unit, from a list of replacements.
std::u16string ConvertedUnitByUnit(const std::map<char16_t, std::u16string>& inReplacements,
                                   const std::u16string& inUnits) {
  std::u16string converted;
  for (char16_t unit : inUnits) {
    const auto found = inReplacements.find(unit);
    converted += found == inReplacements.end() ? std::u16string(1, unit) : found->second;
  }
  return converted;
}

const Converter kAllConverters[] = {&BuildPath::CheckXMLString, &BuildPath::CheckXMLString2,
                                    &BuildPath::DeleteSpecialCharacterOfFilename,
                                    &BuildPath::DeleteSpecialCharacterOfFilename2};
const char kAllSpecials[] = " \"&*/:<>?\\|";
}  // namespace

TEST(BuildPath, CheckXMLStringReplacesItsFourCharactersOnly) {
  EXPECT_EQ(Converted(&BuildPath::CheckXMLString, kAllSpecials), " &quot;&amp;*/:&lt;&gt;?\\|");
}

TEST(BuildPath, CheckXMLString2ReplacesItsFiveCharactersOnly) {
  EXPECT_EQ(Converted(&BuildPath::CheckXMLString2, kAllSpecials), "_&quot;&amp;*/:&lt;&gt;?\\|");
}

TEST(BuildPath, DeleteSpecialCharacterWritesCodesWithoutNumberSignAndSemicolon) {
  EXPECT_EQ(Converted(&BuildPath::DeleteSpecialCharacterOfFilename, kAllSpecials),
            "_&34&&42&47&58&60&62&63&92&124");
}

TEST(BuildPath, DeleteSpecialCharacter2WritesCharacterReferences) {
  EXPECT_EQ(Converted(&BuildPath::DeleteSpecialCharacterOfFilename2, kAllSpecials),
            " &#34;&&#42;&#47;&#58;&#60;&#62;&#63;&#92;&#124;");
}

TEST(BuildPath, ConvertersLeaveTheOutputForAnEmptyInput) {
  for (Converter converter : kAllConverters) {
    EXPECT_EQ(Converted(converter, "", "before"), "before");
    EXPECT_EQ(Converted(converter, ""), "");
  }
}

TEST(BuildPath, ConvertersAppendBehindTheOutputsText) {
  for (Converter converter : kAllConverters)
    EXPECT_EQ(Converted(converter, "abc", "before & <"), "before & <abc");
}

TEST(BuildPath, ConvertersLeaveTheInput) {
  for (Converter converter : kAllConverters) {
    ZORUnicodeString input("a <\"&|> b");
    ZORUnicodeString output;
    converter(input, output);
    EXPECT_EQ(Text(input), "a <\"&|> b");
  }
}

TEST(BuildPath, ConvertersKeepApostropheTabsLineFeedsAndControlCharacters) {
  const std::u16string kept = u"it's\ta\nb\rc\x01\x1F\x7F";
  for (Converter converter : kAllConverters) {
    ZORUnicodeString input = FromUnits(kept);
    ZORUnicodeString output;
    converter(input, output);
    EXPECT_EQ(Units(output), kept);
  }
}

TEST(BuildPath, ConvertersKeepSurrogateHalvesAndWideCharacters) {
  const std::u16string kept = {0xD800, u'x',   0xDC00, 0xD83D, 0xDE00,
                               0x2022, 0x263C, 0xFFFF, 0x013C};
  for (Converter converter : kAllConverters) {
    ZORUnicodeString input = FromUnits(kept);
    ZORUnicodeString output;
    converter(input, output);
    EXPECT_EQ(Units(output), kept);
  }
}

TEST(BuildPath, ConvertersKeepZeroUnits) {
  const std::u16string input(u"a\0<b", 4);
  ZORUnicodeString text = FromUnits(input);
  ZORUnicodeString output;
  BuildPath::CheckXMLString(text, output);
  EXPECT_EQ(Units(output), std::u16string(u"a\0&lt;b", 7));
}

TEST(BuildPath, CheckXMLStringEscapesEscapedTextAgain) {
  EXPECT_EQ(Converted(&BuildPath::CheckXMLString, "a &amp; b"), "a &amp;amp; b");
}

TEST(BuildPath, CheckXMLString2TurnsSpacesAndLessThanInOnePass) {
  EXPECT_EQ(Converted(&BuildPath::CheckXMLString2, "gear <left"), "gear_&lt;left");
  EXPECT_EQ(Converted(&BuildPath::CheckXMLString, "gear <left"), "gear &lt;left");
}

TEST(BuildPath, DeleteSpecialCharacterOnSpaceSolidusAndColon) {
  EXPECT_EQ(Converted(&BuildPath::DeleteSpecialCharacterOfFilename, "a b/c:d"), "a_b&47c&58d");
  EXPECT_EQ(Converted(&BuildPath::DeleteSpecialCharacterOfFilename2, "a b/c:d"), "a b&#47;c&#58;d");
}

TEST(BuildPath, DeleteSpecialCharacterOnAVerticalLine) {
  EXPECT_EQ(Converted(&BuildPath::DeleteSpecialCharacterOfFilename, "|"), "&124");
  EXPECT_EQ(Converted(&BuildPath::DeleteSpecialCharacterOfFilename2, "|"), "&#124;");
}

TEST(BuildPath, DeleteSpecialCharacterCannotBeReversed) {
  EXPECT_EQ(Converted(&BuildPath::DeleteSpecialCharacterOfFilename, "&92"),
            Converted(&BuildPath::DeleteSpecialCharacterOfFilename, "\\"));
}

TEST(BuildPath, ConvertersAppendToTheirOwnInput) {
  for (Converter converter : kAllConverters) {
    ZORUnicodeString text("<");
    const std::string converted = Converted(converter, "<");
    converter(text, text);
    EXPECT_EQ(Text(text), "<" + converted);
  }
}

// Every place of one special character relative to the blocks that the converters pass over.
TEST(BuildPath, ConvertersFindASpecialCharacterAnywhere) {
  for (std::size_t length : {1u, 63u, 64u, 65u, 128u, 200u}) {
    for (std::size_t place = 0; place < length; ++place) {
      std::u16string units(length, u'x');
      units[place] = u'>';
      ZORUnicodeString input = FromUnits(units);
      ZORUnicodeString output;
      BuildPath::CheckXMLString(input, output);
      ASSERT_EQ(Units(output), units.replace(place, 1, u"&gt;")) << length << ' ' << place;
    }
  }
}

// Long text is copied in runs; nothing may be lost or doubled where two runs meet.
TEST(BuildPath, ConvertersKeepLongTextsWhole) {
  for (std::size_t place : {0u, 8190u, 8191u, 8192u, 8193u, 16383u, 16384u, 20000u}) {
    std::u16string units;
    for (char16_t i = 0; i <= 20000; ++i) units += static_cast<char16_t>(0x100 + i);
    units[place] = u'<';
    ZORUnicodeString input = FromUnits(units);
    ZORUnicodeString output;
    BuildPath::CheckXMLString(input, output);
    ASSERT_TRUE(Units(output) == units.replace(place, 1, u"&lt;")) << place;
  }
}

TEST(BuildPath, ConvertersAgreeWithAUnitByUnitConversionOfRandomTexts) {
  const std::map<char16_t, std::u16string> columns[] = {
      {{u'"', u"&quot;"}, {u'&', u"&amp;"}, {u'<', u"&lt;"}, {u'>', u"&gt;"}},
      {{u' ', u"_"}, {u'"', u"&quot;"}, {u'&', u"&amp;"}, {u'<', u"&lt;"}, {u'>', u"&gt;"}},
      {{u' ', u"_"},
       {u'"', u"&34"},
       {u'*', u"&42"},
       {u'/', u"&47"},
       {u':', u"&58"},
       {u'<', u"&60"},
       {u'>', u"&62"},
       {u'?', u"&63"},
       {u'\\', u"&92"},
       {u'|', u"&124"}},
      {{u'"', u"&#34;"},
       {u'*', u"&#42;"},
       {u'/', u"&#47;"},
       {u':', u"&#58;"},
       {u'<', u"&#60;"},
       {u'>', u"&#62;"},
       {u'?', u"&#63;"},
       {u'\\', u"&#92;"},
       {u'|', u"&#124;"}}};
  std::mt19937 random(20251231);
  int changed = 0;
  for (int run = 0; run < 4000; ++run) {
    std::u16string units(random() % 300, u'\0');
    const unsigned density = 1u << (random() % 12);  // from all ASCII to nearly none
    for (char16_t& unit : units)
      unit = static_cast<char16_t>(random() % density == 0 ? random() % 0x80
                                                           : 0x61 + random() % 0xF000);
    const std::size_t which = random() % 4;
    ZORUnicodeString input = FromUnits(units);
    ZORUnicodeString output("before");
    kAllConverters[which](input, output);
    const std::u16string expected = ConvertedUnitByUnit(columns[which], units);
    ASSERT_EQ(Units(output), u"before" + expected) << "run " << run;
    changed += expected != units;
  }
  EXPECT_GT(changed, 1000);
  EXPECT_LT(changed, 3900);
}

TEST(BuildPath, ConvToStrWritesDecimal) {
  EXPECT_EQ(Text(BuildPath::ConvToStr(0)), "0");
  EXPECT_EQ(Text(BuildPath::ConvToStr(-15)), "-15");
  EXPECT_EQ(Text(BuildPath::ConvToStr(1234567)), "1234567");
}

TEST(BuildPath, ConvToStrAtTheEndsOfTheRange) {
  EXPECT_EQ(Text(BuildPath::ConvToStr(INT_MAX)), "2147483647");
  EXPECT_EQ(Text(BuildPath::ConvToStr(INT_MIN)), "-2147483648");
}

TEST(BuildPath, AppendSlashIsOneBackslash) {
  EXPECT_EQ(Units(BuildPath::AppendSlash()), u"\\");
  EXPECT_STREQ(BuildPath::AppendSlash2().CastToCharPtr(), "\\");
  EXPECT_EQ(BuildPath::AppendSlash2().GetLengthInChar(), 1);
}

TEST(BuildPath, AssignmentGivesTheObjectItself) {
  BuildPath one;
  const BuildPath other;
  EXPECT_EQ(&(one = other), &one);
}
