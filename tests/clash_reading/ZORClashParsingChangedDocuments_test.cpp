// The loaded tree is the caller's too: after a change, the next answer is that of the changed tree.
#include <gtest/gtest.h>

#include <string>

#include "support/LoadedReader.h"

namespace {

using support::Attribute;
using support::ClashInfos;
using support::IthInterference;
using support::kUntouched;
using support::SharedReader;
using support::ShortInfos;
using support::SpecifiedProducts;
using support::Text;

// A document of two result sets with the interferences 1, 2 and 3.
constexpr const char* kClash =
    "<ClashElement>"
    "<ClashResult Name=\"first\" ComputationCase=\"c1\">"
    "<Interference Name=\"1\" Value=\"1\" DistanceClearance=\"1\"><Picture "
    "HRef=\"1.jpg\"/></Interference>"
    "<Interference Name=\"2\" Value=\"2\" DistanceClearance=\"2\"><Picture "
    "HRef=\"2.jpg\"/></Interference>"
    "</ClashResult>"
    "<ClashResult Name=\"second\" ComputationCase=\"c2\">"
    "<Interference Name=\"3\" Value=\"3\" DistanceClearance=\"3\"><Picture "
    "HRef=\"3.jpg\"/></Interference>"
    "</ClashResult></ClashElement>";

/// Answers about the interferences of a document, before and after changes.
class ChangedClash : public testing::Test {
 protected:
  std::string Ith(int inIndex) {
    IthInterference ith;
    return ith.Read(*reader, inIndex).result == S_OK ? Attribute(ith.interference, "Name") : "none";
  }
  std::string Value(int inIndex) { return ShortInfos().Read(*reader, inIndex).Texts()[0]; }
  std::string Clearance(int inIndex) { return ClashInfos("").Read(*reader, "1.2", inIndex)[2]; }
  std::string ResultName() { return Text(ClashInfos().Read(*reader, "1.2", 1).resultName); }
  std::string Preview(int inIndex) {
    ZORUnicodeString picture = kUntouched;
    reader->GetClashPreviewURL(inIndex, picture);
    return Text(picture);
  }
  // What every numbered question says, so that an index is there that a change makes stale.
  std::string Names() {
    std::string names;
    for (int index = 1; Ith(index) != "none"; ++index) {
      EXPECT_EQ(Ith(index), Value(index));
      EXPECT_EQ(Ith(index), Clearance(index));
      names += Ith(index);
    }
    return names;
  }
  DOM_Node ResultSet(int inPosition) {
    return reader.root.getChildNodes().item(static_cast<unsigned int>(inPosition));
  }
  DOM_Element NewInterference(const char* inName) {
    DOM_Element element = reader.document.createElement("Interference");
    for (const char* attribute : {"Name", "Value", "DistanceClearance"})
      element.setAttribute(attribute, inName);
    DOM_Element picture = reader.document.createElement("Picture");
    picture.setAttribute("HRef", (std::string(inName) + ".jpg").c_str());
    element.appendChild(picture);
    return element;
  }

  SharedReader reader{kClash};
};

TEST_F(ChangedClash, AppendedInterferenceIsCounted) {
  ASSERT_EQ("123", Names());
  ASSERT_EQ("2.jpg", Preview(2));
  ResultSet(0).appendChild(NewInterference("4"));
  EXPECT_EQ("1243", Names());
  ResultSet(1).appendChild(NewInterference("5"));
  EXPECT_EQ("12435", Names());
  EXPECT_EQ("5.jpg", Preview(2));
  EXPECT_EQ("4.jpg", Preview(3));
}

TEST_F(ChangedClash, InsertedInterferenceIsCounted) {
  ASSERT_EQ("123", Names());
  ResultSet(0).insertBefore(NewInterference("0"), ResultSet(0).getFirstChild());
  EXPECT_EQ("0123", Names());
}

TEST_F(ChangedClash, RemovedInterferenceIsNotCounted) {
  ASSERT_EQ("123", Names());
  ASSERT_EQ("2.jpg", Preview(2));
  ResultSet(0).removeChild(ResultSet(0).getFirstChild());
  EXPECT_EQ("23", Names());
  EXPECT_EQ(kUntouched, Preview(2));
  EXPECT_EQ("3.jpg", Preview(1));
}

TEST_F(ChangedClash, ReplacedInterferenceIsTheNewOne) {
  ASSERT_EQ("123", Names());
  ResultSet(0).replaceChild(NewInterference("9"), ResultSet(0).getLastChild());
  EXPECT_EQ("193", Names());
  EXPECT_EQ("9.jpg", Preview(2));
}

TEST_F(ChangedClash, MovedInterferenceStandsAtItsNewPlace) {
  ASSERT_EQ("123", Names());
  ResultSet(1).appendChild(ResultSet(0).getFirstChild());
  EXPECT_EQ("231", Names());
  EXPECT_EQ("3.jpg", Preview(1));
  EXPECT_EQ("1.jpg", Preview(2));
}

// A node cannot be renamed: another of the other name takes its place.
TEST_F(ChangedClash, RenamedInterferenceIsNotCounted) {
  ASSERT_EQ("123", Names());
  ResultSet(0).replaceChild(reader.document.createElement("interference"),
                            ResultSet(0).getFirstChild());
  EXPECT_EQ("23", Names());
}

TEST_F(ChangedClash, RemovedResultSetTakesItsInterferences) {
  ASSERT_EQ("123", Names());
  ASSERT_EQ("second", ResultName());
  reader.root.removeChild(ResultSet(1));
  EXPECT_EQ("12", Names());
  EXPECT_EQ("first", ResultName());
}

TEST_F(ChangedClash, AppendedResultSetNamesTheResult) {
  ASSERT_EQ("second", ResultName());
  DOM_Element resultSet = reader.document.createElement("ClashResult");
  resultSet.setAttribute("Name", "third");
  resultSet.appendChild(NewInterference("4"));
  reader.root.appendChild(resultSet);
  EXPECT_EQ("third", ResultName());
  EXPECT_EQ("1234", Names());
}

TEST_F(ChangedClash, ResultSetsThatChangePlacesChangeTheNumbers) {
  ASSERT_EQ("123", Names());
  reader.root.appendChild(ResultSet(0));
  EXPECT_EQ("312", Names());
  EXPECT_EQ("first", ResultName());
}

TEST_F(ChangedClash, NodesOfOtherTypesAreNotCounted) {
  ASSERT_EQ("123", Names());
  ResultSet(0).insertBefore(reader.document.createTextNode("t"), ResultSet(0).getFirstChild());
  ResultSet(0).insertBefore(reader.document.createComment("c"), ResultSet(0).getLastChild());
  EXPECT_EQ("123", Names());
}

TEST_F(ChangedClash, ChangedAttributesAreRead) {
  ASSERT_EQ("1", Value(1));
  DOM_Element interference(ResultSet(0).getFirstChild());
  interference.setAttribute("Value", "new");
  interference.setAttribute("DistanceClearance", "7,5");
  interference.removeAttribute("Name");
  DOM_Element(interference.getFirstChild()).setAttribute("HRef", "new.jpg");
  EXPECT_EQ("new", Value(1));
  EXPECT_EQ("7.5", Clearance(1));
  EXPECT_EQ("", Ith(1));
  DOM_Element(ResultSet(1)).setAttribute("Name", "renamed");
  EXPECT_EQ("renamed", ResultName());
}

TEST_F(ChangedClash, ChangedAttributeNodeIsRead) {
  ASSERT_EQ("1", Value(1));
  ResultSet(0).getFirstChild().getAttributes().getNamedItem("Value").setNodeValue("set");
  EXPECT_EQ("set", Value(1));
}

TEST_F(ChangedClash, ChangesThroughNodesThatTheReaderGaveOutCount) {
  ASSERT_EQ("123", Names());
  DOM_Node resultSet;
  ASSERT_EQ(S_OK, reader->GetValideNode(reader.root, 1, "ClashResult", resultSet));
  resultSet.appendChild(NewInterference("4"));
  EXPECT_EQ("1243", Names());
}

TEST_F(ChangedClash, CopyThatWasGivenOutIsNotTheDocument) {
  ASSERT_EQ("123", Names());
  IthInterference ith;
  ith.Read(*reader, 2);
  DOM_Element(ith.interference).setAttribute("Value", "changed");
  ith.interference.removeChild(ith.interference.getFirstChild());
  EXPECT_EQ("123", Names());
  EXPECT_EQ("2.jpg", Preview(2));
}

TEST_F(ChangedClash, CopyThatTheCallerPutsIntoTheDocumentIsCounted) {
  IthInterference ith;
  ith.Read(*reader, 2);
  ResultSet(1).appendChild(ith.interference);
  EXPECT_EQ("1232", Names());
}

TEST_F(ChangedClash, RemovedRootIsStillTheReadersAndFollowsChanges) {
  ASSERT_EQ("123", Names());
  reader.document.removeChild(reader.root);
  EXPECT_EQ("123", Names());
  ResultSet(0).removeChild(ResultSet(0).getFirstChild());
  EXPECT_EQ("23", Names());
  ResultSet(1).appendChild(NewInterference("4"));
  EXPECT_EQ("234", Names());
  reader.document.appendChild(reader.root);
  EXPECT_EQ("234", Names());
  EXPECT_EQ("4.jpg", Preview(2));
}

TEST_F(ChangedClash, AddedInterferencesAllAtOnceAreFoundQuickly) {
  ASSERT_EQ("123", Names());
  DOM_Node fragment = reader.document.createDocumentFragment();
  for (int i = 0; i < 20'000; ++i) fragment.appendChild(NewInterference("n"));
  ResultSet(1).appendChild(fragment);
  for (int index = 4; index <= 20'003; ++index) ASSERT_EQ("n", Value(index)) << index;
  EXPECT_EQ(kUntouched, Value(20'004));
}

TEST_F(ChangedClash, RebuildFollowsChanges) {
  const auto aliases = [&] {
    ZORListValZORUnicodeString texts, ids;
    ZORMathTransformation* positions = nullptr;
    reader->GetReBuildSessionInfos(texts, ids, positions);
    delete[] positions;
    return texts.Size();
  };
  EXPECT_EQ(0, aliases());
  DOM_Element(ResultSet(0)).setAttribute("NbInterf", "2");
  EXPECT_EQ(4, aliases());
  ResultSet(0).removeChild(ResultSet(0).getFirstChild());
  EXPECT_EQ(2, aliases());
}

// ---- GetValideNode

TEST(ChangedDocument, GetValideNodeFollowsChanges) {
  SharedReader reader("<ClashElement> <N Id=\"1\"/> <M/> <N Id=\"2\"/> </ClashElement>");
  DOM_Node node;
  ASSERT_EQ(S_OK, reader->GetValideNode(reader.root, 2, "N", node));
  ASSERT_EQ("2", Attribute(node, "Id"));
  DOM_Element added = reader.document.createElement("N");
  added.setAttribute("Id", "0");
  reader.root.insertBefore(added, reader.root.getFirstChild());
  ASSERT_EQ(S_OK, reader->GetValideNode(reader.root, 2, "N", node));
  EXPECT_EQ("1", Attribute(node, "Id"));
  reader.root.removeChild(added);
  reader.root.removeChild(node);
  ASSERT_EQ(S_OK, reader->GetValideNode(reader.root, 1, "N", node));
  EXPECT_EQ("2", Attribute(node, "Id"));
  EXPECT_EQ(E_FAIL, reader->GetValideNode(reader.root, 2, "N", node));
}

TEST(ChangedDocument, GetValideNodeFollowsChangesOutsideTheTree) {
  SharedReader reader("<ClashElement/>");
  DOM_Element parent = reader.document.createElement("Box");
  const auto append = [&](const char* inId) {
    DOM_Element child = reader.document.createElement("N");
    child.setAttribute("Id", inId);
    parent.appendChild(child);
  };
  append("1");
  append("2");
  DOM_Node node;
  ASSERT_EQ(S_OK, reader->GetValideNode(parent, 1, "N", node));
  ASSERT_EQ("1", Attribute(node, "Id"));
  parent.removeChild(node);
  append("3");
  ASSERT_EQ(S_OK, reader->GetValideNode(parent, 1, "N", node));
  EXPECT_EQ("2", Attribute(node, "Id"));
}

TEST(ChangedDocument, GetValideNodeTellsParentsAndNamesApart) {
  SharedReader reader(
      "<ClashElement><A> <N Id=\"a1\"/> <M Id=\"a2\"/> </A><B> <N Id=\"b1\"/> </B></ClashElement>");
  const DOM_Node a = reader.root.getFirstChild();
  const DOM_Node b = reader.root.getLastChild();
  DOM_Node node;
  for (int round = 0; round < 2; ++round) {
    EXPECT_EQ(S_OK, reader->GetValideNode(a, 1, "N", node));
    EXPECT_EQ("a1", Attribute(node, "Id"));
    EXPECT_EQ(S_OK, reader->GetValideNode(b, 1, "N", node));
    EXPECT_EQ("b1", Attribute(node, "Id"));
    EXPECT_EQ(S_OK, reader->GetValideNode(a, 1, "M", node));
    EXPECT_EQ("a2", Attribute(node, "Id"));
    EXPECT_EQ(E_FAIL, reader->GetValideNode(b, 1, "M", node));
  }
}

// ---- Components

/// Answers about the only component of a document.
class ChangedComponent : public testing::Test {
 protected:
  std::string RealAttribute(int inNumber) {
    ZORUnicodeString name = kUntouched, type, value;
    reader->GetSetOfRealAttr(0, inNumber, name, type, value);
    return Text(name);
  }
  std::string ShapeName(int inShape) {
    return Text(reader->GetShapeAttrValue(0, inShape, "ShapeName"));
  }
  DOM_Node Component() { return reader.root.getFirstChild(); }
  DOM_Node Attributes() { return Component().getFirstChild(); }
  DOM_Node Shapes() { return Component().getLastChild(); }
  DOM_Element New(const char* inElement, const char* inAttribute, const char* inValue) {
    DOM_Element element = reader.document.createElement(inElement);
    element.setAttribute(inAttribute, inValue);
    return element;
  }

  SharedReader reader{
      "<Components><Component><ComponentAttributes>"
      "<ComponentAttribute Name=\"a\" AttrType=\"String\"/><ComponentAttribute Name=\"b\"/>"
      "<ComponentAttribute Name=\"f\" AttrType=\"Feature\"/></ComponentAttributes><ComponentShapes>"
      "<ComponentShape ShapeName=\"s0\"/><ComponentShape ShapeName=\"s1\"/></ComponentShapes>"
      "</Component></Components>"};
};

TEST_F(ChangedComponent, AttributeThatBecomesAFeatureIsNoLongerReal) {
  ASSERT_EQ(2, reader->GetNbRealAttr(0));
  ASSERT_EQ("a", RealAttribute(1));
  DOM_Element(Attributes().getFirstChild()).setAttribute("AttrType", "Feature");
  EXPECT_EQ(1, reader->GetNbRealAttr(0));
  EXPECT_EQ("b", RealAttribute(1));
  EXPECT_EQ(kUntouched, RealAttribute(2));
}

TEST_F(ChangedComponent, FeatureThatLosesItsTypeIsReal) {
  ASSERT_EQ(kUntouched, RealAttribute(3));
  DOM_Element(Attributes().getLastChild()).removeAttribute("AttrType");
  EXPECT_EQ(3, reader->GetNbRealAttr(0));
  EXPECT_EQ("f", RealAttribute(3));
}

TEST_F(ChangedComponent, AddedAndRemovedAttributesCount) {
  ASSERT_EQ(2, reader->GetNbRealAttr(0));
  Attributes().appendChild(New("ComponentAttribute", "Name", "c"));
  EXPECT_EQ("c", RealAttribute(3));
  Attributes().removeChild(Attributes().getFirstChild());
  EXPECT_EQ("b", RealAttribute(1));
  EXPECT_EQ("c", RealAttribute(2));
  Component().removeChild(Attributes());
  EXPECT_EQ(0, reader->GetNbRealAttr(0));
}

TEST_F(ChangedComponent, AddedAndRemovedShapesCount) {
  ASSERT_EQ("s1", ShapeName(1));
  Shapes().appendChild(New("ComponentShape", "ShapeName", "s2"));
  EXPECT_EQ(3, reader->GetNbShapes(0));
  EXPECT_EQ("s2", ShapeName(2));
  Shapes().removeChild(Shapes().getFirstChild());
  EXPECT_EQ("s1", ShapeName(0));
  EXPECT_EQ(1, reader->IsValideNode(0, 0, ""));
  Component().removeChild(Shapes());
  EXPECT_EQ(0, reader->GetNbShapes(0));
  EXPECT_EQ("", ShapeName(0));
  EXPECT_EQ(0, reader->IsValideNode(0, 0, ""));
}

TEST_F(ChangedComponent, ChangedShapeAttributesAreRead) {
  ASSERT_EQ("s0", ShapeName(0));
  DOM_Element(Shapes().getFirstChild()).setAttribute("ShapeName", "new");
  EXPECT_EQ("new", ShapeName(0));
}

TEST_F(ChangedComponent, AddedComponentShiftsPositions) {
  ASSERT_EQ(1, reader->GetNbProd());
  ASSERT_EQ("a", RealAttribute(1));
  reader.root.insertBefore(New("Component", "Alias", "before"), reader.root.getFirstChild());
  EXPECT_EQ(2, reader->GetNbProd());
  EXPECT_EQ("before", Text(reader->GetPrdId(0)));
  EXPECT_EQ(kUntouched, RealAttribute(1));
  EXPECT_EQ(2, reader->GetNbRealAttr(1));
  EXPECT_EQ("s1", Text(reader->GetShapeAttrValue(1, 1, "ShapeName")));
}

TEST_F(ChangedComponent, RemovedComponentIsGone) {
  ASSERT_EQ(2, reader->GetNbRealAttr(0));
  reader.root.removeChild(reader.root.getFirstChild());
  EXPECT_EQ(0, reader->GetNbProd());
  EXPECT_EQ(0, reader->GetNbRealAttr(0));
  EXPECT_EQ("", ShapeName(0));
}

// ---- Specification, linked documents, general information

TEST(ChangedDocument, SpecificationsFollowChanges) {
  SharedReader reader(
      "<ClashElement><ProductsInSpec><Specification><ProdListe1 Alias=\"a\"/></Specification>"
      "<Specification><ProdListe1 Alias=\"b\"/></Specification></ProductsInSpec></ClashElement>");
  const auto count = [&] {
    int specifications = 77;
    reader->GetSpecInfos(specifications);
    return specifications;
  };
  const auto alias = [&](int inNumber) {
    return SpecifiedProducts().Read(*reader, inNumber).Texts()[0];
  };
  ASSERT_EQ(2, count());
  ASSERT_EQ("b", alias(2));
  const DOM_Node products = reader.root.getFirstChild();
  DOM_Node(products).appendChild(products.getFirstChild().cloneNode(true));
  EXPECT_EQ(3, count());
  EXPECT_EQ("a", alias(3));
  DOM_Node(products).removeChild(products.getFirstChild());
  EXPECT_EQ(2, count());
  EXPECT_EQ("b", alias(1));
  DOM_Element(products.getFirstChild().getFirstChild()).setAttribute("Alias", "changed");
  EXPECT_EQ("changed", alias(1));
  reader.root.removeChild(products);
  EXPECT_EQ(0, count());
  EXPECT_EQ(kUntouched, alias(1));
}

TEST(ChangedDocument, LinkedElementsFollowChanges) {
  SharedReader reader("<FederatorClashElement/>");
  ASSERT_EQ(0u, reader->GetListOfLinkedElements().getLength());
  DOM_Element elements = reader.document.createElement("Elements");
  reader.root.appendChild(elements);
  elements.appendChild(reader.document.createElement("Element"));
  EXPECT_EQ(elements, reader->GetElementsNode());
  EXPECT_EQ(1u, reader->GetListOfLinkedElements().getLength());
}

TEST(ChangedDocument, GeneralInformationFollowsChanges) {
  SharedReader reader("<ClashElement><ClashResult NbInterf=\"1\"/></ClashElement>");
  ZORUnicodeString name;
  int count = 0;
  reader->GetClashGeneralInfos(name, count);
  ASSERT_EQ(1, count);
  DOM_Element(reader.root.getFirstChild()).setAttribute("NbInterf", "2");
  reader.root.setAttribute("PRCName", "new");
  reader->GetClashGeneralInfos(name, count);
  EXPECT_EQ(2, count);
  EXPECT_EQ("new", Text(reader->GetPRCName()));
}

TEST(ChangedDocument, PositionsFollowChanges) {
  SharedReader reader("<ClashElement><Date/></ClashElement>");
  ASSERT_EQ(1, reader->IsValideNode(0, "Date"));
  reader.root.insertBefore(reader.document.createTextNode(" "), reader.root.getFirstChild());
  EXPECT_EQ(0, reader->IsValideNode(0, "Date"));
  EXPECT_EQ(1, reader->IsValideNode(1, "Date"));
  EXPECT_EQ(2, reader->GetNbProd());
}

// ---- Two readers

TEST(ChangedDocument, LoadingAgainForgetsTheChanges) {
  SharedReader reader(kClash);
  IthInterference ith;
  ASSERT_EQ(S_OK, ith.Read(*reader, 3).result);
  reader.root.removeChild(reader.root.getFirstChild());
  ASSERT_EQ(E_FAIL, ith.Read(*reader, 3).result);
  DOM_Document again;
  ZORUnicodeString kind;
  ASSERT_EQ(S_OK, reader->LoadSequence(again, kind));
  EXPECT_EQ(S_OK, ith.Read(*reader, 3).result);
}

}  // namespace
