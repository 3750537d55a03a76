// What all writers share, seen from inside: this program is built from the writer's own sources.
#include <gtest/gtest.h>

#include <string>

#include "ZORLyraXMLServices.h"
#include "platform/xml/DOM_Document.h"
#include "support/PlatformFolder.h"
#include "xml_writing/WriterState.h"

namespace {
std::string State() {
  using namespace writer_state;
  return std::to_string(indentFlag) + "|" + dtdIdentifier.ConvertToChar() + "|" +
         styleSheet.ConvertToChar() + "|" + typeName.ConvertToChar();
}

const std::string kStateAtLoad = State();  // before any writer of this program

class SharedState : public testing::Test {
 protected:
  void SetUp() override { writer_state::Select(7, "a.dtd", "a.xsl", "A"); }

  static DOM_Document NewDocument() {
    DOM_Document document = DOM_Document::createDocument();
    document.appendChild(document.createElement("Root"));
    return document;
  }

  support::PlatformFolder folder_;
  const std::string path_ = folder_.FilePath("document.xml");
};
}  // namespace

TEST_F(SharedState, IsCompactAndEmptyAtLoad) { EXPECT_EQ(kStateAtLoad, "0|||"); }

TEST_F(SharedState, DefaultConstructionResetsAllButTheTypeName) {
  const ZORLyraXMLServices writer;
  EXPECT_EQ(State(), "1|||A");
}

TEST_F(SharedState, CopyAndAssignmentLeaveIt) {
  ZORLyraXMLServices writer;
  SetUp();
  ZORLyraXMLServices copy(writer);
  EXPECT_EQ(State(), "7|a.dtd|a.xsl|A");
  copy = writer;
  EXPECT_EQ(State(), "7|a.dtd|a.xsl|A");
}

TEST_F(SharedState, EndOfAWriterLeavesIt) {
  {
    ZORLyraXMLServices writer;
    SetUp();
  }
  EXPECT_EQ(State(), "7|a.dtd|a.xsl|A");
}

TEST_F(SharedState, MarkersAndHeaderLeaveIt) {
  ZORLyraXMLServices writer;
  SetUp();
  writer.WriteXMLHeaderTag("B", "b.dtd", "b.xsl");
  writer.InitXMLMarkerWithAttr("B");
  writer.CloseXMLAttrMarkerWithElem();
  writer.CloseXMLMarker("B");
  writer.getStyleSheetFromSetting();
  EXPECT_EQ(writer.DumpDocument(path_.c_str()), S_OK);
  EXPECT_EQ(State(), "7|a.dtd|a.xsl|A");
}

TEST_F(SharedState, FederatorDocumentSelectsAllFour) {
  ZORLyraXMLServices writer;
  EXPECT_EQ(writer.CreateNewFederatorDocument(path_.c_str(), "f.dtd", "f.xsl", 0), S_OK);
  EXPECT_EQ(State(), "0|f.dtd|f.xsl|FederatorClashElement");
}

TEST_F(SharedState, FederatorDocumentThatCannotBeOpenedSelectsToo) {
  ZORLyraXMLServices writer;
  EXPECT_EQ(writer.CreateNewFederatorDocument((path_ + "/below").c_str(), "f.dtd", "f.xsl", 3),
            E_FAIL);
  EXPECT_EQ(State(), "3|f.dtd|f.xsl|FederatorClashElement");
}

TEST_F(SharedState, DumpOfANodeSelectsAllFour) {
  ZORLyraXMLServices writer;
  EXPECT_EQ(writer.DumpDocument(NewDocument(), path_.c_str(), "d.dtd", "d.xsl", "D", 1, 0), S_OK);
  EXPECT_EQ(State(), "0|d.dtd|d.xsl|D");
}

TEST_F(SharedState, DumpOfANodeTakesEmptyTextsToo) {
  ZORLyraXMLServices writer;
  EXPECT_EQ(writer.DumpDocument(NewDocument(), path_.c_str(), "", "", "", 1, 1), S_OK);
  EXPECT_EQ(State(), "1|||");
}

TEST_F(SharedState, DumpThatCannotBeSerialisedSelectsToo) {
  ZORLyraXMLServices writer;
  EXPECT_LT(writer.DumpDocument(DOM_Node(), path_.c_str(), "d.dtd", "d.xsl", "D", 1, 4), 0);
  EXPECT_EQ(State(), "4|d.dtd|d.xsl|D");
}
