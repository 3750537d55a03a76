#include "platform/xml/DOM_Node.h"

#include <gtest/gtest.h>

#include "platform/xml/DOM_NamedNodeMap.h"
#include "platform/xml/DOM_NodeList.h"
#include "support/TreeEquality.h"

using support::CodeOf;
using support::Narrow;
using support::ParseText;
using support::RootOf;
using support::WrittenText;

// ---- null handles

TEST(DOM_Node, NullHandleAnswersEveryQuestion) {
  const DOM_Node node;
  EXPECT_TRUE(node.isNull());
  EXPECT_EQ(node.getNodeType(), DOM_Node::NULL_NODE);
  EXPECT_TRUE(node.getNodeName().isNull());
  EXPECT_TRUE(node.getNodeValue().isNull());
  EXPECT_TRUE(node.getParentNode().isNull());
  EXPECT_TRUE(node.getFirstChild().isNull());
  EXPECT_TRUE(node.getLastChild().isNull());
  EXPECT_TRUE(node.getPreviousSibling().isNull());
  EXPECT_TRUE(node.getNextSibling().isNull());
  EXPECT_FALSE(node.hasChildNodes());
  EXPECT_EQ(node.getChildNodes().getLength(), 0u);
  EXPECT_TRUE(node.getChildNodes().item(0).isNull());
  EXPECT_EQ(node.getAttributes().getLength(), 0u);
  EXPECT_TRUE(node.getAttributes().item(0).isNull());
  EXPECT_TRUE(node.getAttributes().getNamedItem("a").isNull());
  EXPECT_TRUE(node.getAttributes().getNamedItem("a").getNodeValue().isNull());
  EXPECT_TRUE(node.getOwnerDocument().isNull());
  EXPECT_EQ(node.getChangeCount(), 0u);
  EXPECT_TRUE(node.cloneNode(true).isNull());
  EXPECT_TRUE(node == DOM_Node());
  EXPECT_TRUE(DOM_Element(node).isNull());
  EXPECT_TRUE(DOM_Element(node).getTagName().isNull());
  EXPECT_EQ(Narrow(DOM_Element(node).getAttribute("a")), "");
  EXPECT_TRUE(DOM_Document(node).getDocumentElement().isNull());
  EXPECT_TRUE(DOM_Document(node).getDoctype().isNull());
}

TEST(DOM_Node, ChangeThroughANullHandleRaises) {
  DOM_Node null;
  DOM_Element root = RootOf("<a><b/></a>");
  const int expected = DOM_DOMException::NULL_HANDLE_ERR;
  EXPECT_EQ(CodeOf([&] { null.setNodeValue("x"); }), expected);
  EXPECT_EQ(CodeOf([&] { null.appendChild(root); }), expected);
  EXPECT_EQ(CodeOf([&] { null.insertBefore(root, null); }), expected);
  EXPECT_EQ(CodeOf([&] { null.replaceChild(root, root); }), expected);
  EXPECT_EQ(CodeOf([&] { null.removeChild(root); }), expected);
  EXPECT_EQ(CodeOf([&] { root.appendChild(null); }), expected);
  EXPECT_EQ(CodeOf([&] { root.removeChild(null); }), expected);
  EXPECT_EQ(CodeOf([&] { root.replaceChild(null, root.getFirstChild()); }), expected);
  EXPECT_EQ(CodeOf([&] { DOM_Element().setAttribute("a", "b"); }), expected);
  EXPECT_EQ(CodeOf([&] { DOM_Element().removeAttribute("a"); }), expected);
  EXPECT_EQ(CodeOf([&] { DOM_Document().createElement("a"); }), expected);
  EXPECT_EQ(CodeOf([&] { DOM_Document().createTextNode("a"); }), expected);
  EXPECT_EQ(CodeOf([&] { DOM_Document().createDocumentFragment(); }), expected);
  EXPECT_EQ(CodeOf([&] { DOM_Document().importNode(root, true); }), expected);
  EXPECT_EQ(CodeOf([&] { root.getOwnerDocument().importNode(null, true); }), expected);
  EXPECT_EQ(WrittenText(root), "<a><b/></a>");
}

// ---- asking

TEST(DOM_Node, KindsNamesAndValues) {
  const DOM_Document document =
      ParseText("<!DOCTYPE a><a x='1'>t<![CDATA[s]]><!--c--><?p d e?></a>");
  const DOM_Node root = document.getDocumentElement();
  const DOM_Node text = root.getFirstChild();
  const DOM_Node section = text.getNextSibling();
  const DOM_Node comment = section.getNextSibling();
  const DOM_Node instruction = comment.getNextSibling();
  const auto describe = [](const DOM_Node& inNode) {
    return std::to_string(inNode.getNodeType()) + " " + Narrow(inNode.getNodeName()) + " " +
           (inNode.getNodeValue().isNull() ? "(null)" : Narrow(inNode.getNodeValue()));
  };
  EXPECT_EQ(describe(document), "9 #document (null)");
  EXPECT_EQ(describe(document.getDoctype()), "10 a (null)");
  EXPECT_EQ(describe(root), "1 a (null)");
  EXPECT_EQ(describe(root.getAttributes().item(0)), "2 x 1");
  EXPECT_EQ(describe(text), "3 #text t");
  EXPECT_EQ(describe(section), "4 #cdata-section s");
  EXPECT_EQ(describe(comment), "8 #comment c");
  EXPECT_EQ(describe(instruction), "7 p d e");
  EXPECT_EQ(describe(ParseText("<a/>").createDocumentFragment()), "11 #document-fragment (null)");
}

TEST(DOM_Node, NeighboursOfANode) {
  const DOM_Element root = RootOf("<a><b/><c/><d/></a>");
  const DOM_Node c = root.getFirstChild().getNextSibling();
  EXPECT_EQ(Narrow(c.getNodeName()), "c");
  EXPECT_EQ(Narrow(c.getPreviousSibling().getNodeName()), "b");
  EXPECT_EQ(Narrow(c.getNextSibling().getNodeName()), "d");
  EXPECT_EQ(root.getLastChild(), c.getNextSibling());
  EXPECT_EQ(c.getParentNode(), root);
  EXPECT_EQ(root.getParentNode(), root.getOwnerDocument());
  EXPECT_TRUE(root.getFirstChild().getPreviousSibling().isNull());
  EXPECT_TRUE(root.getLastChild().getNextSibling().isNull());
  EXPECT_TRUE(root.getOwnerDocument().getParentNode().isNull());
  EXPECT_TRUE(root.getOwnerDocument().getOwnerDocument().isNull());
}

TEST(DOM_Node, ElementsAmongOtherNodes) {
  const DOM_Node root = RootOf("<r> <!--c--><a/>text<?p i?><b/> </r>");
  const DOM_Node a = root.getFirstElementChild();
  EXPECT_TRUE(a.hasName("a"));
  EXPECT_FALSE(a.hasName("ab"));
  EXPECT_FALSE(a.hasName(""));
  EXPECT_TRUE(root.getFirstChild().hasName("#text"));
  EXPECT_FALSE(root.getFirstChild().hasName("a"));
  EXPECT_TRUE(root.getFirstChild().getNextElementSibling() == a);
  const DOM_Node b = a.getNextElementSibling();
  EXPECT_TRUE(b.hasName("b"));
  EXPECT_TRUE(b.getNextElementSibling().isNull());
  EXPECT_TRUE(b.getFirstElementChild().isNull());
  const DOM_Node none;
  EXPECT_TRUE(none.getFirstElementChild().isNull());
  EXPECT_TRUE(none.getNextElementSibling().isNull());
  EXPECT_FALSE(none.hasName("a"));
}

TEST(DOM_Node, AttributeTextOfPresentAndMissingAttributes) {
  const DOM_Node root = RootOf("<r Name='v\u00E9' Empty='' \u00E9t\u00E9='wide \u30B1'>t</r>");
  const auto read = [](const DOM_Node& inNode, const char* inName) {
    ZORUnicodeString text("before");
    inNode.getAttributeText(inName, text);
    return text;
  };
  EXPECT_EQ(read(root, "Name"), ZORUnicodeString("v\u00E9"));
  EXPECT_EQ(read(root, "\u00E9t\u00E9"), ZORUnicodeString("wide \u30B1"));
  EXPECT_EQ(read(root, "Empty"), ZORUnicodeString());
  EXPECT_EQ(read(root, "name"), ZORUnicodeString());
  EXPECT_EQ(read(root, nullptr), ZORUnicodeString());
  EXPECT_EQ(read(root.getFirstChild(), "Name"), ZORUnicodeString());
  EXPECT_EQ(read(root.getAttributes().item(0), "Name"), ZORUnicodeString());
  EXPECT_EQ(read(DOM_Node(), "Name"), ZORUnicodeString());
}

TEST(DOM_Node, AttributeHasNeitherParentNorChildren) {
  const DOM_Node attribute = RootOf("<a x='1' y='2'><b/></a>").getAttributes().item(0);
  EXPECT_TRUE(attribute.getParentNode().isNull());
  EXPECT_TRUE(attribute.getFirstChild().isNull());
  EXPECT_TRUE(attribute.getLastChild().isNull());
  EXPECT_TRUE(attribute.getNextSibling().isNull());
  EXPECT_TRUE(attribute.getPreviousSibling().isNull());
  EXPECT_FALSE(attribute.hasChildNodes());
  EXPECT_EQ(attribute.getChildNodes().getLength(), 0u);
  EXPECT_EQ(attribute.getAttributes().getLength(), 0u);
  EXPECT_FALSE(attribute.getOwnerDocument().isNull());
}

TEST(DOM_Node, HandlesOfOneNodeAreEqual) {
  const DOM_Element a = RootOf("<a x='1' y='1'><b/></a>");
  EXPECT_TRUE(a.getFirstChild() == a.getLastChild());
  EXPECT_TRUE(a != a.getFirstChild());
  EXPECT_TRUE(a.getAttributes().item(0) != a.getAttributes().item(1));
  EXPECT_TRUE(a.getAttributes().item(0) == a.getAttributes().getNamedItem("x"));
  EXPECT_TRUE(a != RootOf("<a x='1' y='1'><b/></a>"));
  EXPECT_TRUE(a != DOM_Node());
}

TEST(DOM_Node, AnyHandleKeepsTheDocumentAlive) {
  DOM_Node deep;
  DOM_NodeList list;
  DOM_NamedNodeMap map;
  {
    const DOM_Element root = RootOf("<a><b><c k='v'/></b></a>");
    deep = root.getFirstChild().getFirstChild();
  }
  EXPECT_EQ(Narrow(deep.getParentNode().getParentNode().getNodeName()), "a");
  list = deep.getParentNode().getChildNodes();
  map = deep.getAttributes();
  deep = DOM_Node();
  EXPECT_EQ(list.getLength(), 1u);
  list = DOM_NodeList();
  EXPECT_EQ(Narrow(map.getNamedItem("k").getNodeValue()), "v");
}

TEST(DOM_Node, MovedFromHandleIsNullAndMovedToReleasesItsOwn) {
  DOM_Node a = RootOf("<a/>");
  DOM_Node b = RootOf("<b/>");
  b = std::move(a);
  EXPECT_TRUE(a.isNull());
  EXPECT_EQ(Narrow(b.getNodeName()), "a");
  DOM_Node& same = b;
  b = same;
  EXPECT_EQ(Narrow(b.getNodeName()), "a");
}

// ---- changing values

TEST(DOM_Node, SetNodeValueOnEveryKind) {
  DOM_Document document = ParseText("<a x='1'>t<![CDATA[s]]><!--c--><?p d?></a>");
  DOM_Node root = document.getDocumentElement();
  root.getAttributes().item(0).setNodeValue("new");
  for (DOM_Node at = root.getFirstChild(); !at.isNull(); at = at.getNextSibling())
    at.setNodeValue("new");
  root.setNodeValue("ignored");
  document.setNodeValue("ignored");
  EXPECT_EQ(WrittenText(document), "<a x=\"new\">new<![CDATA[new]]><!--new--><?p new?></a>");
}

TEST(DOM_Node, SetNodeValueOfANullStringEmpties) {
  DOM_Node text = RootOf("<a>t</a>").getFirstChild();
  text.setNodeValue(DOMString());
  EXPECT_FALSE(text.getNodeValue().isNull());
  EXPECT_EQ(text.getNodeValue().length(), 0u);
}

TEST(DOM_Node, ValueOfAnotherDocumentIsCopied) {
  DOM_Node target = RootOf("<a>t</a>").getFirstChild();
  { target.setNodeValue(RootOf("<a>from elsewhere</a>").getFirstChild().getNodeValue()); }
  EXPECT_EQ(Narrow(target.getNodeValue()), "from elsewhere");
}

// ---- changing the tree

TEST(DOM_Node, AppendChildAddsTheLast) {
  DOM_Document document = ParseText("<a><b/></a>");
  DOM_Node root = document.getDocumentElement();
  const DOM_Node added = document.createElement("c");
  EXPECT_EQ(root.appendChild(added), added);
  EXPECT_EQ(WrittenText(root), "<a><b/><c/></a>");
}

TEST(DOM_Node, AppendChildMovesANodeThatHasAParent) {
  DOM_Node root = RootOf("<a><b><c/></b><d/></a>");
  root.getLastChild().appendChild(root.getFirstChild().getFirstChild());
  EXPECT_EQ(WrittenText(root), "<a><b/><d><c/></d></a>");
  root.appendChild(root.getFirstChild());
  EXPECT_EQ(WrittenText(root), "<a><d><c/></d><b/></a>");
}

TEST(DOM_Node, InsertBeforeEachPosition) {
  DOM_Document document = ParseText("<a><b/><c/></a>");
  DOM_Node root = document.getDocumentElement();
  const DOM_Node b = root.getFirstChild();
  const DOM_Node c = root.getLastChild();
  root.insertBefore(document.createElement("x"), b);
  root.insertBefore(document.createElement("y"), c);
  root.insertBefore(document.createElement("z"), DOM_Node());
  EXPECT_EQ(WrittenText(root), "<a><x/><b/><y/><c/><z/></a>");
}

TEST(DOM_Node, InsertBeforeItselfChangesNoOrder) {
  DOM_Node root = RootOf("<a><b/><c/></a>");
  root.insertBefore(root.getFirstChild(), root.getFirstChild());
  EXPECT_EQ(WrittenText(root), "<a><b/><c/></a>");
  root.insertBefore(root.getLastChild(), root.getLastChild());
  EXPECT_EQ(WrittenText(root), "<a><b/><c/></a>");
}

TEST(DOM_Node, FragmentGivesItsChildren) {
  DOM_Document document = ParseText("<a><z/></a>");
  DOM_Node fragment = document.createDocumentFragment();
  fragment.appendChild(document.createElement("b"));
  fragment.appendChild(document.createTextNode("t"));
  DOM_Node root = document.getDocumentElement();
  root.insertBefore(fragment, root.getFirstChild());
  EXPECT_EQ(WrittenText(root), "<a><b/>t<z/></a>");
  EXPECT_FALSE(fragment.hasChildNodes());
  root.appendChild(fragment);
  EXPECT_EQ(WrittenText(root), "<a><b/>t<z/></a>");
}

TEST(DOM_Node, ReplaceChildReturnsTheOldOne) {
  DOM_Document document = ParseText("<a><b/><c/></a>");
  DOM_Node root = document.getDocumentElement();
  const DOM_Node old = root.replaceChild(document.createElement("x"), root.getFirstChild());
  EXPECT_EQ(WrittenText(root), "<a><x/><c/></a>");
  EXPECT_EQ(Narrow(old.getNodeName()), "b");
  EXPECT_TRUE(old.getParentNode().isNull());
  root.replaceChild(root.getLastChild(), root.getFirstChild());
  EXPECT_EQ(WrittenText(root), "<a><c/></a>");
  root.replaceChild(root.getFirstChild(), root.getFirstChild());
  EXPECT_EQ(WrittenText(root), "<a><c/></a>");
}

TEST(DOM_Node, ReplaceChildMayReplaceTheRoot) {
  DOM_Document document = ParseText("<!DOCTYPE a><a/><!--c-->");
  document.replaceChild(document.createElement("b"), document.getDocumentElement());
  EXPECT_EQ(WrittenText(document), "<!DOCTYPE a><b/><!--c-->");
}

TEST(DOM_Node, RemoveChildLeavesItsNeighboursJoined) {
  DOM_Node root = RootOf("<a><b/><c/><d/></a>");
  const DOM_Node c = root.removeChild(root.getFirstChild().getNextSibling());
  EXPECT_EQ(WrittenText(root), "<a><b/><d/></a>");
  EXPECT_TRUE(c.getParentNode().isNull());
  EXPECT_TRUE(c.getNextSibling().isNull());
  EXPECT_TRUE(c.getPreviousSibling().isNull());
  root.removeChild(root.getLastChild());
  root.removeChild(root.getFirstChild());
  EXPECT_FALSE(root.hasChildNodes());
}

TEST(DOM_Node, RefusedChangesRaiseAndChangeNothing) {
  DOM_Document document = ParseText("<a x='1'><b><c/></b>t</a>");
  DOM_Document other = ParseText("<o><p/></o>");
  DOM_Node root = document.getDocumentElement();
  DOM_Node b = root.getFirstChild();
  DOM_Node c = b.getFirstChild();
  DOM_Node text = root.getLastChild();
  DOM_Node attribute = root.getAttributes().item(0);
  const int hierarchy = DOM_DOMException::HIERARCHY_REQUEST_ERR;
  const int notFound = DOM_DOMException::NOT_FOUND_ERR;
  const int wrongDocument = DOM_DOMException::WRONG_DOCUMENT_ERR;
  const std::uint64_t before = document.getChangeCount();
  EXPECT_EQ(CodeOf([&] { text.appendChild(document.createElement("x")); }), hierarchy);
  EXPECT_EQ(CodeOf([&] { attribute.appendChild(document.createElement("x")); }), hierarchy);
  EXPECT_EQ(CodeOf([&] { b.appendChild(attribute); }), hierarchy);
  EXPECT_EQ(CodeOf([&] { b.appendChild(b); }), hierarchy);
  EXPECT_EQ(CodeOf([&] { c.appendChild(root); }), hierarchy);
  EXPECT_EQ(CodeOf([&] { c.appendChild(b); }), hierarchy);
  EXPECT_EQ(CodeOf([&] { root.appendChild(document); }), hierarchy);
  EXPECT_EQ(CodeOf([&] { document.appendChild(document.createElement("x")); }), hierarchy);
  EXPECT_EQ(CodeOf([&] { document.appendChild(document.createTextNode("x")); }), hierarchy);
  EXPECT_EQ(CodeOf([&] { document.replaceChild(document.createTextNode("x"), root); }), hierarchy);
  EXPECT_EQ(CodeOf([&] { root.appendChild(other.getDocumentElement()); }), wrongDocument);
  EXPECT_EQ(CodeOf([&] { root.replaceChild(other.getDocumentElement(), b); }), wrongDocument);
  EXPECT_EQ(CodeOf([&] { root.removeChild(c); }), notFound);
  EXPECT_EQ(CodeOf([&] { root.removeChild(attribute); }), notFound);
  EXPECT_EQ(CodeOf([&] { root.removeChild(other.getDocumentElement()); }), notFound);
  EXPECT_EQ(CodeOf([&] { root.insertBefore(document.createElement("x"), c); }), notFound);
  EXPECT_EQ(CodeOf([&] { root.insertBefore(document.createElement("x"), other); }), notFound);
  EXPECT_EQ(CodeOf([&] { root.replaceChild(document.createElement("x"), c); }), notFound);
  EXPECT_EQ(WrittenText(document), "<a x=\"1\"><b><c/></b>t</a>");
  EXPECT_EQ(WrittenText(other), "<o><p/></o>");
  EXPECT_EQ(document.getChangeCount(), before);
}

TEST(DOM_Node, RefusedFragmentKeepsItsChildren) {
  DOM_Document document = ParseText("<a/>");
  DOM_Node fragment = document.createDocumentFragment();
  fragment.appendChild(document.createComment("c"));
  fragment.appendChild(document.createTextNode("t"));
  EXPECT_EQ(CodeOf([&] { document.appendChild(fragment); }),
            DOM_DOMException::HIERARCHY_REQUEST_ERR);
  EXPECT_EQ(WrittenText(fragment), "<!--c-->t");
  DOM_Document empty = DOM_Document::createDocument();
  DOM_Node two = empty.createDocumentFragment();
  two.appendChild(empty.createElement("a"));
  two.appendChild(empty.createElement("b"));
  EXPECT_EQ(CodeOf([&] { empty.appendChild(two); }), DOM_DOMException::HIERARCHY_REQUEST_ERR);
  EXPECT_EQ(WrittenText(two), "<a/><b/>");
}

TEST(DOM_Node, DocumentTypeStandsBeforeTheRootOnly) {
  DOM_Document document = ParseText("<!DOCTYPE a><a/>");
  const DOM_Node doctype = document.getDoctype();
  const DOM_Node root = document.getDocumentElement();
  const int hierarchy = DOM_DOMException::HIERARCHY_REQUEST_ERR;
  EXPECT_EQ(CodeOf([&] { document.insertBefore(root, doctype); }), hierarchy);
  EXPECT_EQ(CodeOf([&] { document.appendChild(doctype); }), hierarchy);
  EXPECT_EQ(CodeOf([&] { DOM_Node(root).appendChild(doctype); }), hierarchy);
  document.removeChild(doctype);
  EXPECT_EQ(WrittenText(document), "<a/>");
  document.insertBefore(doctype, root);
  EXPECT_EQ(WrittenText(document), "<!DOCTYPE a><a/>");
}

// ---- copies

TEST(DOM_Node, CloneNodeCopiesDeepOrShallow) {
  const DOM_Node root = RootOf("<a x='1'><b y='2'>t<c/></b><!--d--></a>");
  EXPECT_EQ(WrittenText(root.cloneNode(true)), WrittenText(root));
  EXPECT_EQ(WrittenText(root.cloneNode(false)), "<a x=\"1\"/>");
  EXPECT_TRUE(root.cloneNode(true).getParentNode().isNull());
  EXPECT_EQ(root.cloneNode(true).getOwnerDocument(), root.getOwnerDocument());
  EXPECT_NE(root.cloneNode(true), root);
  EXPECT_EQ(WrittenText(root.getFirstChild().getFirstChild().cloneNode(true)), "t");
}

TEST(DOM_Node, CloneIsIndependentOfItsOriginal) {
  DOM_Node root = RootOf("<a><b x='1'>t</b></a>");
  DOM_Node copy = root.getFirstChild().cloneNode(true);
  DOM_Element(copy).setAttribute("x", "2");
  copy.getFirstChild().setNodeValue("u");
  EXPECT_EQ(WrittenText(root), "<a><b x=\"1\">t</b></a>");
  EXPECT_EQ(WrittenText(copy), "<b x=\"2\">u</b>");
}

TEST(DOM_Node, CloneIntoItsOwnOriginal) {
  DOM_Node root = RootOf("<a><b/></a>");
  for (int i = 0; i < 3; ++i) root.appendChild(root.cloneNode(true));
  EXPECT_EQ(WrittenText(root),
            "<a><b/><a><b/></a><a><b/><a><b/></a></a>"
            "<a><b/><a><b/></a><a><b/><a><b/></a></a></a></a>");
}

TEST(DOM_Node, CloneOfADocumentTypeOrAttributeIsRefused) {
  const DOM_Document document = ParseText("<!DOCTYPE a><a x='1'/>");
  const int expected = DOM_DOMException::NOT_SUPPORTED_ERR;
  EXPECT_EQ(CodeOf([&] { document.cloneNode(true); }), expected);
  EXPECT_EQ(CodeOf([&] { document.getDoctype().cloneNode(true); }), expected);
  EXPECT_EQ(CodeOf([&] { document.getDocumentElement().getAttributes().item(0).cloneNode(true); }),
            expected);
}

// ---- change count

TEST(DOM_Node, ChangeCountMovesWithEveryChange) {
  DOM_Document document = ParseText("<a x='1'><b/>t</a>");
  DOM_Element root = document.getDocumentElement();
  DOM_Node added = document.createElement("c");
  std::uint64_t last = document.getChangeCount();
  const auto moved = [&] {
    const std::uint64_t before = last;
    last = root.getChangeCount();
    return last > before;
  };
  root.appendChild(added);
  EXPECT_TRUE(moved());
  root.removeChild(added);
  EXPECT_TRUE(moved());
  root.insertBefore(added, root.getFirstChild());
  EXPECT_TRUE(moved());
  root.replaceChild(document.createElement("d"), added);
  EXPECT_TRUE(moved());
  root.setAttribute("x", "2");
  EXPECT_TRUE(moved());
  root.setAttribute("y", "2");
  EXPECT_TRUE(moved());
  root.removeAttribute("y");
  EXPECT_TRUE(moved());
  root.getAttributes().item(0).setNodeValue("3");
  EXPECT_TRUE(moved());
  root.getLastChild().setNodeValue("u");
  EXPECT_TRUE(moved());
}

TEST(DOM_Node, ChangeCountStaysWhenNothingInTheTreeChanges) {
  DOM_Document document = ParseText("<a x='1'><b/>t</a>");
  DOM_Element root = document.getDocumentElement();
  const std::uint64_t before = document.getChangeCount();
  DOM_Element made = document.createElement("c");
  made.setAttribute("k", "v");
  made.appendChild(document.createTextNode("t"));
  made.getFirstChild().setNodeValue("u");
  made.removeChild(made.getFirstChild());
  DOM_Node copy = root.cloneNode(true);
  copy.appendChild(made);
  copy.getFirstChild().appendChild(document.importNode(RootOf("<z><y/></z>"), true));
  root.removeAttribute("not there");
  root.getChildNodes().getLength();
  EXPECT_EQ(document.getChangeCount(), before);
  root.appendChild(copy);
  EXPECT_GT(document.getChangeCount(), before);
}
