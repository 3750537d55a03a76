#include <gtest/gtest.h>

#include <filesystem>
#include <string>
#include <vector>

#include "ZORClashParsing.h"
#include "ZORLyraXMLServices.h"
#include "platform/xml/DOM_DOMException.h"
#include "platform/xml/ZORXMLParser.h"
#include "support/LoadedDocument.h"
#include "support/PlatformFolder.h"
#include "support/XMLText.h"

using support::Loaded;
using support::Parsed;
using support::WrittenText;

namespace fs = std::filesystem;

namespace {
const std::string kRootLine = "About to get Root Node of First Document\n";
const std::string kProductsLine = "About to get productsInSpec Node of First Document\n";
const std::string kInterferencesLine =
    "About to append interferences of Second Document to first Document\n";
const std::string kNothingLine = "Nothing to add to first Document\n";
const std::string kSpecificationsLine =
    "About to append productsInSpec of Second Document to first Document\n";
const std::string kCountLine = "About to set Number of Interference in XML\n";
const std::string kAllLines =
    kRootLine + kProductsLine + kInterferencesLine + kSpecificationsLine + kCountLine;

/// Merges on a reader that has loaded nothing.
struct Merge {
  Merge(DOM_Document& ioFirst, DOM_Document& inSecond, const char* inTrace = "") {
    char nothing[] = "";
    ZORClashParsing reader(nothing);
    ZORUnicodeString text(inTrace);
    result = reader.MergeDocuments(ioFirst, inSecond, text);
    trace = text.ConvertToChar();
  }
  HRESULT result;
  std::string trace;
};

/// The first document as text after a merge that succeeds and leaves the second as it was.
std::string Merged(const std::string& inFirst, const std::string& inSecond) {
  DOM_Document first = Parsed(inFirst);
  DOM_Document second = Parsed(inSecond);
  const std::string secondBefore = WrittenText(second);
  EXPECT_EQ(Merge(first, second).result, S_OK);
  EXPECT_EQ(WrittenText(second), secondBefore);
  return WrittenText(first);
}

/// The code of what a merge raises; 0 when it raises nothing.
int Raised(DOM_Document& ioFirst, DOM_Document& inSecond) {
  return support::CodeOf([&] { Merge(ioFirst, inSecond); });
}

/// How many interferences a document has and declares.
struct Counts {
  explicit Counts(const DOM_Document& inDocument) {
    for (DOM_Node set = inDocument.getDocumentElement().getFirstChild(); !set.isNull();
         set = set.getNextSibling()) {
      if (!set.getNodeName().equals("ClashResult")) continue;
      declared = set.getAttributes()
                     .getNamedItem("NbInterf")
                     .getNodeValue()
                     .DOMStringToZORUnicodeString()
                     .ConvertToChar();
      for (DOM_Node child = set.getFirstChild(); !child.isNull(); child = child.getNextSibling())
        if (child.getNodeName().equals("Interference")) ++present;
    }
  }
  int present = 0;
  std::string declared;
};
}  // namespace

TEST(Merge, BothNullFailsWithTheErrorLine) {
  DOM_Document first, second;
  const Merge merge(first, second);
  EXPECT_EQ(merge.result, E_FAIL);
  EXPECT_EQ(merge.trace, "!!!ERROR, Both documents are corrupted \n");
  EXPECT_TRUE(first.isNull());
}

TEST(Merge, FirstNullBecomesTheSecondWithoutTrace) {
  DOM_Document first;
  DOM_Document second = Parsed("<ClashElement/>");
  const Merge merge(first, second, "before\n");
  EXPECT_EQ(merge.result, S_OK);
  EXPECT_TRUE(first == second);
  EXPECT_EQ(merge.trace, "before\n");
}

TEST(Merge, SecondNullLeavesTheFirstAndTracesFourLines) {
  const std::string text = "<ClashElement><ClashResult NbInterf=\"2.0\"/></ClashElement>";
  DOM_Document first = Parsed(text);
  DOM_Document second;
  const Merge merge(first, second);
  EXPECT_EQ(merge.result, S_OK);
  EXPECT_EQ(merge.trace, kRootLine + kProductsLine + kInterferencesLine + kNothingLine);
  EXPECT_EQ(WrittenText(first), text);
}

TEST(Merge, SecondNullLeavesAFirstThatCannotTakeInterferences) {
  DOM_Document first = Parsed("<ClashElement/>");
  DOM_Document second;
  EXPECT_EQ(Merge(first, second).result, S_OK);
  EXPECT_EQ(WrittenText(first), "<ClashElement/>");
}

TEST(Merge, OrdinaryDocumentsTraceFiveLinesBehindTheCallersText) {
  DOM_Document first = Parsed("<ClashElement><ClashResult/></ClashElement>");
  DOM_Document second = Parsed("<ClashElement><ClashResult/></ClashElement>");
  const Merge merge(first, second, "before\n");
  EXPECT_EQ(merge.result, S_OK);
  EXPECT_EQ(merge.trace, "before\n" + kAllLines);
}

TEST(Merge, InterferencesFollowTheFirstDocumentsInOrderAndAreCounted) {
  EXPECT_EQ(Merged("<ClashElement><ClashResult NbInterf=\"2\"><Interference Name=\"1\"/>"
                   "<Interference Name=\"2\"/></ClashResult></ClashElement>",
                   "<ClashElement><ClashResult NbInterf=\"3\"><Interference Name=\"a\"/>"
                   "<Interference Name=\"b\"/><Interference Name=\"c\"/></ClashResult>"
                   "</ClashElement>"),
            "<ClashElement><ClashResult NbInterf=\"5\"><Interference Name=\"1\"/>"
            "<Interference Name=\"2\"/><Interference Name=\"a\"/><Interference Name=\"b\"/>"
            "<Interference Name=\"c\"/></ClashResult></ClashElement>");
}

TEST(Merge, InterferencesAreCopiedWhole) {
  const std::string interference =
      "<Interference Name=\"a &amp; b\"><Product Alias=\"\u65e5\"/>text<!--note--><?pi data?>"
      "<Comment>x</Comment></Interference>";
  EXPECT_EQ(Merged("<ClashElement><ClashResult/></ClashElement>",
                   "<ClashElement><ClashResult>" + interference + "</ClashResult></ClashElement>"),
            "<ClashElement><ClashResult>" + interference + "</ClashResult></ClashElement>");
}

TEST(Merge, OnlyInterferencesOfResultSetsAreCopied) {
  EXPECT_EQ(Merged("<ClashElement><ClashResult/></ClashElement>",
                   "<ClashElement a=\"1\">t<Interference Name=\"root\"/><interference/>"
                   "<ClashResult Name=\"x\"> <Other/><!--c--><interference/></ClashResult>"
                   "<Date/></ClashElement>"),
            "<ClashElement><ClashResult/></ClashElement>");
}

TEST(Merge, SecondsResultSetsAllGiveInterferencesButTheLastAloneItsCount) {
  EXPECT_EQ(Merged("<ClashElement><ClashResult NbInterf=\"1\"><Interference Name=\"1\"/>"
                   "</ClashResult></ClashElement>",
                   "<ClashElement><ClashResult NbInterf=\"2\"><Interference Name=\"a\"/>"
                   "<Interference Name=\"b\"/></ClashResult><ClashResult NbInterf=\"1\">"
                   "<Interference Name=\"c\"/></ClashResult></ClashElement>"),
            "<ClashElement><ClashResult NbInterf=\"2\"><Interference Name=\"1\"/>"
            "<Interference Name=\"a\"/><Interference Name=\"b\"/><Interference Name=\"c\"/>"
            "</ClashResult></ClashElement>");
}

TEST(Merge, SecondsLastResultSetWithoutCountReplacesTheCountByNothing) {
  EXPECT_EQ(Merged("<ClashElement><ClashResult NbInterf=\"1\"/></ClashElement>",
                   "<ClashElement><ClashResult NbInterf=\"7\"/><ClashResult/></ClashElement>"),
            "<ClashElement><ClashResult NbInterf=\"1\"/></ClashElement>");
}

TEST(Merge, FirstsFirstResultSetTakesAllAndIsRewrittenAlone) {
  EXPECT_EQ(Merged("<ClashElement><ClashResult NbInterf=\"1\"/><ClashResult NbInterf=\"4\"/>"
                   "</ClashElement>",
                   "<ClashElement><ClashResult NbInterf=\"1\"><Interference/></ClashResult>"
                   "</ClashElement>"),
            "<ClashElement><ClashResult NbInterf=\"2\"><Interference/></ClashResult>"
            "<ClashResult NbInterf=\"4\"/></ClashElement>");
}

TEST(Merge, CountIsOfDeclaredNumbersNotOfInterferences) {
  EXPECT_EQ(Merged("<ClashElement><ClashResult NbInterf=\"10\"/></ClashElement>",
                   "<ClashElement><ClashResult NbInterf=\"20\"><Interference/></ClashResult>"
                   "</ClashElement>"),
            "<ClashElement><ClashResult NbInterf=\"30\"><Interference/></ClashResult>"
            "</ClashElement>");
}

TEST(Merge, CountsAreTruncatedTowardZeroBeforeTheyAreAdded) {
  EXPECT_EQ(Merged("<ClashElement><ClashResult NbInterf=\"2.9\"/></ClashElement>",
                   "<ClashElement><ClashResult NbInterf=\" 3.9e0 x\"/></ClashElement>"),
            "<ClashElement><ClashResult NbInterf=\"5\"/></ClashElement>");
  EXPECT_EQ(Merged("<ClashElement><ClashResult NbInterf=\"-2.9\"/></ClashElement>",
                   "<ClashElement><ClashResult NbInterf=\"1\"/></ClashElement>"),
            "<ClashElement><ClashResult NbInterf=\"-1\"/></ClashElement>");
}

TEST(Merge, CountsThatAreNoNumbersAreZero) {
  EXPECT_EQ(Merged("<ClashElement><ClashResult NbInterf=\"many\"/></ClashElement>",
                   "<ClashElement><ClashResult NbInterf=\"\"/></ClashElement>"),
            "<ClashElement><ClashResult NbInterf=\"0\"/></ClashElement>");
}

TEST(Merge, CountsBeyondIntStayAtItsEnd) {
  EXPECT_EQ(Merged("<ClashElement><ClashResult NbInterf=\"2147483647\"/></ClashElement>",
                   "<ClashElement><ClashResult NbInterf=\"1e300\"/></ClashElement>"),
            "<ClashElement><ClashResult NbInterf=\"2147483647\"/></ClashElement>");
}

TEST(Merge, CountIsRewrittenForASecondWithoutResultSet) {
  EXPECT_EQ(
      Merged("<ClashElement><ClashResult NbInterf=\"2.0\"/></ClashElement>", "<ClashElement/>"),
      "<ClashElement><ClashResult NbInterf=\"2\"/></ClashElement>");
}

TEST(Merge, SecondWithoutRootAddsNothing) {
  DOM_Document first = Parsed("<ClashElement><ClashResult NbInterf=\"2.0\"/></ClashElement>");
  DOM_Document second = DOM_Document::createDocument();
  const Merge merge(first, second);
  EXPECT_EQ(merge.result, S_OK);
  EXPECT_EQ(merge.trace, kAllLines);
  EXPECT_EQ(WrittenText(first), "<ClashElement><ClashResult NbInterf=\"2\"/></ClashElement>");
}

TEST(Merge, MissingCountAttributeIsNotAdded) {
  EXPECT_EQ(Merged("<ClashElement><ClashResult Name=\"r\"/></ClashElement>",
                   "<ClashElement><ClashResult NbInterf=\"1\"><Interference/></ClashResult>"
                   "</ClashElement>"),
            "<ClashElement><ClashResult Name=\"r\"><Interference/></ClashResult></ClashElement>");
}

TEST(Merge, SpecificationsFollowTheFirstDocuments) {
  EXPECT_EQ(
      Merged("<ClashElement><ProductsInSpec a=\"1\"><Specification Name=\"1\"/></ProductsInSpec>"
             "<ClashResult/></ClashElement>",
             "<ClashElement><ProductsInSpec b=\"2\"> <Specification Name=\"2\"><P/></Specification>"
             "<Other/></ProductsInSpec><ProductsInSpec><Specification Name=\"3\"/></ProductsInSpec>"
             "</ClashElement>"),
      "<ClashElement><ProductsInSpec a=\"1\"><Specification Name=\"1\"/><Specification Name=\"2\">"
      "<P/></Specification><Specification Name=\"3\"/></ProductsInSpec><ClashResult/>"
      "</ClashElement>");
}

TEST(Merge, FirstsFirstProductsInSpecTakesTheSpecifications) {
  EXPECT_EQ(Merged("<ClashElement><ProductsInSpec/><ProductsInSpec/><ClashResult/></ClashElement>",
                   "<ClashElement><ProductsInSpec><Specification/></ProductsInSpec>"
                   "</ClashElement>"),
            "<ClashElement><ProductsInSpec><Specification/></ProductsInSpec><ProductsInSpec/>"
            "<ClashResult/></ClashElement>");
}

TEST(Merge, MissingProductsInSpecIsAddedLastWithTheSecondsAttributes) {
  EXPECT_EQ(Merged("<ClashElement><ClashResult/><Date/></ClashElement>",
                   "<ClashElement><ProductsInSpec Name=\"p\" Case=\"c\">text<Specification "
                   "Name=\"1\"/><Specification Name=\"2\"/></ProductsInSpec></ClashElement>"),
            "<ClashElement><ClashResult/><Date/><ProductsInSpec Name=\"p\" Case=\"c\">"
            "<Specification Name=\"1\"/><Specification Name=\"2\"/></ProductsInSpec>"
            "</ClashElement>");
}

TEST(Merge, MissingProductsInSpecIsMadeFromTheFirstThatHasASpecification) {
  EXPECT_EQ(Merged("<ClashElement><ClashResult/></ClashElement>",
                   "<ClashElement><ProductsInSpec n=\"1\"/><ProductsInSpec n=\"2\">"
                   "<Specification/></ProductsInSpec><ProductsInSpec n=\"3\"><Specification/>"
                   "</ProductsInSpec></ClashElement>"),
            "<ClashElement><ClashResult/><ProductsInSpec n=\"2\"><Specification/><Specification/>"
            "</ProductsInSpec></ClashElement>");
}

TEST(Merge, ProductsInSpecWithoutSpecificationAddsNothing) {
  EXPECT_EQ(Merged("<ClashElement><ClashResult/></ClashElement>",
                   "<ClashElement><ProductsInSpec Name=\"p\"><Other/></ProductsInSpec>"
                   "</ClashElement>"),
            "<ClashElement><ClashResult/></ClashElement>");
}

TEST(Merge, LastChildTakesTheInterferencesWithoutAResultSet) {
  EXPECT_EQ(Merged("<ClashElement><ProductsInSpec/><Date NbInterf=\"4\"/></ClashElement>",
                   "<ClashElement><ClashResult NbInterf=\"1\"><Interference/></ClashResult>"
                   "<ProductsInSpec><Specification/></ProductsInSpec></ClashElement>"),
            "<ClashElement><ProductsInSpec><Specification/></ProductsInSpec><Date NbInterf=\"4\">"
            "<Interference/></Date></ClashElement>");
}

TEST(Merge, TextAsLastChildRaisesTheDocumentsErrorWithoutAResultSet) {
  const std::string text = "<ClashElement><Date/>text</ClashElement>";
  DOM_Document first = Parsed(text);
  DOM_Document second = Parsed(
      "<ClashElement><ClashResult NbInterf=\"1\"><Interference/></ClashResult></ClashElement>");
  const std::string secondBefore = WrittenText(second);
  EXPECT_EQ(Raised(first, second), DOM_DOMException::HIERARCHY_REQUEST_ERR);
  EXPECT_EQ(WrittenText(first), text);
  EXPECT_EQ(WrittenText(second), secondBefore);

  // Both can be merged with others afterwards.
  DOM_Document third = Parsed("<ClashElement><ClashResult NbInterf=\"0\"/></ClashElement>");
  EXPECT_EQ(Merge(third, second).result, S_OK);
  EXPECT_EQ(WrittenText(third), secondBefore);
  first.getDocumentElement().appendChild(first.createElement("ClashResult"));
  EXPECT_EQ(Merge(first, second).result, S_OK);
  EXPECT_EQ(WrittenText(first),
            "<ClashElement><Date/>text<ClashResult><Interference/></ClashResult></ClashElement>");
}

TEST(Merge, TextAsLastChildIsLeftWhenThereIsNothingToAppend) {
  EXPECT_EQ(Merged("<ClashElement><Date/> </ClashElement>",
                   "<ClashElement><ClashResult/>"
                   "</ClashElement>"),
            "<ClashElement><Date/> </ClashElement>");
}

TEST(Merge, CommentAsLastChildRaisesTheDocumentsErrorWithoutAResultSet) {
  DOM_Document first = Parsed("<ClashElement><!--end--></ClashElement>");
  DOM_Document second =
      Parsed("<ClashElement><ClashResult><Interference/></ClashResult></ClashElement>");
  EXPECT_EQ(Raised(first, second), DOM_DOMException::HIERARCHY_REQUEST_ERR);
}

TEST(Merge, FirstWhoseRootIsEmptyBecomesTheSecond) {
  DOM_Document first = Parsed("<ClashElement/>");
  DOM_Document second = Parsed(
      "<ClashElement><ClashResult NbInterf=\"1\"><Interference/></ClashResult></ClashElement>");
  const std::string secondBefore = WrittenText(second);
  const Merge merge(first, second);
  EXPECT_EQ(merge.result, S_OK);
  EXPECT_EQ(merge.trace, kAllLines);
  EXPECT_TRUE(first == second);
  EXPECT_EQ(WrittenText(second), secondBefore);
}

// The root found before is still that of the document that the first handle referred to, and a node
// of the second document may not go there.
TEST(Merge, FirstWhoseRootIsEmptyRaisesTheDocumentsErrorForSpecifications) {
  DOM_Document first = Parsed("<ClashElement/>");
  const DOM_Document firstBefore = first;
  DOM_Document second =
      Parsed("<ClashElement><ProductsInSpec><Specification/></ProductsInSpec></ClashElement>");
  const std::string secondBefore = WrittenText(second);
  EXPECT_EQ(Raised(first, second), DOM_DOMException::WRONG_DOCUMENT_ERR);
  EXPECT_TRUE(first == second);
  EXPECT_EQ(WrittenText(second), secondBefore);
  EXPECT_EQ(WrittenText(firstBefore), "<ClashElement/>");
}

TEST(Merge, FirstWithoutRootBecomesTheSecond) {
  DOM_Document first = DOM_Document::createDocument();
  DOM_Document second = Parsed(
      "<ClashElement><ClashResult NbInterf=\"1\"><Interference/></ClashResult><ProductsInSpec>"
      "<Specification/></ProductsInSpec></ClashElement>");
  const std::string secondBefore = WrittenText(second);
  const Merge merge(first, second);
  EXPECT_EQ(merge.result, S_OK);
  EXPECT_EQ(merge.trace, kAllLines);
  EXPECT_TRUE(first == second);
  EXPECT_EQ(WrittenText(second), secondBefore);
}

TEST(Merge, DocumentWithItselfDoublesIt) {
  DOM_Document document = Parsed(
      "<ClashElement><ClashResult NbInterf=\"2\"><Interference Name=\"1\"/> "
      "<Interference Name=\"2\"/></ClashResult><ProductsInSpec><Specification/></ProductsInSpec>"
      "</ClashElement>");
  DOM_Document same = document;
  EXPECT_EQ(Merge(document, same).result, S_OK);
  EXPECT_EQ(WrittenText(document),
            "<ClashElement><ClashResult NbInterf=\"4\"><Interference Name=\"1\"/> "
            "<Interference Name=\"2\"/><Interference Name=\"1\"/><Interference Name=\"2\"/>"
            "</ClashResult><ProductsInSpec><Specification/><Specification/></ProductsInSpec>"
            "</ClashElement>");
}

TEST(Merge, HandleWithItselfDoublesTheDocument) {
  DOM_Document document = Parsed(
      "<ClashElement><ClashResult><Interference/></ClashResult>"
      "</ClashElement>");
  EXPECT_EQ(Merge(document, document).result, S_OK);
  EXPECT_EQ(Counts(document).present, 2);
}

TEST(Merge, ReaderAnswersForTheMergedDocument) {
  std::string text =
      "<ClashElement><ClashResult NbInterf=\"1\"><Interference Value=\"1\"/></ClashResult>"
      "</ClashElement>";
  ZORClashParsing reader(text.data(), static_cast<int>(text.size()));
  DOM_Document first;
  ZORUnicodeString kind, trace, value, type, rule, firstAlias, secondAlias;
  ASSERT_EQ(reader.LoadSequence(first, kind), S_OK);
  reader.GetClashInfos(1, value, type, rule, firstAlias, secondAlias);
  EXPECT_STREQ(value.ConvertToChar(), "1");
  DOM_Document second = Parsed(
      "<ClashElement><ClashResult NbInterf=\"1\"><Interference Value=\"2\"/></ClashResult>"
      "</ClashElement>");
  ASSERT_EQ(reader.MergeDocuments(first, second, trace), S_OK);
  reader.GetClashInfos(2, value, type, rule, firstAlias, secondAlias);
  EXPECT_STREQ(value.ConvertToChar(), "2");
}

TEST(Merge, ElementNamesAreComparedWithLetterCase) {
  EXPECT_EQ(Merged("<ClashElement><clashresult/><ClashResult/></ClashElement>",
                   "<ClashElement><CLASHRESULT><Interference/></CLASHRESULT><ClashResult>"
                   "<Interference/></ClashResult></ClashElement>"),
            "<ClashElement><clashresult/><ClashResult><Interference/></ClashResult>"
            "</ClashElement>");
}

// Each real result with the next, reloaded from the file that was written.
TEST(Merge, SamplesReloadWithTheSumOfTheirInterferences) {
  std::vector<std::string> samples;
  for (const auto& entry : fs::directory_iterator(ZOR_SOURCE_DIR "/samples"))
    if (entry.path().string().ends_with(".clash.xml")) samples.push_back(entry.path().string());
  ASSERT_EQ(samples.size(), 6u);
  const support::TemporaryFolder folder;
  ZORLyraXMLServices writer;
  for (std::size_t i = 0; i < samples.size(); ++i) {
    const std::string& one = samples[i];
    const std::string& other = samples[(i + 1) % samples.size()];
    DOM_Document first = Loaded(one);
    DOM_Document second = Loaded(other);
    const Counts firstCounts(first);
    const Counts secondCounts(second);
    const std::string secondBefore = WrittenText(second);
    ASSERT_EQ(Merge(first, second).result, S_OK);
    EXPECT_EQ(WrittenText(second), secondBefore);

    const std::string path = folder.FilePath("merged.clash.xml");
    ASSERT_EQ(writer.DumpDocument(first.getDocumentElement(), path.c_str(), "", "", "", 1, 1),
              S_OK);
    const DOM_Document merged = Loaded(path);
    EXPECT_GT(firstCounts.present, 0) << one;
    EXPECT_EQ(Counts(merged).present, firstCounts.present + secondCounts.present);
    EXPECT_EQ(Counts(merged).declared, std::to_string(Counts(merged).present));
    EXPECT_EQ(WrittenText(merged.getDocumentElement()), WrittenText(first.getDocumentElement()));
  }
}
