#include "platform/xml/DOMString.h"

#include <gtest/gtest.h>

#include <string>
#include <thread>
#include <utility>
#include <vector>

#include "platform/xml/ZORXMLParser.h"
#include "support/XMLText.h"

TEST(DOMString, NullStringAnswersAll) {
  const DOMString text;
  EXPECT_TRUE(text.isNull());
  EXPECT_EQ(text.length(), 0u);
  EXPECT_EQ(text.rawBuffer(), nullptr);
  EXPECT_TRUE(text.equals(DOMString()));
  EXPECT_TRUE(text.equals(""));
  EXPECT_FALSE(text.equals("a"));
  EXPECT_EQ(text.DOMStringToZORUnicodeString().GetLengthInChar(), 0);
}

TEST(DOMString, NullPointersGiveTheNullString) {
  EXPECT_TRUE(DOMString(static_cast<const char*>(nullptr)).isNull());
  EXPECT_TRUE(DOMString(static_cast<const ZORUC2Bytes*>(nullptr), 0).isNull());
}

TEST(DOMString, EmptyTextIsNotNullAndEqualsNull) {
  const DOMString text("");
  EXPECT_FALSE(text.isNull());
  EXPECT_EQ(text.length(), 0u);
  EXPECT_EQ(text.rawBuffer(), nullptr);
  EXPECT_TRUE(text.equals(DOMString()));
}

TEST(DOMString, NarrowTextBecomesUnits) {
  const DOMString text("a\xC3\xA9\xF0\x9F\x98\x80");  // a, U+00E9, U+1F600
  ASSERT_EQ(text.length(), 4u);
  EXPECT_EQ(std::u16string(text.rawBuffer(), 4), u"a\u00E9\U0001F600");
}

TEST(DOMString, UnitsAreKeptAsTheyAre) {
  const ZORUC2Bytes units[] = {0xD800, 0, u'x'};
  const DOMString text(units, 3);
  ASSERT_EQ(text.length(), 3u);
  EXPECT_EQ(text.rawBuffer()[0], 0xD800);
  EXPECT_EQ(text.rawBuffer()[1], 0);
  EXPECT_EQ(text.DOMStringToZORUnicodeString().GetLengthInChar(), 3);
}

TEST(DOMString, EqualsComparesWholeTexts) {
  EXPECT_TRUE(DOMString("abc").equals(DOMString("abc")));
  EXPECT_FALSE(DOMString("abc").equals(DOMString("abd")));
  EXPECT_FALSE(DOMString("abc").equals("ab"));
  EXPECT_FALSE(DOMString("ab").equals("abc"));
  EXPECT_TRUE(DOMString("abc").equals("abc"));
}

TEST(DOMString, CopiesShareAndAssignmentReplaces) {
  DOMString a("text");
  const DOMString b(a);
  EXPECT_EQ(a.rawBuffer(), b.rawBuffer());
  a = DOMString("other");
  EXPECT_TRUE(a.equals("other"));
  EXPECT_TRUE(b.equals("text"));
  const DOMString c(std::move(a));
  EXPECT_TRUE(c.equals("other"));
}

TEST(DOMString, KeepsItsDocumentAlive) {
  DOMString value;
  {
    value =
        support::RootOf("<a>some longer text of the document</a>").getFirstChild().getNodeValue();
  }
  EXPECT_TRUE(value.equals("some longer text of the document"));
}

TEST(DOMString, SerialisedTextIsUtf8AndWidenedOnceWhereThreadsAskForIt) {
  DOMString text;
  ASSERT_EQ(
      ZORXMLParser::WriteXML(support::RootOf("<a b='\u00E9'>\u65E5\U0001F600</a>"), "UTF-8", text),
      S_OK);
  std::size_t count = 0;
  const char* const bytes = text.rawUTF8(count);
  ASSERT_NE(bytes, nullptr);
  EXPECT_EQ(std::string(bytes, count), "<a b=\"\u00E9\">\u65E5\U0001F600</a>");
  EXPECT_EQ(text.length(), count - 1 - 2 - 2);
  std::vector<std::thread> threads;
  for (int i = 0; i < 2; ++i)
    threads.emplace_back([text] {
      EXPECT_EQ(std::u16string(text.rawBuffer(), text.length()),
                u"<a b=\"\u00E9\">\u65E5\U0001F600</a>");
    });
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(DOMString(text).rawBuffer(), text.rawBuffer());
  EXPECT_TRUE(text.equals(DOMString("<a b=\"\u00E9\">\u65E5\U0001F600</a>")));
}

TEST(DOMString, OtherTextIsNotKeptAsUtf8) {
  std::size_t count = 7;
  EXPECT_EQ(DOMString().rawUTF8(count), nullptr);
  EXPECT_EQ(DOMString("text").rawUTF8(count), nullptr);
  EXPECT_EQ(support::RootOf("<a>text</a>").getFirstChild().getNodeValue().rawUTF8(count), nullptr);
  EXPECT_EQ(count, 7u);
}

TEST(DOMString, ConstantsMayBeCopiedByThreads) {
  const DOMString constant("constant");
  std::vector<std::thread> threads;
  for (int i = 0; i < 4; ++i)
    threads.emplace_back([&constant] {
      for (int j = 0; j < 20000; ++j) {
        // NOLINTNEXTLINE(performance-unnecessary-copy-initialization): what is tested
        const DOMString copy(constant);
        ASSERT_EQ(copy.length(), 8u);
      }
    });
  for (std::thread& thread : threads) thread.join();
  EXPECT_TRUE(constant.equals("constant"));
}

TEST(DOMString, UnitsOfADocumentsTextOutliveTheCopyThatWasAsked) {
  const DOM_Document document = support::ParseText("<a k='v\xC3\xA9'/>");
  const DOMString value = document.getDocumentElement().getAttribute("k");
  const ZORUC2Bytes* units = nullptr;
  {
    // NOLINTNEXTLINE(performance-unnecessary-copy-initialization): what is tested
    const DOMString copy = value;
    units = copy.rawBuffer();
  }
  EXPECT_EQ(units, value.rawBuffer());
  EXPECT_EQ(std::u16string_view(units, value.length()), u"v\u00E9");
}
