#include "platform/xml/DOM_Document.h"

#include <gtest/gtest.h>

#include "support/TreeEquality.h"

using support::CodeOf;
using support::Narrow;
using support::ParseText;
using support::WrittenText;

TEST(DOM_Document, CreateDocumentHasNoRoot) {
  const DOM_Document document = DOM_Document::createDocument();
  EXPECT_FALSE(document.isNull());
  EXPECT_TRUE(document.getDocumentElement().isNull());
  EXPECT_TRUE(document.getDoctype().isNull());
  EXPECT_FALSE(document.hasChildNodes());
  EXPECT_EQ(WrittenText(document), "");
}

TEST(DOM_Document, CastOfAnotherKindIsNull) {
  const DOM_Document document = ParseText("<a/>");
  EXPECT_TRUE(DOM_Document(document.getDocumentElement()).isNull());
  EXPECT_EQ(DOM_Document(DOM_Node(document)), document);
  EXPECT_TRUE(DOM_Element(DOM_Node(document)).isNull());
}

TEST(DOM_Document, RootAndDocumentTypeAmongOtherNodes) {
  const DOM_Document document = ParseText("<!--c--><!DOCTYPE r><?p?><r/><!--d-->");
  EXPECT_EQ(Narrow(document.getDocumentElement().getTagName()), "r");
  EXPECT_EQ(Narrow(document.getDoctype().getNodeName()), "r");
  EXPECT_TRUE(ParseText("<r/>").getDoctype().isNull());
}

TEST(DOM_Document, BuildsATreeFromNothing) {
  DOM_Document document = DOM_Document::createDocument();
  document.appendChild(document.createComment("c"));
  DOM_Element root = document.createElement("root");
  document.appendChild(root);
  root.setAttribute("k", "v");
  root.appendChild(document.createTextNode("t"));
  root.appendChild(document.createCDATASection("s"));
  root.appendChild(document.createProcessingInstruction("p", "d"));
  EXPECT_EQ(WrittenText(document), "<!--c--><root k=\"v\">t<![CDATA[s]]><?p d?></root>");
  EXPECT_EQ(document.getDocumentElement(), root);
}

TEST(DOM_Document, NamesThatXMLDoesNotAllowAreRefused) {
  DOM_Document document = DOM_Document::createDocument();
  DOM_Element element = document.createElement("a");
  const int expected = DOM_DOMException::INVALID_CHARACTER_ERR;
  for (const char* const name : {"", "1a", "a b", "<", "a>", "-a", "a\"", " a", "a/"}) {
    EXPECT_EQ(CodeOf([&] { document.createElement(name); }), expected) << name;
    EXPECT_EQ(CodeOf([&] { element.setAttribute(name, "v"); }), expected) << name;
    EXPECT_EQ(CodeOf([&] { document.createProcessingInstruction(name, ""); }), expected) << name;
  }
  EXPECT_EQ(CodeOf([&] { document.createElement(DOMString()); }), expected);
  EXPECT_EQ(CodeOf([&] { document.createProcessingInstruction("xMl", ""); }), expected);
  EXPECT_EQ(element.getAttributes().isNull(), false);
  EXPECT_EQ(WrittenText(element), "<a/>");
}

TEST(DOM_Document, NamesThatXMLAllowsAreTaken) {
  DOM_Document document = DOM_Document::createDocument();
  for (const char* const name : {"a", "_a", "a:b", ":a", "a-1.b", "xml", "\xC3\xA9t\xC3\xA9"})
    EXPECT_EQ(Narrow(document.createElement(name).getTagName()), name);
}

TEST(DOM_Document, ImportNodeCopiesFromAnotherDocument) {
  const DOM_Document source = ParseText("<a x='1'><b y='2'>t<![CDATA[s]]><?p d?><!--c--></b></a>");
  DOM_Document target = ParseText("<z/>");
  const DOM_Node deep = target.importNode(source.getDocumentElement(), true);
  EXPECT_EQ(WrittenText(deep), WrittenText(source));
  EXPECT_EQ(deep.getOwnerDocument(), target);
  EXPECT_TRUE(deep.getParentNode().isNull());
  EXPECT_EQ(WrittenText(target.importNode(source.getDocumentElement(), false)), "<a x=\"1\"/>");
  EXPECT_EQ(WrittenText(target), "<z/>");
}

TEST(DOM_Document, ImportNodeLeavesTheSourceUnchanged) {
  const DOM_Document source = ParseText("<a><b/></a>");
  const std::uint64_t before = source.getChangeCount();
  DOM_Document target = ParseText("<z/>");
  target.getDocumentElement().appendChild(target.importNode(source.getDocumentElement(), true));
  EXPECT_EQ(WrittenText(source), "<a><b/></a>");
  EXPECT_EQ(source.getChangeCount(), before);
}

TEST(DOM_Document, ImportNodeOutlivesItsSource) {
  DOM_Document target = ParseText("<z/>");
  {
    const DOM_Document source = ParseText("<a key='a value'>a text of the source</a>");
    target.getDocumentElement().appendChild(target.importNode(source.getDocumentElement(), true));
  }
  EXPECT_EQ(WrittenText(target), "<z><a key=\"a value\">a text of the source</a></z>");
}

TEST(DOM_Document, ImportNodeFromSeveralSourcesInTurn) {
  const DOM_Document first = ParseText("<f p='1' q='2'/>");
  const DOM_Document second = ParseText("<s q='1' p='2'/>");
  DOM_Document target = ParseText("<z q=''/>");
  DOM_Node root = target.getDocumentElement();
  for (int i = 0; i < 2; ++i) {
    root.appendChild(target.importNode(first.getDocumentElement(), true));
    root.appendChild(target.importNode(second.getDocumentElement(), true));
  }
  EXPECT_EQ(WrittenText(root),
            "<z q=\"\"><f p=\"1\" q=\"2\"/><s q=\"1\" p=\"2\"/><f p=\"1\" q=\"2\"/>"
            "<s q=\"1\" p=\"2\"/></z>");
}

TEST(DOM_Document, ImportNodeFollowsNamesThatTheSourceGainsLater) {
  DOM_Document source = ParseText("<a/>");
  DOM_Document target = ParseText("<z/>");
  target.importNode(source.getDocumentElement(), true);
  source.getDocumentElement().setAttribute("added", "1");
  EXPECT_EQ(WrittenText(target.importNode(source.getDocumentElement(), true)), "<a added=\"1\"/>");
}

TEST(DOM_Document, ImportNodeOfItsOwnDocumentCopies) {
  DOM_Document document = ParseText("<a><b x='1'>t</b></a>");
  const DOM_Node b = document.getDocumentElement().getFirstChild();
  const DOM_Node copy = document.importNode(b, true);
  EXPECT_NE(copy, b);
  EXPECT_EQ(WrittenText(copy), WrittenText(b));
}

TEST(DOM_Document, ImportNodeOfADocumentOrDocumentTypeIsRefused) {
  const DOM_Document source = ParseText("<!DOCTYPE a><a/>");
  DOM_Document target = ParseText("<z/>");
  const int expected = DOM_DOMException::NOT_SUPPORTED_ERR;
  EXPECT_EQ(CodeOf([&] { target.importNode(source, true); }), expected);
  EXPECT_EQ(CodeOf([&] { target.importNode(source.getDoctype(), true); }), expected);
}

TEST(DOM_Element, AttributesAreReadSetAndRemoved) {
  DOM_Element element = support::RootOf("<a x='1' y=''/>");
  EXPECT_EQ(Narrow(element.getAttribute("x")), "1");
  EXPECT_EQ(Narrow(element.getAttribute("y")), "");
  EXPECT_FALSE(element.getAttribute("missing").isNull());
  EXPECT_EQ(element.getAttribute("missing").length(), 0u);
  EXPECT_EQ(element.getAttribute(DOMString()).length(), 0u);
  element.setAttribute("z", "3");
  element.setAttribute("x", "2");
  EXPECT_EQ(WrittenText(element), "<a x=\"2\" y=\"\" z=\"3\"/>");
  element.removeAttribute("x");
  element.removeAttribute("z");
  element.removeAttribute("missing");
  EXPECT_EQ(WrittenText(element), "<a y=\"\"/>");
}

TEST(DOM_Element, NamesAreComparedExactly) {
  const DOM_Element element = support::RootOf("<a Name='1' name='2' Names='3'/>");
  EXPECT_EQ(Narrow(element.getAttribute("name")), "2");
  EXPECT_EQ(Narrow(element.getAttribute("Name")), "1");
  EXPECT_EQ(Narrow(element.getAttribute("NAME")), "");
  EXPECT_EQ(Narrow(element.getAttribute("Nam")), "");
}

TEST(DOM_Element, HandleOnARemovedAttributeStillAnswers) {
  DOM_Element element = support::RootOf("<a x='1' y='2'/>");
  DOM_Node attribute = element.getAttributes().getNamedItem("x");
  element.removeAttribute("x");
  EXPECT_EQ(Narrow(attribute.getNodeName()), "x");
  EXPECT_EQ(Narrow(attribute.getNodeValue()), "1");
  attribute.setNodeValue("3");
  EXPECT_EQ(Narrow(attribute.getNodeValue()), "3");
  EXPECT_EQ(WrittenText(element), "<a y=\"2\"/>");
}

TEST(DOM_Element, CastOfAnotherKindIsNull) {
  EXPECT_TRUE(DOM_Element(support::RootOf("<a>t</a>").getFirstChild()).isNull());
  EXPECT_FALSE(DOM_Element(support::RootOf("<a><b/></a>").getFirstChild()).isNull());
}
