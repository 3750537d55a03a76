// Which documents the fast path reads; that it reads them right is what the comparison with the XML
// library's own tree shows.
#include "default_platform/xml/Utf8FastPath.h"

#include <gtest/gtest.h>

#include <string>

#include "FastPathReader.h"
#include "XMLCorpus.h"

namespace {

std::string Repeated(const std::string& inText, int inCount) {
  std::string text;
  for (int i = 0; i < inCount; ++i) text += inText;
  return text;
}

}  // namespace

TEST(Utf8FastPath, ReadsPlainDocuments) {
  for (const char* const text :
       {"<a/>", "\xEF\xBB\xBF<a/>", "<?xml version='1.0'?><a/>",
        "<?xml version=\"1.0\" encoding=\"utf-8\" standalone=\"yes\" ?>\r\n<a></a >\n",
        "<!-- c --><?p d?><a b = 'c'\n\td=\"&lt;&#233;&#x1F600;\"/><!--d--> ",
        "<a>t &amp; u]]<![CDATA[<]]]>]]&gt;<b/>\xC3\xA9\xF0\x9F\x98\x80\r</a>",
        "<\xC3\xA9l\xC3\xA9ment \xE9\x83\xA8='\xE9\x83\xA8'/>"})
    EXPECT_TRUE(IsReadByFastPath(text)) << text;
}

TEST(Utf8FastPath, LeavesEverythingElseToTheFullScanner) {
  for (const char* const text : {"",
                                 " ",
                                 "a",
                                 "<a>",
                                 "</a>",
                                 "<a/><b/>",
                                 "<a></b>",
                                 "<a b='1' b='2'/>",
                                 "<a b='1'c='2'/>",
                                 "<a b=1/>",
                                 "<a b/>",
                                 "<a b='<'/>",
                                 "<a>]]></a>",
                                 "<a>&b;</a>",
                                 "<a>&#0;</a>",
                                 "<a>&#;</a>",
                                 "<a>&#x110000;</a>",
                                 "<a>&#xD800;</a>",
                                 "<a>&amp</a>",
                                 "<a>\x01</a>",
                                 "<a>\xC3</a>",
                                 "<a>\xC0\x80</a>",
                                 "<a>\xED\xA0\x80</a>",
                                 "<a>\xEF\xBF\xBE</a>",
                                 "<a>\xF5\x80\x80\x80</a>",
                                 "<a>\xF4\x90\x80\x80</a>",
                                 "<a><!-- -- --></a>",
                                 "<a><!-- ---></a>",
                                 "<a><?xml d?></a>",
                                 "<a><?XML d?></a>",
                                 "<a><?p",
                                 "<a><![CDATA[",
                                 "<!DOCTYPE a><a/>",
                                 "<![CDATA[]]><a/>",
                                 "<?xml version='1.1'?><a/>",
                                 "<?xml version='1.0' encoding='latin1'?><a/>",
                                 "<?xml encoding='utf-8'?><a/>",
                                 " <?xml version='1.0'?><a/>",
                                 "<a/>t",
                                 "t<a/>",
                                 "<-a/>",
                                 "<1/>",
                                 "< a/>",
                                 "<a /b>",
                                 "<a/ >",
                                 "<a b='1'",
                                 "<\xC3\x97/>",
                                 "\xFF\xFE<"})
    EXPECT_FALSE(IsReadByFastPath(text)) << text;
}

// Wherever the bytes read so far may end.
TEST(Utf8FastPath, ReadsPiecesOfEverySize) {
  std::string text = "<?xml version='1.0'?><!--c--><root>";
  for (int i = 0; i < 3000; ++i)
    text += "\n <element number='" + std::to_string(i) +
            "' t='&amp;\xC3\xA9'>text &lt;\r\n<![CDATA[x]]y]]><?p d?><!-- c --></element>";
  text += "</root><!--e-->\n";
  for (const std::size_t piece : {1, 2, 3, 7, 15, 16, 17, 63, 1000, 16'383, 16'384, 262'143})
    EXPECT_TRUE(IsReadByFastPath(text, piece)) << piece;
}

TEST(Utf8FastPath, ReadsConstructsLargerThanItsWindow) {
  const std::string large(3'000'000, 'x');
  EXPECT_TRUE(IsReadByFastPath("<a b='" + large + "'>" + large + "<!--" + large + "--><?p " +
                               large + "?><![CDATA[" + large + "]]></a>"));
  EXPECT_TRUE(IsReadByFastPath("<" + large + "></" + large + ">"));
}

TEST(Utf8FastPath, ReadsManyAttributesInLinearTime) {
  std::string text = "<a";
  for (int i = 0; i < 200'000; ++i) text += " n" + std::to_string(i) + "='v'";
  EXPECT_TRUE(IsReadByFastPath(text + "/>"));
  EXPECT_FALSE(IsReadByFastPath(text + " n77='again'/>"));
}

TEST(Utf8FastPath, LeavesDepthBeyondItsLimitToTheFullScanner) {
  EXPECT_TRUE(IsReadByFastPath(Repeated("<a>", 1'000'000) + Repeated("</a>", 1'000'000)));
  EXPECT_FALSE(IsReadByFastPath(Repeated("<a>", 1'000'001) + Repeated("</a>", 1'000'001)));
}

// Without this, a comparison of trees would also hold where nothing is ever read here.
TEST(Utf8FastPath, ReadsMostOfTheCorpus) {
  int count = 0;
  int read = 0;
  const auto take = [&](const auto& inTexts) {
    for (const std::string_view text : inTexts) {
      ++count;
      read += IsReadByFastPath(text);
    }
  };
  take(corpus::kElements);
  take(corpus::kAttributes);
  take(corpus::kTexts);
  take(corpus::kSections);
  take(corpus::kComments);
  take(corpus::kInstructions);
  EXPECT_GT(read, count * 95 / 100) << "of " << count;
}

TEST(Utf8FastPath, ReadsNothingOfWhatIsBroken) {
  const auto take = [&](const auto& inTexts) {
    for (const std::string_view text : inTexts) EXPECT_FALSE(IsReadByFastPath(text)) << text;
  };
  take(corpus::kBrokenTags);
  take(corpus::kBrokenTexts);
  take(corpus::kBrokenMarkup);
  take(corpus::kBrokenDoctypes);
  take(corpus::kBrokenBytes);
}
