#include <gtest/gtest.h>

#include "platform/xml/DOM_NamedNodeMap.h"
#include "support/TreeEquality.h"

using support::ParseText;
using support::RootOf;
using support::WrittenText;

namespace {

/// An element "a" with one text.
DOM_Element ElementWithText(const DOMString& inText) {
  DOM_Document document = DOM_Document::createDocument();
  DOM_Element element = document.createElement("a");
  element.appendChild(document.createTextNode(inText));
  return element;
}

DOM_Element ElementWithAttribute(const DOMString& inValue) {
  DOM_Element element = DOM_Document::createDocument().createElement("a");
  element.setAttribute("k", inValue);
  return element;
}

DOM_Element ElementWithSection(const char* inText) {
  DOM_Document document = DOM_Document::createDocument();
  DOM_Element element = document.createElement("a");
  element.appendChild(document.createCDATASection(inText));
  return element;
}

DOMString Unit(ZORUC2Bytes inUnit) { return DOMString(&inUnit, 1); }

}  // namespace

TEST(WriteXML, NullNodeAndUnknownEncodingAreInvalidAndLeaveTheText) {
  DOMString text("before");
  EXPECT_EQ(ZORXMLParser::WriteXML(DOM_Node(), "UTF-8", text), E_INVALIDARG);
  EXPECT_EQ(ZORXMLParser::WriteXML(RootOf("<a/>"), "ISO-8859-1", text), E_INVALIDARG);
  EXPECT_EQ(ZORXMLParser::WriteXML(RootOf("<a/>"), "", text), E_INVALIDARG);
  EXPECT_TRUE(text.equals("before"));
}

TEST(WriteXML, EncodingNamesAreKnownInAnyCase) {
  for (const char* const name : {"UTF-8", "utf-8", "Utf-8", "UTF-16", "utf-16"}) {
    DOMString text;
    EXPECT_EQ(ZORXMLParser::WriteXML(RootOf("<a/>"), name, text), S_OK) << name;
    EXPECT_TRUE(text.equals("<a/>"));
  }
}

TEST(WriteXML, EveryKindOfNode) {
  const char* const whole =
      "<!DOCTYPE a SYSTEM \"s\"><a k=\"v\">t<![CDATA[s]]><!--c--><?p d?><b/></a>";
  const DOM_Document document = ParseText(whole);
  const DOM_Node root = document.getDocumentElement();
  EXPECT_EQ(WrittenText(document), whole);
  EXPECT_EQ(WrittenText(document.getDoctype()), "<!DOCTYPE a SYSTEM \"s\">");
  EXPECT_EQ(WrittenText(root), "<a k=\"v\">t<![CDATA[s]]><!--c--><?p d?><b/></a>");
  EXPECT_EQ(WrittenText(root.getAttributes().item(0)), "k=\"v\"");
  EXPECT_EQ(WrittenText(root.getFirstChild()), "t");
  EXPECT_EQ(WrittenText(root.getFirstChild().getNextSibling()), "<![CDATA[s]]>");
  EXPECT_EQ(WrittenText(root.getLastChild()), "<b/>");
  EXPECT_EQ(WrittenText(root.getLastChild().getPreviousSibling()), "<?p d?>");
}

TEST(WriteXML, WritesNoDeclarationAndNothingBehindTheNode) {
  EXPECT_EQ(WrittenText(ParseText("<?xml version='1.0' encoding='UTF-8'?>\n<a/>\n")), "<a/>");
  EXPECT_EQ(WrittenText(RootOf("<a><b/><c/></a>").getFirstChild()), "<b/>");
}

TEST(WriteXML, DocumentTypesKeepTheirIdentifiers) {
  for (const char* const text :
       {"<!DOCTYPE a><a/>", "<!DOCTYPE a SYSTEM \"s\"><a/>", "<!DOCTYPE a PUBLIC \"p\" \"s\"><a/>",
        "<!DOCTYPE a SYSTEM 'it is \"quoted\"'><a/>", "<!DOCTYPE a PUBLIC \"it's\" \"s\"><a/>"})
    EXPECT_EQ(WrittenText(ParseText(text)), text);
}

TEST(WriteXML, InternalSubsetsSayTheSame) {
  for (const char* const subset : {"",
                                   "<!ELEMENT a EMPTY>",
                                   "<!ELEMENT a ANY>",
                                   "<!ELEMENT a (#PCDATA)>",
                                   "<!ELEMENT a (#PCDATA)*>",
                                   "<!ELEMENT a (#PCDATA|b|c)*>",
                                   "<!ELEMENT a (b)>",
                                   "<!ELEMENT a (b)?>",
                                   "<!ELEMENT a (b,c,d)>",
                                   "<!ELEMENT a (b|c|d)+>",
                                   "<!ELEMENT a (b,(c|d)*,e?)>",
                                   "<!ELEMENT a ((b,c)|(d,e+))>",
                                   "<!ATTLIST a b CDATA #REQUIRED>",
                                   "<!ATTLIST a b CDATA #IMPLIED c ID #IMPLIED>",
                                   "<!ATTLIST a b (x|y) \"x\" c CDATA #FIXED \"f\">",
                                   "<!ATTLIST a b NMTOKENS \"x y\">",
                                   "<!ENTITY e \"v\">",
                                   "<!ENTITY e SYSTEM \"s\">",
                                   "<!ENTITY e PUBLIC \"p\" \"s\">",
                                   "<!ENTITY % e \"v\">",
                                   "<!NOTATION n SYSTEM \"s\">",
                                   "<!NOTATION n PUBLIC \"p\">",
                                   "<!NOTATION n PUBLIC \"p\" \"s\">",
                                   "<!NOTATION n SYSTEM \"s\"><!ENTITY e SYSTEM \"f\" NDATA n>",
                                   "<!NOTATION n SYSTEM \"s\"><!ATTLIST a b NOTATION (n) #IMPLIED>",
                                   "<!--c-->",
                                   "<?p d?>",
                                   "\n  <!ELEMENT a EMPTY>\n"}) {
    const std::string text = std::string("<!DOCTYPE a [") + subset + "]><a/>";
    EXPECT_EQ(WrittenText(ParseText(text).getDoctype()) + "<a/>", text);
  }
}

TEST(WriteXML, EntityValuesKeepTheirMeaning) {
  const DOM_Document document = ParseText(
      "<!DOCTYPE a [<!ENTITY e 'x&#38;lt;y&#37;&#34;\"'><!ENTITY f '&e;<b/>'>]><a k='&e;'>&f;</a>");
  const std::string written = WrittenText(document);
  EXPECT_EQ(support::TreeDifference(document, ParseText(written)), "") << written;
  const std::string subset = written.substr(0, written.find("]>") + 2);
  EXPECT_EQ(WrittenText(RootOf(subset + "<a>&f;</a>")),
            WrittenText(RootOf("<!DOCTYPE a [<!ENTITY e 'x&#38;lt;y&#37;&#34;\"'><!ENTITY f "
                               "'&e;<b/>'>]><a>&f;</a>")));
}

TEST(WriteXML, TextIsEscaped) {
  EXPECT_EQ(WrittenText(ElementWithText("& < > \" ' ]]>")), "<a>&amp; &lt; &gt; \" ' ]]&gt;</a>");
  EXPECT_EQ(WrittenText(ElementWithText("\t\n\r")), "<a>\t\n&#13;</a>");
}

TEST(WriteXML, AttributesAreEscaped) {
  EXPECT_EQ(WrittenText(ElementWithAttribute("& < > \" ' ]]>")),
            "<a k=\"&amp; &lt; &gt; &quot; ' ]]&gt;\"/>");
  EXPECT_EQ(WrittenText(ElementWithAttribute("\t\n\r ")), "<a k=\"&#9;&#10;&#13; \"/>");
}

TEST(WriteXML, SectionsAreSplitWhereTheyMustBe) {
  EXPECT_EQ(WrittenText(ElementWithSection("a]]>b")), "<a><![CDATA[a]]]]><![CDATA[>b]]></a>");
  EXPECT_EQ(WrittenText(ElementWithSection("]]>]]>")),
            "<a><![CDATA[]]]]><![CDATA[>]]]]><![CDATA[>]]></a>");
  EXPECT_EQ(WrittenText(ElementWithSection("a\rb")), "<a><![CDATA[a]]>&#13;<![CDATA[b]]></a>");
  EXPECT_EQ(WrittenText(ElementWithSection("]]")), "<a><![CDATA[]]]]></a>");
  EXPECT_EQ(WrittenText(ElementWithSection("")), "<a><![CDATA[]]></a>");
}

TEST(WriteXML, CharactersBeyondTheFirstPlanesAreCopied) {
  EXPECT_EQ(WrittenText(ElementWithText("\xC3\xA9\xEF\xBF\xBD\xF0\x9F\x98\x80\xF4\x8F\xBF\xBD")),
            "<a>\xC3\xA9\xEF\xBF\xBD\xF0\x9F\x98\x80\xF4\x8F\xBF\xBD</a>");
}

TEST(WriteXML, CharactersThatNoXMLTextCarriesAreRefused) {
  for (const int unit :
       {0x00, 0x01, 0x08, 0x0B, 0x0C, 0x0E, 0x1F, 0xD800, 0xDBFF, 0xDC00, 0xDFFF, 0xFFFE, 0xFFFF}) {
    const DOMString text = Unit(static_cast<ZORUC2Bytes>(unit));
    DOM_Document document = DOM_Document::createDocument();
    EXPECT_EQ(WrittenText(ElementWithText(text)), "E_FAIL") << unit;
    EXPECT_EQ(WrittenText(ElementWithAttribute(text)), "E_FAIL") << unit;
    EXPECT_EQ(WrittenText(document.createCDATASection(text)), "E_FAIL") << unit;
    EXPECT_EQ(WrittenText(document.createComment(text)), "E_FAIL") << unit;
    EXPECT_EQ(WrittenText(document.createProcessingInstruction("p", text)), "E_FAIL") << unit;
  }
}

TEST(WriteXML, SurrogatesInTheWrongOrderAreRefused) {
  const ZORUC2Bytes swapped[] = {0xDE00, 0xD83D};
  EXPECT_EQ(WrittenText(ElementWithText(DOMString(swapped, 2))), "E_FAIL");
  const ZORUC2Bytes twice[] = {0xD83D, 0xD83D, 0xDE00};
  EXPECT_EQ(WrittenText(ElementWithText(DOMString(twice, 3))), "E_FAIL");
}

TEST(WriteXML, CommentsThatWouldEndEarlyAreRefused) {
  DOM_Document document = DOM_Document::createDocument();
  EXPECT_EQ(WrittenText(document.createComment("a--b")), "E_FAIL");
  EXPECT_EQ(WrittenText(document.createComment("a-")), "E_FAIL");
  EXPECT_EQ(WrittenText(document.createComment("a\rb")), "E_FAIL");
  EXPECT_EQ(WrittenText(document.createComment("-a - b")), "<!---a - b-->");
  EXPECT_EQ(WrittenText(document.createComment("")), "<!---->");
}

TEST(WriteXML, InstructionsThatWouldReadOtherwiseAreRefused) {
  DOM_Document document = DOM_Document::createDocument();
  EXPECT_EQ(WrittenText(document.createProcessingInstruction("p", "a?>b")), "E_FAIL");
  EXPECT_EQ(WrittenText(document.createProcessingInstruction("p", " a")), "E_FAIL");
  EXPECT_EQ(WrittenText(document.createProcessingInstruction("p", "a\rb")), "E_FAIL");
  EXPECT_EQ(WrittenText(document.createProcessingInstruction("p", "a ? > b ")), "<?p a ? > b ?>");
  EXPECT_EQ(WrittenText(document.createProcessingInstruction("p", "")), "<?p?>");
}

TEST(WriteXML, RefusalLeavesTheTextUnchanged) {
  DOMString text("before");
  EXPECT_EQ(ZORXMLParser::WriteXML(ElementWithText(Unit(1)), "UTF-8", text), E_FAIL);
  EXPECT_TRUE(text.equals("before"));
}

TEST(WriteXML, NamesThatOnlyXML11AllowsAreRefused) {
  const DOM_Document document = ParseText("<?xml version='1.1'?><\xF0\x90\x80\x80/>");  // U+10000
  EXPECT_EQ(WrittenText(document), "E_FAIL");
}

TEST(WriteXML, FragmentWritesItsChildren) {
  DOM_Document document = DOM_Document::createDocument();
  DOM_Node fragment = document.createDocumentFragment();
  fragment.appendChild(document.createElement("a"));
  fragment.appendChild(document.createTextNode("t"));
  EXPECT_EQ(WrittenText(fragment), "<a/>t");
}
