#include "platform/xml/DOMParser.h"

#include <gtest/gtest.h>

#include "platform/xml/DOM_NodeList.h"
#include "support/PlatformFolder.h"
#include "support/XMLText.h"

using support::FileErrorOf;
using support::Narrow;
using support::ParseErrorOf;
using support::ParseText;
using support::RootOf;
using support::TemporaryFolder;
using support::WrittenText;

TEST(DOMParser, HasNoDocumentBeforeItParses) { EXPECT_TRUE(DOMParser().getDocument().isNull()); }

TEST(DOMParser, ParsesAFile) {
  const TemporaryFolder folder;
  folder.WriteFile("a.xml", "<a>text</a>");
  DOMParser parser(nullptr);
  parser.setDoValidation(false);
  parser.parse(folder.FilePath("a.xml").c_str());
  EXPECT_EQ(WrittenText(parser.getDocument()), "<a>text</a>");
}

TEST(DOMParser, ParsesAgainAndKeepsEarlierDocumentsAlive) {
  const TemporaryFolder folder;
  folder.WriteFile("a.xml", "<a/>");
  folder.WriteFile("b.xml", "<b/>");
  DOMParser parser;
  parser.parse(folder.FilePath("a.xml").c_str());
  const DOM_Document first = parser.getDocument();
  parser.parse(folder.FilePath("b.xml").c_str());
  EXPECT_EQ(WrittenText(first), "<a/>");
  EXPECT_EQ(WrittenText(parser.getDocument()), "<b/>");
}

TEST(DOMParser, FailedParseLeavesTheEarlierDocument) {
  const TemporaryFolder folder;
  folder.WriteFile("a.xml", "<a/>");
  folder.WriteFile("bad.xml", "<a><b></a>");
  DOMParser parser;
  parser.parse(folder.FilePath("a.xml").c_str());
  EXPECT_THROW(parser.parse(folder.FilePath("bad.xml").c_str()), ZORXMLParseError);
  EXPECT_THROW(parser.parse(folder.FilePath("missing.xml").c_str()), ZORXMLParseError);
  EXPECT_EQ(WrittenText(parser.getDocument()), "<a/>");
}

TEST(DOMParser, DocumentOutlivesTheParserAndItsSource) {
  DOM_Document document;
  {
    std::string bytes = "<a>some text that is not kept in place</a>";
    document = ParseText(bytes);
    bytes.assign(bytes.size(), '!');
  }
  EXPECT_EQ(WrittenText(document), "<a>some text that is not kept in place</a>");
}

// ---- empty input

TEST(DOMParser, EmptyFileGivesADocumentWithoutRoot) {
  const TemporaryFolder folder;
  folder.WriteFile("empty.xml", "");
  DOMParser parser;
  parser.parse(folder.FilePath("empty.xml").c_str());
  EXPECT_FALSE(parser.getDocument().isNull());
  EXPECT_TRUE(parser.getDocument().getDocumentElement().isNull());
}

TEST(DOMParser, EmptyMemoryGivesADocumentWithoutRoot) {
  EXPECT_FALSE(ParseText("").isNull());
  EXPECT_TRUE(ParseText("").getDocumentElement().isNull());
}

TEST(DOMParser, BlankInputIsMalformed) {
  EXPECT_NE(ParseErrorOf(" \n"), "");
  EXPECT_NE(ParseErrorOf("<!-- only a comment -->"), "");
}

// ---- what is kept

TEST(DOMParser, WhitespaceBetweenElementsIsKept) {
  const DOM_Element root = RootOf("<a>\n  <b/>\n</a>");
  EXPECT_EQ(Narrow(root.getFirstChild().getNodeValue()), "\n  ");
  EXPECT_EQ(Narrow(root.getLastChild().getNodeValue()), "\n");
}

TEST(DOMParser, AdjacentCharacterDataIsOneTextNode) {
  const DOM_Element root = RootOf("<!DOCTYPE a [<!ENTITY e 'and'>]><a>x &amp; y&#33; &e; z</a>");
  EXPECT_EQ(root.getFirstChild(), root.getLastChild());
  EXPECT_EQ(Narrow(root.getFirstChild().getNodeValue()), "x & y! and z");
}

TEST(DOMParser, SectionsStaySectionsBesideText) {
  const DOM_Element root = RootOf("<a>t<![CDATA[<&]]><![CDATA[s]]>u</a>");
  EXPECT_EQ(root.getChildNodes().getLength(), 4u);
  EXPECT_EQ(WrittenText(root), "<a>t<![CDATA[<&]]><![CDATA[s]]>u</a>");
}

TEST(DOMParser, LongTextIsOneNode) {
  const std::string text(3000000, 'x');
  const DOM_Element root = RootOf("<a>" + text + "</a>");
  EXPECT_EQ(root.getFirstChild(), root.getLastChild());
  EXPECT_EQ(root.getFirstChild().getNodeValue().length(), text.size());
}

TEST(DOMParser, LongSectionIsOneNode) {
  const std::string text(3000000, 'x');
  const DOM_Element root = RootOf("<a><![CDATA[" + text + "]]></a>");
  EXPECT_EQ(root.getFirstChild(), root.getLastChild());
  EXPECT_EQ(root.getFirstChild().getNodeValue().length(), text.size());
}

TEST(DOMParser, CommentsAndInstructionsAreKeptEverywhere) {
  const char* const text = "<!--1--><?p 1?><a><!--2--><?p 2?></a><!--3--><?p 3?>";
  EXPECT_EQ(WrittenText(ParseText(text)), text);
}

TEST(DOMParser, EntitiesWithElementsAreExpandedInPlace) {
  EXPECT_EQ(WrittenText(RootOf("<!DOCTYPE a [<!ENTITY e '<b>t</b>'>]><a>x&e;y</a>")),
            "<a>x<b>t</b>y</a>");
}

TEST(DOMParser, LineEndsAreNormalised) {
  EXPECT_EQ(Narrow(RootOf("<a>1\r\n2\r3\n</a>").getFirstChild().getNodeValue()), "1\n2\n3\n");
}

TEST(DOMParser, AttributeWhitespaceIsNormalised) {
  EXPECT_EQ(Narrow(RootOf("<a x=' 1\n2\t3&#10;4 '/>").getAttribute("x")), " 1 2 3\n4 ");
}

TEST(DOMParser, NamesWithColonsAreNames) {
  const DOM_Element root = RootOf("<n:a xmlns:n='u' m:x='1'/>");
  EXPECT_EQ(Narrow(root.getTagName()), "n:a");
  EXPECT_EQ(Narrow(root.getAttribute("m:x")), "1");
}

TEST(DOMParser, LaterMinorVersionsAreReadAsTheFirst) {
  EXPECT_EQ(WrittenText(RootOf("<?xml version='1.5'?><a/>")), "<a/>");
}

// ---- document types

TEST(DOMParser, DocumentTypeIsNotEnforced) {
  const char* const text =
      "<!DOCTYPE other [<!ELEMENT a EMPTY><!ATTLIST a x CDATA #REQUIRED>]><a y='1'>t<b/></a>";
  EXPECT_EQ(WrittenText(RootOf(text)), "<a y=\"1\">t<b/></a>");
  DOMParser parser;
  parser.setDoValidation(true);
  const TemporaryFolder folder;
  folder.WriteFile("a.xml", text);
  parser.parse(folder.FilePath("a.xml").c_str());
  EXPECT_FALSE(parser.getDocument().getDocumentElement().isNull());
}

TEST(DOMParser, DocumentTypeWithIdentifiersOpensNothing) {
  for (const char* const id :
       {"SYSTEM 'missing.dtd'", "SYSTEM 'file:///nothing/there'", "SYSTEM 'http://127.0.0.1:9/x'",
        "PUBLIC '-//Z//X' 'http://127.0.0.1:9/x'"}) {
    const std::string text = std::string("<!DOCTYPE a ") + id + "><a/>";
    EXPECT_EQ(ParseErrorOf(text), "") << text;
  }
}

TEST(DOMParser, DefaultAttributesOfTheDocumentAreAdded) {
  EXPECT_EQ(WrittenText(RootOf("<!DOCTYPE a [<!ATTLIST a x CDATA 'd' y CDATA #IMPLIED>]><a/>")),
            "<a x=\"d\"/>");
}

// ---- errors

TEST(DOMParser, ErrorTellsSourceLineColumnAndReason) {
  try {
    ParseText("<a>\n  <b>\n</a>");
    FAIL();
  } catch (const ZORXMLParseError& error) {
    EXPECT_EQ(error.source, "LIDPipodIBM");
    EXPECT_EQ(error.line, 3u);
    EXPECT_GT(error.column, 0u);
    EXPECT_EQ(error.reason, "expected end of tag 'b'");
    EXPECT_EQ(std::string(error.what()),
              "LIDPipodIBM:3:" + std::to_string(error.column) + ": " + error.reason);
  }
}

TEST(DOMParser, ErrorOfAFileNamesItsPath) {
  const TemporaryFolder folder;
  folder.WriteFile("bad.xml", "\n<a x=1/>");
  EXPECT_EQ(FileErrorOf(folder.FilePath("bad.xml")).find(folder.FilePath("bad.xml") + ":2:"), 0u);
}

TEST(DOMParser, MalformedDocumentsAreRefusedAtTheirLine) {
  const struct {
    const char* text;
    const char* start;
  } cases[] = {
      {"<a>\n\n<b></c></a>", "LIDPipodIBM:3:"},
      {"<a/>\n<b/>", "LIDPipodIBM:2:"},
      {"<a>\n&nothing;</a>", "LIDPipodIBM:2:"},
      {"<a\nx='1'\nx='2'/>", "LIDPipodIBM:3:"},
      {"\n\n<a x='<'/>", "LIDPipodIBM:3:"},
      {"<a>\n]]></a>", "LIDPipodIBM:2:"},
      {"<a>\n<!-- a -- b --></a>", "LIDPipodIBM:2:"},
      {"<a>\n&#0;</a>", "LIDPipodIBM:2:"},
      {"<a>\n\x01</a>", "LIDPipodIBM:2:"},
      {"<a>\n<1/></a>", "LIDPipodIBM:2:"},
      {"<a>\ntext", "LIDPipodIBM:2:"},
      {"text", "LIDPipodIBM:1:"},
      {"<a></a>text", "LIDPipodIBM:1:"},
      {"<a>\n<?xml version='1.0'?></a>", "LIDPipodIBM:2:"},
      {"<?xml version='3.0'?><a/>", "LIDPipodIBM:1:"},
      {"<?xml version='1.x'?><a/>", "LIDPipodIBM:1:"},
      {"<a>\n\xC3</a>", "LIDPipodIBM:"},
      {"<?xml version='1.0' encoding='nonsense'?><a/>", "LIDPipodIBM:1:"},
  };
  for (const auto& [text, start] : cases) {
    const std::string error = ParseErrorOf(text);
    EXPECT_EQ(error.find(start), 0u) << text << " gave: " << error;
    EXPECT_EQ(error.find('\n'), std::string::npos) << error;
  }
}

TEST(DOMParser, ReasonIsOneShortLineWhateverTheDocumentHolds) {
  const std::string error = ParseErrorOf("<a>\n<" + std::string(100000, 'n') + "></b></a>");
  EXPECT_NE(error, "");
  EXPECT_LT(error.size(), 1000u);
  EXPECT_EQ(error.find('\n'), std::string::npos);
}

TEST(DOMParser, MissingFileGivesTheSystemsReason) {
  EXPECT_EQ(FileErrorOf("/nothing/there.xml"), "/nothing/there.xml: No such file or directory");
}

TEST(DOMParser, NullPathIsRefused) {
  DOMParser parser;
  EXPECT_THROW(parser.parse(static_cast<const char*>(nullptr)), ZORXMLParseError);
}

TEST(DOMParser, ForeignSourceIsRefused) {
  class Foreign : public InputSource {};
  DOMParser parser;
  EXPECT_THROW(parser.parse(Foreign()), ZORXMLParseError);
}
