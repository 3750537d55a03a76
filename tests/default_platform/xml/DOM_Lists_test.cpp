// Lists of children and maps of attributes: what they answer, also while the tree changes, and that
// walking by position stays linear.
#include <gtest/gtest.h>

#include <random>
#include <vector>

#include "platform/xml/DOM_Document.h"
#include "platform/xml/DOM_NamedNodeMap.h"
#include "platform/xml/DOM_NodeList.h"
#include "support/XMLText.h"

using support::Narrow;
using support::ParseText;
using support::RootOf;

TEST(DOM_NodeList, DefaultListIsNullAndEmpty) {
  const DOM_NodeList list;
  EXPECT_TRUE(list.isNull());
  EXPECT_EQ(list.getLength(), 0u);
  EXPECT_TRUE(list.item(0).isNull());
}

TEST(DOM_NodeList, CountsAllKindsOfChildren) {
  const DOM_NodeList list = RootOf("<a> <b/>t<!--c--><?p?><![CDATA[s]]></a>").getChildNodes();
  ASSERT_EQ(list.getLength(), 6u);
  EXPECT_EQ(Narrow(list.item(0).getNodeValue()), " ");
  EXPECT_EQ(Narrow(list.item(1).getNodeName()), "b");
  EXPECT_EQ(list.item(5).getNodeType(), DOM_Node::CDATA_SECTION_NODE);
  EXPECT_TRUE(list.item(6).isNull());
  EXPECT_TRUE(list.item(0xFFFFFFFF).isNull());
}

TEST(DOM_NodeList, FollowsLaterChanges) {
  DOM_Document document = ParseText("<a><b/></a>");
  DOM_Node root = document.getDocumentElement();
  const DOM_NodeList list = root.getChildNodes();
  EXPECT_EQ(list.getLength(), 1u);
  root.appendChild(document.createElement("c"));
  EXPECT_EQ(list.getLength(), 2u);
  root.removeChild(root.getFirstChild());
  EXPECT_EQ(list.getLength(), 1u);
  EXPECT_EQ(Narrow(list.item(0).getNodeName()), "c");
}

// Positions are answered from indexes that changes must keep or drop; here they are compared with a
// plain array of children through ten thousand changes.
TEST(DOM_NodeList, AgreesWithAPlainArrayThroughRandomChanges) {
  DOM_Document document = ParseText("<a/>");
  DOM_Node root = document.getDocumentElement();
  constexpr int kParents = 12;
  std::vector<DOM_Node> parents;
  std::vector<std::vector<DOM_Node>> children(kParents);
  for (int i = 0; i < kParents; ++i)
    parents.push_back(root.appendChild(document.createElement("parent")));
  std::mt19937 random(20261120);
  const auto below = [&random](std::size_t inEnd) { return random() % inEnd; };
  for (int step = 0; step < 10000; ++step) {
    const std::size_t p = below(kParents);
    std::vector<DOM_Node>& mine = children[p];
    const std::size_t position = below(mine.size() + 1);
    const DOM_Node before = position < mine.size() ? mine[position] : DOM_Node();
    const auto at = mine.begin() + static_cast<std::ptrdiff_t>(position);
    switch (below(10)) {
      case 0:
      case 1:
      case 2:
        mine.push_back(parents[p].appendChild(document.createElement("c")));
        break;
      case 3:
      case 4:
        mine.insert(at, parents[p].insertBefore(document.createElement("c"), before));
        break;
      case 5:
        if (before.isNull()) break;
        parents[p].removeChild(before);
        mine.erase(at);
        break;
      case 6: {  // a child moves to another parent's end
        if (before.isNull()) break;
        const std::size_t q = below(kParents);
        mine.erase(at);
        parents[q].appendChild(before);
        children[q].push_back(before);
        break;
      }
      case 7:
        if (before.isNull()) break;
        *at = document.createComment("new");
        parents[p].replaceChild(*at, before);
        break;
      default:
        break;
    }
    const std::size_t q = below(kParents);
    const DOM_NodeList list = parents[q].getChildNodes();
    ASSERT_EQ(list.getLength(), children[q].size()) << "step " << step;
    const std::size_t asked = below(children[q].size() + 1);
    if (asked < children[q].size())
      ASSERT_EQ(list.item(static_cast<unsigned int>(asked)), children[q][asked]) << step;
    else
      ASSERT_TRUE(list.item(static_cast<unsigned int>(asked)).isNull()) << step;
  }
  for (int p = 0; p < kParents; ++p)
    for (std::size_t i = 0; i < children[p].size(); ++i)
      ASSERT_EQ(parents[p].getChildNodes().item(static_cast<unsigned int>(i)), children[p][i]);
}

// Made anew at every call and at three levels at once. Each level quadratic would take hours here.
TEST(DOM_NodeList, NestedWalksByPositionStayLinear) {
  DOM_Document document = ParseText("<a/>");
  DOM_Node root = document.getDocumentElement();
  constexpr unsigned int kOuter = 30000;
  for (unsigned int i = 0; i < kOuter; ++i) {
    DOM_Node child = root.appendChild(document.createElement("b"));
    for (int j = 0; j < 2; ++j) {
      DOM_Node inner = child.appendChild(document.createElement("c"));
      for (int k = 0; k < (i % 100 == 0 ? 40 : 2); ++k)
        inner.appendChild(document.createTextNode("t"));
    }
  }
  std::size_t leaves = 0;
  for (unsigned int i = 0; i < root.getChildNodes().getLength(); ++i)
    for (unsigned int j = 0; j < root.getChildNodes().item(i).getChildNodes().getLength(); ++j) {
      const DOM_Node inner = root.getChildNodes().item(i).getChildNodes().item(j);
      for (unsigned int k = 0; k < inner.getChildNodes().getLength(); ++k)
        leaves += inner.getChildNodes().item(k).getNodeType() == DOM_Node::TEXT_NODE;
    }
  EXPECT_EQ(leaves, kOuter / 100 * 99 * 4 + kOuter / 100 * 80);
}

TEST(DOM_NodeList, AppendingWhileWalkingStaysLinear) {
  DOM_Document document = ParseText("<a><b/></a>");
  DOM_Node root = document.getDocumentElement();
  unsigned int seen = 0;
  for (unsigned int i = 0; i < root.getChildNodes().getLength(); ++i) {
    ++seen;
    if (i < 99999) root.appendChild(document.createElement("b"));
    ASSERT_FALSE(root.getChildNodes().item(i).isNull());
  }
  EXPECT_EQ(seen, 100000u);
}

TEST(DOM_NamedNodeMap, DefaultMapIsNullAndEmpty) {
  const DOM_NamedNodeMap map;
  EXPECT_TRUE(map.isNull());
  EXPECT_EQ(map.getLength(), 0u);
  EXPECT_TRUE(map.item(0).isNull());
  EXPECT_TRUE(map.getNamedItem("a").isNull());
}

TEST(DOM_NamedNodeMap, AttributesInDocumentOrderAndByName) {
  const DOM_NamedNodeMap map = RootOf("<a z='1' y='2' x='3'/>").getAttributes();
  ASSERT_EQ(map.getLength(), 3u);
  EXPECT_EQ(Narrow(map.item(0).getNodeName()), "z");
  EXPECT_EQ(Narrow(map.item(2).getNodeValue()), "3");
  EXPECT_EQ(Narrow(map.item(1).getNodeName()), "y");
  EXPECT_TRUE(map.item(3).isNull());
  EXPECT_EQ(Narrow(map.getNamedItem("y").getNodeValue()), "2");
  EXPECT_TRUE(map.getNamedItem("Y").isNull());
  EXPECT_TRUE(map.getNamedItem(DOMString()).isNull());
}

TEST(DOM_NamedNodeMap, NarrowNamesOfAnyKindAreFound) {
  const std::string longName(80, 'n');
  const DOM_Element root =
      RootOf("<a k='1' \xC3\xA9='2' " + longName + "='3' " + longName.substr(0, 64) + "='4'/>");
  const DOM_NamedNodeMap map = root.getAttributes();
  EXPECT_TRUE(map.getNamedItem("k").getNodeValue().equals("1"));
  EXPECT_TRUE(map.getNamedItem("\xC3\xA9").getNodeValue().equals("2"));
  EXPECT_TRUE(map.getNamedItem(longName.c_str()).getNodeValue().equals("3"));
  EXPECT_TRUE(map.getNamedItem(longName.substr(0, 64).c_str()).getNodeValue().equals("4"));
  EXPECT_TRUE(map.getNamedItem("K").isNull());
  EXPECT_TRUE(map.getNamedItem("").isNull());
  const char* const none = nullptr;
  EXPECT_TRUE(map.getNamedItem(none).isNull());
}

// Those that a document type adds stand last.
TEST(DOM_NamedNodeMap, DefaultAttributesStandBehindTheOthers) {
  const DOM_Element root =
      RootOf("<!DOCTYPE a [<!ATTLIST a b CDATA 'x' c CDATA 'y'>]><a z='1' c='2' k='3'/>");
  const DOM_NamedNodeMap map = root.getAttributes();
  ASSERT_EQ(map.getLength(), 4u);
  EXPECT_TRUE(map.item(0).getNodeName().equals("z"));
  EXPECT_TRUE(map.item(1).getNodeName().equals("c"));
  EXPECT_TRUE(map.item(1).getNodeValue().equals("2"));
  EXPECT_TRUE(map.item(2).getNodeName().equals("k"));
  EXPECT_TRUE(map.item(3).getNodeName().equals("b"));
}

TEST(DOM_NamedNodeMap, ElementWithoutAttributesHasAnEmptyMap) {
  const DOM_NamedNodeMap map = RootOf("<a/>").getAttributes();
  EXPECT_FALSE(map.isNull());
  EXPECT_EQ(map.getLength(), 0u);
  EXPECT_TRUE(map.item(0).isNull());
  EXPECT_TRUE(RootOf("<a>t</a>").getFirstChild().getAttributes().isNull());
}

TEST(DOM_NamedNodeMap, FollowsLaterChanges) {
  DOM_Element element = RootOf("<a x='1' y='2' z='3'/>");
  const DOM_NamedNodeMap map = element.getAttributes();
  EXPECT_EQ(Narrow(map.item(2).getNodeName()), "z");
  element.removeAttribute("x");
  EXPECT_EQ(map.getLength(), 2u);
  EXPECT_EQ(Narrow(map.item(0).getNodeName()), "y");
  EXPECT_EQ(Narrow(map.item(1).getNodeName()), "z");
  EXPECT_TRUE(map.item(2).isNull());
  element.setAttribute("w", "4");
  EXPECT_EQ(map.getLength(), 3u);
  EXPECT_EQ(Narrow(map.item(2).getNodeName()), "w");
  element.removeAttribute("w");
  element.removeAttribute("y");
  element.removeAttribute("z");
  EXPECT_EQ(map.getLength(), 0u);
  EXPECT_TRUE(map.item(0).isNull());
}

TEST(DOM_NamedNodeMap, WalkOfManyAttributesStaysLinear) {
  std::string text = "<a";
  constexpr unsigned int kAttributes = 50000;
  for (unsigned int i = 0; i < kAttributes; ++i) text += " a" + std::to_string(i) + "=''";
  const DOM_Element element = RootOf(text + "/>");
  unsigned int seen = 0;
  for (unsigned int i = 0; i < element.getAttributes().getLength(); ++i)
    seen += Narrow(element.getAttributes().item(i).getNodeName()) == "a" + std::to_string(i);
  EXPECT_EQ(seen, kAttributes);
}
