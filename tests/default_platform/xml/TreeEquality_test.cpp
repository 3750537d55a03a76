#include "support/TreeEquality.h"

#include <gtest/gtest.h>

using support::ParseText;
using support::TreeDifference;

TEST(TreeEquality, EqualDocumentsDoNotDiffer) {
  const char* const text = "<?p q?><a x='1' y='2'><b/>t<![CDATA[s]]><!--c--><d><e/></d></a>";
  EXPECT_EQ(TreeDifference(ParseText(text), ParseText(text)), "");
}

TEST(TreeEquality, EverySingleDifferenceIsSeen) {
  const DOM_Document document = ParseText("<a x='1' y='2'><b/>t<d><e/></d></a>");
  for (const char* const other :
       {"<z x='1' y='2'><b/>t<d><e/></d></z>", "<a x='1' y='3'><b/>t<d><e/></d></a>",
        "<a y='2' x='1'><b/>t<d><e/></d></a>", "<a x='1'><b/>t<d><e/></d></a>",
        "<a x='1' y='2' z='3'><b/>t<d><e/></d></a>", "<a x='1' y='2'><b/>u<d><e/></d></a>",
        "<a x='1' y='2'><b/><![CDATA[t]]><d><e/></d></a>", "<a x='1' y='2'><b/>t<d></d></a>",
        "<a x='1' y='2'><b/>t<d><e/><f/></d></a>", "<a x='1' y='2'><b/>t<d><e/></d><f/></a>",
        "<a x='1' y='2'><b/>t</a>", "<a x='1' y='2'><b><c/></b>t<d><e/></d></a>",
        "<!DOCTYPE a><a x='1' y='2'><b/>t<d><e/></d></a>",
        "<a x='1' y='2'><b/>t<d><e/></d></a><!---->"}) {
    EXPECT_NE(TreeDifference(document, ParseText(other)), "") << other;
    EXPECT_NE(TreeDifference(ParseText(other), document), "") << other;
  }
}

TEST(TreeEquality, OnlyTheGivenNodesAreCompared) {
  const DOM_Element a = support::RootOf("<a><b/><c/></a>");
  const DOM_Element b = support::RootOf("<a><b/><d/></a>");
  EXPECT_EQ(TreeDifference(a.getFirstChild(), b.getFirstChild()), "");
  EXPECT_NE(TreeDifference(a.getLastChild(), b.getLastChild()), "");
}

TEST(TreeEquality, DocumentTypesAreComparedByWhatTheyDeclare) {
  EXPECT_NE(TreeDifference(ParseText("<!DOCTYPE a SYSTEM 'x'><a/>"),
                           ParseText("<!DOCTYPE a SYSTEM 'y'><a/>")),
            "");
}

TEST(TreeEquality, ANullNodeEqualsOnlyANullNode) {
  EXPECT_EQ(TreeDifference(DOM_Node(), DOM_Node()), "");
  EXPECT_NE(TreeDifference(DOM_Node(), ParseText("<a/>")), "");
}
