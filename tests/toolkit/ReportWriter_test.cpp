#include "toolkit/publishing/ReportWriter.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/PlatformFolder.h"

namespace {

using namespace ZORToolkit;
using testing::HasSubstr;
using testing::Not;

constexpr char kThree[] =
    "<ClashElement Version='1.2'><ClashResult Name='r'><Interference Name='a'>"
    "<Product Alias='1'/><Product Alias='2'/><Product Alias='3' Foreign='x'/></Interference>"
    "<Other/><Interference Name='b'/></ClashResult></ClashElement>";

class Reports : public testing::Test {
 protected:
  PublishedResult Published() {
    PublishedResult published;
    ForEachInterference(document_, RecordPart::kAll, [&](const InterferenceRecord& inRecord) {
      PublishedInterference each;
      each.element = inRecord.element;
      each.number = inRecord.index;
      for (std::size_t i = 0; i < 2; ++i) each.products[i].element = inRecord.products[i].element;
      published.interferences.push_back(each);
    });
    return published;
  }
  ClashDocument document_{"test.xml", kThree};
};

TEST_F(Reports, AnnotationsStandAtTheFirstAndTheLastProduct) {
  PublishedResult published = Published();
  published.interferences[0].products[0].colour = "#010203";
  published.interferences[0].products[1].isMissing = true;
  const std::string text = AnnotatedReport(document_, published);
  EXPECT_THAT(text, HasSubstr("<Product Alias=\"1\" page:colour=\"#010203\" />"));
  EXPECT_THAT(text, HasSubstr("<Product Alias=\"2\" />"));
  EXPECT_THAT(text, HasSubstr("<Product Alias=\"3\" page:missing=\"yes\" />"));
}

TEST_F(Reports, AnnotationsOfInterferencesAreEscaped) {
  PublishedResult published = Published();
  published.model = "a<b>.stp";
  published.interferences[0].type = published.interferences[1].type = "\"&\n";
  published.interferences[1].thumbnails = {"t.png"};
  const std::string text = AnnotatedReport(document_, published);
  EXPECT_THAT(text, HasSubstr("page:model=\"a&lt;b&gt;.stp\""));
  EXPECT_THAT(text, HasSubstr("Name=\"a\" page:number=\"1\" page:type=\"&quot;&amp;&#10;\" "));
  EXPECT_THAT(text, HasSubstr("<page:Thumbnail href=\"t.png\" /></Interference>"));
  EXPECT_THAT(text, HasSubstr("<page:Type page:word=\"&quot;&amp;&#10;\" page:count=\"2\" />"));
  ClashDocument reread("annotated.xml", text);
  EXPECT_EQ(2, CountInterferences(reread));
}

TEST_F(Reports, PlainReportHasNoAnnotationAndNothingForeign) {
  const support::TemporaryFolder folder;
  const std::string path = folder.FilePath("report.xml");
  ASSERT_EQ(S_OK, WriteReport(document_, {}, path));
  const std::string text = support::ReadFile(path);
  EXPECT_THAT(text, Not(HasSubstr("page:")));
  EXPECT_THAT(text, Not(HasSubstr("Other")));
  EXPECT_THAT(text, Not(HasSubstr("Foreign")));
}

TEST(HashOfRecord, DiffersWithAnyText) {
  InterferenceRecord record;
  const std::uint64_t empty = HashOf(record);
  record.comment = "a";
  const std::uint64_t withComment = HashOf(record);
  EXPECT_NE(empty, withComment);
  record.comment = "";
  record.picture = "a";
  EXPECT_NE(withComment, HashOf(record));
  record.picture = "";
  record.points.resize(1);
  EXPECT_NE(empty, HashOf(record));
  record.points.clear();
  EXPECT_EQ(empty, HashOf(record));
}

}  // namespace
