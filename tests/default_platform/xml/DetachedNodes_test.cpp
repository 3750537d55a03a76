// How long nodes live: those outside the tree only as long as they can be reached.
#include <gtest/gtest.h>

#include <random>
#include <vector>

#include "default_platform/xml/DOM_HandleAccess.h"
#include "platform/xml/DOM_NamedNodeMap.h"
#include "platform/xml/DOM_NodeList.h"
#include "support/XMLText.h"

using support::Narrow;
using support::ParseText;
using support::RootOf;
using support::WrittenText;

namespace {
std::uint32_t LiveNodes(const DOM_Node& inNode) {
  const DOM_Tree& tree = *DOM_HandleAccess::TreeOf(inNode);
  std::uint32_t live = 0;
  for (DOM_Tree::Node node = DOM_Tree::kDocument; node < tree.NodeEnd(); ++node)
    live += (tree.At(node).flags & DOM_Tree::kFree) == 0;
  return live;
}
}  // namespace

TEST(DetachedNodes, GoWithTheirLastHandle) {
  DOM_Document document = ParseText("<a/>");
  ASSERT_EQ(LiveNodes(document), 2u);
  {
    const DOM_Node made = document.createElement("b");
    const DOM_Node another = made;
    EXPECT_EQ(LiveNodes(document), 3u);
  }
  EXPECT_EQ(LiveNodes(document), 2u);
}

TEST(DetachedNodes, AMillionClonesNeedTheRoomOfOne) {
  const DOM_Document document = ParseText("<a><b x='1'><c/>t</b></a>");
  const DOM_Node b = document.getDocumentElement().getFirstChild();
  for (int i = 0; i < 1000000; ++i) b.cloneNode(true);
  EXPECT_EQ(LiveNodes(document), 5u);
}

TEST(DetachedNodes, ImportsThatAreDroppedLeaveNothing) {
  const DOM_Document source = ParseText("<a><b/><c><d/></c></a>");
  DOM_Document target = ParseText("<z/>");
  for (int i = 0; i < 1000; ++i) target.importNode(source.getDocumentElement(), true);
  EXPECT_EQ(LiveNodes(target), 2u);
}

TEST(DetachedNodes, AnyHandleInTheTreeKeepsAllOfIt) {
  DOM_Document document = ParseText("<a><b><c/><d>t</d></b></a>");
  DOM_Node inner;
  {
    const DOM_Node copy = document.getDocumentElement().cloneNode(true);
    inner = copy.getFirstChild().getLastChild().getFirstChild();
  }
  DOM_Node top = inner;
  while (!top.getParentNode().isNull()) top = top.getParentNode();
  EXPECT_EQ(WrittenText(top), "<a><b><c/><d>t</d></b></a>");
  top = DOM_Node();
  inner = DOM_Node();
  EXPECT_EQ(LiveNodes(document), 6u);
}

TEST(DetachedNodes, AttributesAndListsKeepThemToo) {
  DOM_Document document = ParseText("<a k='v'><b/></a>");
  DOM_NodeList list = document.getDocumentElement().cloneNode(true).getChildNodes();
  EXPECT_EQ(list.getLength(), 1u);
  DOM_Node attribute = list.item(0).getParentNode().getAttributes().item(0);
  list = DOM_NodeList();
  EXPECT_EQ(LiveNodes(document), 5u);
  EXPECT_EQ(Narrow(attribute.getNodeValue()), "v");
  attribute = DOM_Node();
  EXPECT_EQ(LiveNodes(document), 3u);
}

TEST(DetachedNodes, AttachedOnesStayWithoutHandles) {
  DOM_Document document = ParseText("<a/>");
  document.getDocumentElement().appendChild(document.createElement("b"));
  EXPECT_EQ(WrittenText(document), "<a><b/></a>");
  EXPECT_EQ(LiveNodes(document), 3u);
}

TEST(DetachedNodes, RemovedOnesStayReachable) {
  DOM_Document document = ParseText("<a><b><c/></b></a>");
  const DOM_Node c = document.getDocumentElement().getFirstChild().getFirstChild();
  document.getDocumentElement().removeChild(document.getDocumentElement().getFirstChild());
  EXPECT_EQ(WrittenText(c.getParentNode()), "<b><c/></b>");
}

TEST(DetachedNodes, JoinedTreesLiveTogether) {
  DOM_Document document = ParseText("<a/>");
  DOM_Node outer = document.createElement("o");
  DOM_Node inner = document.createElement("i");
  inner.appendChild(document.createElement("j"));
  outer.appendChild(inner);
  outer = DOM_Node();
  EXPECT_EQ(WrittenText(inner.getParentNode()), "<o><i><j/></i></o>");
  EXPECT_EQ(LiveNodes(document), 5u);
  inner = DOM_Node();
  EXPECT_EQ(LiveNodes(document), 2u);
}

TEST(DetachedNodes, PartsTakenOutOfADetachedTreeStayWhileHeld) {
  DOM_Document document = ParseText("<a/>");
  DOM_Node outer = document.createElement("o");
  DOM_Node part = outer.appendChild(document.createElement("p"));
  part.appendChild(document.createTextNode("t"));
  outer.removeChild(part);
  outer = DOM_Node();
  EXPECT_EQ(WrittenText(part), "<p>t</p>");
  part = DOM_Node();
  EXPECT_EQ(LiveNodes(document), 2u);
}

TEST(DetachedNodes, AttachingAPartFreesTheRestWithItsHandles) {
  DOM_Document document = ParseText("<a/>");
  {
    DOM_Node fragment = document.createDocumentFragment();
    const DOM_Node b = fragment.appendChild(document.createElement("b"));
    const DOM_Node c = fragment.appendChild(document.createElement("c"));
    document.getDocumentElement().appendChild(fragment);
    fragment = DOM_Node();
    EXPECT_EQ(LiveNodes(document), 4u);  // document, a, b, c
    EXPECT_EQ(b.getNextSibling(), c);
  }
  EXPECT_EQ(WrittenText(document), "<a><b/><c/></a>");
}

TEST(DetachedNodes, ARemovedNodePutIntoADetachedOneKeepsItAlive) {
  DOM_Document document = ParseText("<a><b/></a>");
  const DOM_Node b = document.getDocumentElement().getFirstChild();
  {
    DOM_Node made = document.createElement("m");
    made.appendChild(b);
  }
  EXPECT_EQ(WrittenText(b.getParentNode()), "<m><b/></m>");
}

TEST(DetachedNodes, OneFragmentUsedAgainAndAgain) {
  DOM_Document document = ParseText("<a/>");
  DOM_Node root = document.getDocumentElement();
  DOM_Node fragment = document.createDocumentFragment();
  for (int i = 0; i < 10000; ++i) {
    fragment.appendChild(document.createElement("b"));
    root.appendChild(fragment);
    root.removeChild(root.getFirstChild());
  }
  EXPECT_EQ(LiveNodes(document), 10003u);  // what leaves the tree goes with the document
}

// Trees are built, joined, split, attached and dropped at random. Whatever is held must stay whole,
// and when nothing is held only the tree remains.
TEST(DetachedNodes, RandomUseLosesNothingAndLeavesNothing) {
  DOM_Document document = ParseText("<a/>");
  const std::uint32_t before = LiveNodes(document);
  std::mt19937 random(7);
  std::uint64_t serial = 0;
  std::vector<DOM_Node> held;
  std::vector<std::string> names;
  for (int step = 0; step < 30000; ++step) {
    const std::size_t i = held.empty() ? 0 : random() % held.size();
    switch (random() % 6) {
      case 0:
      case 1:
        names.push_back("n" + std::to_string(++serial));
        held.push_back(document.createElement(names.back().c_str()));
        break;
      case 2: {
        if (held.empty()) break;
        const std::size_t j = random() % held.size();
        bool isWithin = false;
        for (DOM_Node at = held[i]; !at.isNull(); at = at.getParentNode())
          isWithin = isWithin || at == held[j];
        if (!isWithin) held[i].appendChild(held[j]);
        break;
      }
      case 3:
        if (held.empty() || held[i].getParentNode().isNull()) break;
        held[i].getParentNode().removeChild(held[i]);
        break;
      case 4:
        if (held.empty()) break;
        names.push_back(names[i]);
        held.push_back(held[i].cloneNode(true));
        break;
      default:
        if (held.empty()) break;
        held[i] = held.back();
        names[i] = names.back();
        held.pop_back();
        names.pop_back();
    }
    if (held.size() > 60) {
      held.erase(held.begin(), held.begin() + 30);
      names.erase(names.begin(), names.begin() + 30);
    }
    for (std::size_t k = 0; k < held.size(); ++k)
      ASSERT_TRUE(held[k].getNodeName().equals(names[k].c_str())) << "step " << step;
  }
  held.clear();
  EXPECT_EQ(LiveNodes(document), before);
  EXPECT_EQ(WrittenText(document), "<a/>");
}
