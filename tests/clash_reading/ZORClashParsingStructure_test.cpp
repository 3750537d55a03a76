// What stands under the root: lists, single nodes, checks by position, errors and root attributes.
#include <gtest/gtest.h>

#include "support/LoadedReader.h"

namespace {

using support::Attribute;
using support::kUntouched;
using support::LoadedReader;
using support::Name;
using support::SharedReader;
using support::Text;

// ---- GetNodeList and GetElementsNode

TEST(ZORClashParsing, GetNodeListGivesNodesOfAllTypes) {
  LoadedReader reader("<ClashElement> <Date/><!-- c --><ClashSpec/>t</ClashElement>");
  const DOM_NodeList nodes = reader->GetNodeList();
  ASSERT_EQ(5u, nodes.getLength());
  EXPECT_EQ(DOM_Node::TEXT_NODE, nodes.item(0).getNodeType());
  EXPECT_EQ("Date", Name(nodes.item(1)));
  EXPECT_EQ(DOM_Node::COMMENT_NODE, nodes.item(2).getNodeType());
  EXPECT_EQ("ClashSpec", Name(nodes.item(3)));
  EXPECT_EQ(DOM_Node::TEXT_NODE, nodes.item(4).getNodeType());
}

TEST(ZORClashParsing, GetNodeListOfAFederatorGivesTheRootsChildren) {
  LoadedReader reader("<FederatorClashElement><Elements/></FederatorClashElement>");
  EXPECT_EQ(1u, reader->GetNodeList().getLength());
}

TEST(ZORClashParsing, GetNodeListOfASingleInterferenceIsEmpty) {
  LoadedReader reader("<InterferenceElement><Interference/></InterferenceElement>");
  EXPECT_EQ(0u, reader->GetNodeList().getLength());
  EXPECT_EQ(1, reader->GetNbProd());
}

TEST(ZORClashParsing, GetNodeListOfOtherKindsIsEmpty) {
  EXPECT_EQ(0u, LoadedReader("<Components><C/></Components>")->GetNodeList().getLength());
  EXPECT_EQ(0u, LoadedReader("<Errors><Error/></Errors>")->GetNodeList().getLength());
  EXPECT_EQ(0u, LoadedReader("<Drawing><C/></Drawing>")->GetNodeList().getLength());
}

TEST(ZORClashParsing, GetElementsNodeGivesTheFirstOne) {
  LoadedReader reader(
      "<FederatorClashElement>\n <elements/><Elements Id=\"1\"/><Elements Id=\"2\"/>"
      "</FederatorClashElement>");
  EXPECT_EQ("1", Attribute(reader->GetElementsNode(), "Id"));
}

TEST(ZORClashParsing, GetElementsNodeWithoutOneIsNull) {
  LoadedReader reader("<FederatorClashElement><Other><Elements/></Other></FederatorClashElement>");
  EXPECT_TRUE(reader->GetElementsNode().isNull());
}

TEST(ZORClashParsing, GetElementsNodeOfAClashDocumentIsNullThoughThereIsOne) {
  LoadedReader reader("<ClashElement><Elements/></ClashElement>");
  EXPECT_TRUE(reader->GetElementsNode().isNull());
}

// ---- GetValideNode

constexpr const char* kMixedChildren =
    "<ClashElement>t<N Id=\"1\"/>t<M/>t<N Id=\"2\"/>t</ClashElement>";

TEST(ZORClashParsing, GetValideNodeCountsElementsOfTheName) {
  SharedReader reader(kMixedChildren);
  DOM_Node node;
  EXPECT_EQ(S_OK, reader->GetValideNode(reader.root, 1, "N", node));
  EXPECT_EQ("1", Attribute(node, "Id"));
  EXPECT_EQ(S_OK, reader->GetValideNode(reader.root, 2, "N", node));
  EXPECT_EQ("2", Attribute(node, "Id"));
  EXPECT_EQ(S_OK, reader->GetValideNode(reader.root, 1, "M", node));
  EXPECT_EQ("M", Name(node));
}

TEST(ZORClashParsing, GetValideNodeBeyondTheLastOfTheNameFails) {
  SharedReader reader(kMixedChildren);
  DOM_Node node = reader.document;
  EXPECT_EQ(E_FAIL, reader->GetValideNode(reader.root, 3, "N", node));
  EXPECT_EQ(E_FAIL, reader->GetValideNode(reader.root, 2, "M", node));
  EXPECT_EQ(E_FAIL, reader->GetValideNode(reader.root, 1, "n", node));
  EXPECT_EQ(reader.document, node);
}

TEST(ZORClashParsing, GetValideNodeOfTheNumberOfChildrenFailsWhateverTheyAre) {
  SharedReader seven("<ClashElement><N/><N/><N/><N/><N/><N/><N/></ClashElement>");
  DOM_Node node = seven.document;
  EXPECT_EQ(E_FAIL, seven->GetValideNode(seven.root, 7, "N", node));
  EXPECT_EQ(E_FAIL, seven->GetValideNode(seven.root, 8, "N", node));
  EXPECT_EQ(seven.document, node);
  EXPECT_EQ(S_OK, seven->GetValideNode(seven.root, 6, "N", node));
}

TEST(ZORClashParsing, GetValideNodeOfAnOnlyChildFails) {
  SharedReader reader("<ClashElement><N/></ClashElement>");
  DOM_Node node = reader.document;
  EXPECT_EQ(E_FAIL, reader->GetValideNode(reader.root, 1, "N", node));
  EXPECT_EQ(reader.document, node);
}

TEST(ZORClashParsing, GetValideNodeOfAnOnlyElementWithSpaceAroundItSucceeds) {
  SharedReader reader("<ClashElement> <N/> </ClashElement>");
  DOM_Node node;
  EXPECT_EQ(S_OK, reader->GetValideNode(reader.root, 1, "N", node));
  EXPECT_EQ("N", Name(node));
}

TEST(ZORClashParsing, GetValideNodeOfZeroOrLessFails) {
  SharedReader reader(kMixedChildren);
  DOM_Node node = reader.document;
  EXPECT_EQ(E_FAIL, reader->GetValideNode(reader.root, 0, "N", node));
  EXPECT_EQ(E_FAIL, reader->GetValideNode(reader.root, -1, "N", node));
  EXPECT_EQ(E_FAIL, reader->GetValideNode(reader.root, -2147483647 - 1, "N", node));
  EXPECT_EQ(reader.document, node);
}

TEST(ZORClashParsing, GetValideNodeOfANullParentFails) {
  SharedReader reader(kMixedChildren);
  DOM_Node node = reader.document;
  EXPECT_EQ(E_FAIL, reader->GetValideNode(DOM_Node(), 1, "N", node));
  EXPECT_EQ(reader.document, node);
}

TEST(ZORClashParsing, GetValideNodeDoesNotLookDeeper) {
  SharedReader reader("<ClashElement> <M><N/></M> </ClashElement>");
  DOM_Node node = reader.document;
  EXPECT_EQ(E_FAIL, reader->GetValideNode(reader.root, 1, "N", node));
}

TEST(ZORClashParsing, GetValideNodeTakesNoNameOfATextNode) {
  SharedReader reader("<ClashElement>t<N/>t</ClashElement>");
  DOM_Node node = reader.document;
  EXPECT_EQ(E_FAIL, reader->GetValideNode(reader.root, 1, "#text", node));
}

TEST(ZORClashParsing, GetValideNodeNeedsNoLoadedReader) {
  const SharedReader other(kMixedChildren);
  ZORClashParsing reader(nullptr, 0);
  DOM_Node node;
  EXPECT_EQ(S_OK, reader.GetValideNode(other.root, 2, "N", node));
  EXPECT_EQ("2", Attribute(node, "Id"));
}

TEST(ZORClashParsing, GetValideNodeWorksOnAnotherDocument) {
  const SharedReader other(kMixedChildren);
  LoadedReader reader("<ClashElement> <N Id=\"own\"/> </ClashElement>");
  DOM_Node node;
  EXPECT_EQ(S_OK, reader->GetValideNode(other.root, 2, "N", node));
  EXPECT_EQ("2", Attribute(node, "Id"));
}

TEST(ZORClashParsing, GetValideNodeTakesTheDocumentAsParent) {
  SharedReader reader("<!-- before --><ClashElement/>");
  DOM_Node node;
  EXPECT_EQ(S_OK, reader->GetValideNode(reader.document, 1, "ClashElement", node));
  EXPECT_EQ(reader.root, node);
}

// ---- IsValideNode

TEST(ZORClashParsing, IsValideNodeComparesTheElementAtThePosition) {
  LoadedReader reader("<ClashElement> <Date/><!-- c --><ClashSpec/></ClashElement>");
  EXPECT_EQ(0, reader->IsValideNode(0, "Date"));
  EXPECT_EQ(1, reader->IsValideNode(1, "Date"));
  EXPECT_EQ(0, reader->IsValideNode(1, "date"));
  EXPECT_EQ(0, reader->IsValideNode(2, "ClashSpec"));
  EXPECT_EQ(1, reader->IsValideNode(3, "ClashSpec"));
  EXPECT_EQ(0, reader->IsValideNode(4, "ClashSpec"));
}

TEST(ZORClashParsing, IsValideNodeTakesNoNameOfOtherNodes) {
  LoadedReader reader("<ClashElement>t<!-- c --><?N p?></ClashElement>");
  EXPECT_EQ(0, reader->IsValideNode(0, "#text"));
  EXPECT_EQ(0, reader->IsValideNode(1, "#comment"));
  EXPECT_EQ(0, reader->IsValideNode(2, "N"));
}

TEST(ZORClashParsing, IsValideNodeFindsAComponentShape) {
  LoadedReader reader(
      "<Components><C><ComponentShapes>\n<ComponentShape/></ComponentShapes></C></Components>");
  EXPECT_EQ(1, reader->IsValideNode(0, 0, ""));
}

TEST(ZORClashParsing, IsValideNodeIgnoresItsLastTwoArguments) {
  LoadedReader reader(
      "<Components><C><ComponentShapes><ComponentShape/></ComponentShapes></C><C/></Components>");
  EXPECT_EQ(1, reader->IsValideNode(0, 99, "no such name"));
  EXPECT_EQ(1, reader->IsValideNode(0, -1, "C"));
  EXPECT_EQ(0, reader->IsValideNode(1, 0, "C"));
}

TEST(ZORClashParsing, IsValideNodeLooksIntoEveryShapeContainer) {
  LoadedReader reader(
      "<Components><C><ComponentShapes/><ComponentShapes>t</ComponentShapes>"
      "<ComponentShapes><ComponentShape/></ComponentShapes></C></Components>");
  EXPECT_EQ(1, reader->IsValideNode(0, 0, ""));
}

TEST(ZORClashParsing, IsValideNodeWithoutShapeIsZero) {
  LoadedReader reader(
      "<Components><C/><C><ComponentShapes/></C><C><ComponentShape/></C>"
      "<C><ComponentShapes><Shape/></ComponentShapes></C></Components>");
  for (int position = 0; position < 4; ++position)
    EXPECT_EQ(0, reader->IsValideNode(position, 0, "")) << position;
}

TEST(ZORClashParsing, IsValideNodeOfShapesPastTheEndIsZero) {
  LoadedReader reader(
      "<Components><C><ComponentShapes><ComponentShape/></ComponentShapes></C></Components>");
  EXPECT_EQ(0, reader->IsValideNode(1, 0, ""));
  EXPECT_EQ(0, reader->IsValideNode(2147483647, 0, ""));
}

// ---- Errors and the root's attributes

struct ErrorOutputs {
  explicit ErrorOutputs(LoadedReader& ioReader) { ioReader->GetErrorId(message, id); }
  ZORUnicodeString message = kUntouched;
  int id = 77;
};

TEST(ZORClashParsing, GetErrorIdGivesTheFirstError) {
  LoadedReader reader(
      "<Errors> <Warning/><Error Message=\"no licence\" ErrorId=\"12\"/>"
      "<Error Message=\"other\" ErrorId=\"13\"/></Errors>");
  const ErrorOutputs error(reader);
  EXPECT_EQ("no licence", Text(error.message));
  EXPECT_EQ(12, error.id);
}

TEST(ZORClashParsing, GetErrorIdWithoutErrorIsMinusOne) {
  LoadedReader reader("<Errors><Warning Message=\"w\" ErrorId=\"3\"/></Errors>");
  const ErrorOutputs error(reader);
  EXPECT_EQ(kUntouched, Text(error.message));
  EXPECT_EQ(-1, error.id);
}

TEST(ZORClashParsing, GetErrorIdOfARootWithoutChildrenIsMinusOne) {
  LoadedReader reader("<Errors/>");
  const ErrorOutputs error(reader);
  EXPECT_EQ(kUntouched, Text(error.message));
  EXPECT_EQ(-1, error.id);
}

TEST(ZORClashParsing, GetErrorIdWithoutDocumentIsMinusOne) {
  LoadedReader reader("");
  const ErrorOutputs error(reader);
  EXPECT_EQ(kUntouched, Text(error.message));
  EXPECT_EQ(-1, error.id);
}

TEST(ZORClashParsing, GetErrorIdWorksInADocumentOfAnyKind) {
  LoadedReader reader("<ClashElement><Error Message=\"m\" ErrorId=\"5\"/></ClashElement>");
  const ErrorOutputs error(reader);
  EXPECT_EQ("m", Text(error.message));
  EXPECT_EQ(5, error.id);
}

TEST(ZORClashParsing, GetErrorIdThatIsNoNumberIsMinusOneWithTheMessage) {
  LoadedReader reader("<Errors><Error Message=\"m\" ErrorId=\"fatal\"/></Errors>");
  const ErrorOutputs error(reader);
  EXPECT_EQ("m", Text(error.message));
  EXPECT_EQ(-1, error.id);
}

TEST(ZORClashParsing, GetErrorIdWithoutAttributesEmptiesTheMessage) {
  LoadedReader reader("<Errors><Error/></Errors>");
  const ErrorOutputs error(reader);
  EXPECT_EQ("", Text(error.message));
  EXPECT_EQ(-1, error.id);
}

TEST(ZORClashParsing, GetErrorIdReadsTheNumberAtTheBeginning) {
  LoadedReader negative("<Errors><Error ErrorId=\"-4\"/></Errors>");
  EXPECT_EQ(-4, ErrorOutputs(negative).id);
  LoadedReader blanks("<Errors><Error ErrorId=\"  8 \"/></Errors>");
  EXPECT_EQ(8, ErrorOutputs(blanks).id);
  LoadedReader more("<Errors><Error ErrorId=\"9.5x\"/></Errors>");
  EXPECT_EQ(9, ErrorOutputs(more).id);
}

TEST(ZORClashParsing, RootAttributesComeAsTheyStand) {
  LoadedReader reader("<Errors ServerMarker=\" s \" Transaction=\"t&amp;u\" PRCName=\"prc\"/>");
  EXPECT_EQ(" s ", Text(reader->GetServerMarker()));
  EXPECT_EQ("t&u", Text(reader->GetTransaction()));
  EXPECT_EQ("prc", Text(reader->GetPRCName()));
}

TEST(ZORClashParsing, MissingRootAttributesAreEmpty) {
  LoadedReader reader("<ClashElement serverMarker=\"s\"/>");
  EXPECT_EQ("", Text(reader->GetServerMarker()));
  EXPECT_EQ("", Text(reader->GetTransaction()));
  EXPECT_EQ("", Text(reader->GetPRCName()));
}

}  // namespace
