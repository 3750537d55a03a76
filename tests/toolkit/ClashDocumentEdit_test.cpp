#include "toolkit/records/ClashDocumentEdit.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

#include "support/PlatformFolder.h"
#include "support/ScopedVariable.h"

namespace {

using namespace ZORToolkit;
using testing::HasSubstr;
using testing::Not;

constexpr char kTwo[] =
    "<ClashElement Version='1.2'><ClashResult Name='r' NbInterf='9'>"
    "<Interference Name='a' Status='Relevant'><Product Alias='p' Preview='old.jpg'/>"
    "<Product Alias='q'/><Comment Value='first'/><Comment Value='second'/>"
    "<Picture HRef='1'/><Picture HRef='2'/></Interference>"
    "<Interference Name='b'/></ClashResult></ClashElement>";

class ClashDocumentEdits : public testing::Test {
 protected:
  InterferenceRecord Record(long long inNumber = 1) {
    return ReadInterference(document_, inNumber);
  }
  std::string Dumped(const Prologue& inPrologue = {}) {
    const std::string path = folder_.FilePath("out.xml");
    EXPECT_EQ(S_OK, edit_.Dump(inPrologue, path));
    return support::ReadFile(path);
  }

  support::TemporaryFolder folder_;
  ClashDocument document_{"test.xml", kTwo};
  ClashDocumentEdit edit_{document_};
};

TEST_F(ClashDocumentEdits, StatusReadsBackInEveryLanguage) {
  for (const char* const language : {"en", "fr", "ja"}) {
    const support::ScopedVariable variable("ZOR_LANG", language);
    for (const char* const status : {"Irrelevant", "Not inspected", "Relevant"}) {
      edit_.SetStatus(Record().element, status);
      EXPECT_EQ(status, Record().status) << language;
    }
  }
  EXPECT_NE("Relevant", Record().statusAsWritten);  // the last language's word
}

TEST_F(ClashDocumentEdits, StatusThatIsNoneIsWrittenAsItStands) {
  edit_.SetStatus(Record().element, "later");
  EXPECT_EQ("later", Record().statusAsWritten);
  EXPECT_EQ("error", Record().status);
}

TEST_F(ClashDocumentEdits, RetrieveReadsBack) {
  edit_.SetRetrieve(Record().element, "New");
  EXPECT_EQ("New", Record().retrieve);
}

TEST_F(ClashDocumentEdits, CommentTakesThePlaceOfAll) {
  edit_.SetComment(Record().element, "日本 <&>");
  EXPECT_EQ("日本 <&>", Record().comment);
  EXPECT_THAT(Dumped(), Not(HasSubstr("first")));
  edit_.SetComment(Record().element, "");
  EXPECT_THAT(Dumped(), Not(HasSubstr("<Comment")));
}

TEST_F(ClashDocumentEdits, PictureTakesThePlaceOfAll) {
  edit_.SetPicture(Record().element, "pictures/1.jpg");
  EXPECT_EQ("pictures/1.jpg", Record().picture);
  EXPECT_THAT(Dumped(), Not(HasSubstr("HRef=\"2\"")));
}

TEST_F(ClashDocumentEdits, PreviewIsSetAndTakenOut) {
  edit_.SetPreview(Record().products[1].element, "q.jpg");
  EXPECT_EQ("q.jpg", Record().products[1].preview);
  edit_.SetPreview(Record().products[0].element, "");
  EXPECT_THAT(Dumped(), Not(HasSubstr("old.jpg")));
}

TEST_F(ClashDocumentEdits, PreviewsOfAllProductsAreTakenOut) {
  ClashDocument document("three.xml",
                         "<InterferenceElement><Interference><Product Preview='1'/>"
                         "<Product Preview='2'/><Product Preview='3'/></Interference>"
                         "</InterferenceElement>");
  ClashDocumentEdit edit(document);
  edit.RemovePreviews(ReadInterference(document, 1).element);
  const std::string path = folder_.FilePath("three.xml");
  ASSERT_EQ(S_OK, edit.Dump({}, path));
  EXPECT_THAT(support::ReadFile(path), Not(HasSubstr("Preview")));
}

TEST_F(ClashDocumentEdits, RemovedInterferenceIsGoneAndCountedOut) {
  edit_.Remove(Record(1).element);
  edit_.RecountInterferences();
  EXPECT_EQ("b", Record(1).name);
  EXPECT_EQ(1, CountInterferences(document_));
  EXPECT_EQ(1, ReadDocument(document_).results.at(0).declared);
}

TEST_F(ClashDocumentEdits, OtherDocumentIsTakenIn) {
  ClashDocument other("other.xml", kTwo);
  std::string trace;
  edit_.TakeIn(other, trace);
  EXPECT_EQ(4, CountInterferences(document_));
  EXPECT_EQ(2, CountInterferences(other));
  EXPECT_NE("", trace);
}

TEST_F(ClashDocumentEdits, DumpReplacesTheProloguesOwnParts) {
  Prologue prologue;
  prologue.dtd = "a.dtd";
  prologue.styleSheet = "a&b.xsl";
  const std::string text = Dumped(prologue);
  EXPECT_THAT(text, HasSubstr("a.dtd"));
  EXPECT_THAT(text, HasSubstr("a&amp;b.xsl"));
  EXPECT_THAT(text, HasSubstr("<!DOCTYPE ClashElement"));
}

TEST_F(ClashDocumentEdits, DumpIntoNoFolderFails) {
  EXPECT_LT(edit_.Dump({}, folder_.FilePath("no/such/file.xml")), 0);
}

TEST(Federator, LinksReadBack) {
  const support::TemporaryFolder folder;
  const std::string path = folder.FilePath("federator.xml");
  ASSERT_EQ(S_OK, CreateFederator({}, path));
  ClashDocument federator(path);
  LinkRecord link;
  link.link = "a & b.xml";
  link.products[1].name = "second";
  ClashDocumentEdit(federator).AddLink(link);
  const std::vector<LinkRecord> links = ReadLinks(federator);
  ASSERT_EQ(1u, links.size());
  EXPECT_EQ("a & b.xml", links[0].link);
  EXPECT_EQ("second", links[0].products[1].name);
}

TEST(XmlName, IsTold) {
  EXPECT_TRUE(IsXmlName("ClashElement"));
  EXPECT_FALSE(IsXmlName("1 2"));
  EXPECT_FALSE(IsXmlName(""));
}

}  // namespace
