// The classes of characters beside the XML library's.
#include "default_platform/xml/XMLChars.h"

#include <gtest/gtest.h>

#include <string>
#include <xercesc/util/XMLChar.hpp>

using xercesc::XMLChar1_0;

TEST(XMLChars, EveryUnitIsClassifiedAsByTheLibrary) {
  for (unsigned int unit = 0; unit < 0x10000; ++unit) {
    const auto wide = static_cast<char16_t>(unit);
    ASSERT_EQ(IsNameStart(wide), XMLChar1_0::isFirstNameChar(wide)) << unit;
    ASSERT_EQ(IsNameCharacter(wide), XMLChar1_0::isNameChar(wide)) << unit;
    ASSERT_EQ(IsXMLCharacter(wide), XMLChar1_0::isXMLChar(wide)) << unit;
  }
}

TEST(XMLChars, CharactersBeyondTheFirstPlaneAreXML) {
  EXPECT_TRUE(IsXMLCharacter(0x10000));
  EXPECT_TRUE(IsXMLCharacter(0x10FFFF));
  EXPECT_FALSE(IsXMLCharacter(0x110000));
}

TEST(XMLChars, NamesAreThoseOfTheLibrary) {
  for (const std::u16string& name :
       {std::u16string(), std::u16string(u"a"), std::u16string(u"-a"), std::u16string(u"a-.9:_"),
        std::u16string(u"\u00E9t\u00E9"), std::u16string(u"a b"), std::u16string(u"\U00010400"),
        std::u16string(u"a\U00010400"), std::u16string(u"\u0301a"), std::u16string(u"a\u0301")})
    EXPECT_EQ(IsXMLName(name), !name.empty() && XMLChar1_0::isValidName(name.data(), name.size()));
}

TEST(XMLChars, XmlIsAReservedTargetInAnyCase) {
  EXPECT_TRUE(IsReservedTarget(u"xml"));
  EXPECT_TRUE(IsReservedTarget(u"xMl"));
  EXPECT_FALSE(IsReservedTarget(u"xml-stylesheet"));
  EXPECT_FALSE(IsReservedTarget(u"xm"));
}

TEST(XMLChars, DeclarationsOfUtf8EndWhereTheyEnd) {
  const auto rest = [](const char* inText) {
    const char* const end = EndOfUtf8Declaration(inText);
    return std::string(end == nullptr ? "refused" : end);
  };
  EXPECT_EQ(rest("<a/>"), "<a/>");
  EXPECT_EQ(rest(""), "");
  EXPECT_EQ(rest("<?xml-stylesheet?>"), "<?xml-stylesheet?>");
  EXPECT_EQ(rest("<?xml version='1.0'?><a/>"), "<a/>");
  EXPECT_EQ(rest("<?xml\tversion = \"1.0\" encoding='Utf-8' standalone='no' ?>b"), "b");
  for (const char* const other :
       {"<?xml version='1.1'?>", "<?xml version='1.0' encoding='latin1'?>",
        "<?xml encoding='utf-8'?>", "<?xml version='1.0' standalone='maybe'?>",
        "<?xml version='1.0'", "<?xml version='1.0?>", "<?xml version='1.0'encoding='utf-8'?>",
        "<?xml "})
    EXPECT_EQ(rest(other), "refused") << other;
}
