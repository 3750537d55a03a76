// General information of a document and of its first result set; attributes of components.
#include <gtest/gtest.h>

#include "support/LoadedReader.h"

namespace {

using support::Attribute;
using support::kUntouched;
using support::LoadedReader;
using support::Name;
using support::Text;

struct LongInfos {
  explicit LongInfos(LoadedReader& ioReader) {
    ioReader->GetClashGeneralInfos(version, reference, date, specification, count, responsible);
  }
  ZORUnicodeString version = kUntouched;
  ZORUnicodeString reference = kUntouched;
  ZORUnicodeString responsible = kUntouched;
  DOM_Node date, specification;
  int count = 77;
};

struct FirstResult {
  explicit FirstResult(LoadedReader& ioReader) { ioReader->GetClashGeneralInfos(name, count); }
  ZORUnicodeString name = kUntouched;
  int count = 77;
};

int CountOf(const std::string& inNbInterf) {
  LoadedReader reader("<ClashElement><ClashResult NbInterf=\"" + inNbInterf +
                      "\"/></ClashElement>");
  return LongInfos(reader).count;
}

int FirstCountOf(const std::string& inNbInterf) {
  LoadedReader reader("<ClashElement><ClashResult NbInterf=\"" + inNbInterf +
                      "\"/></ClashElement>");
  return FirstResult(reader).count;
}

// ---- Long form

TEST(ZORClashParsing, GetClashGeneralInfosReadsTheRootAndItsChildren) {
  LoadedReader reader(
      "<ClashElement Version=\"1.2\" ZORDocument=\"doc\" Responsible=\"me\">\n"
      "<Date Day=\"20\"/><!-- c --><ClashSpec Name=\"s\"/><ClashResult NbInterf=\"4\"/>"
      "</ClashElement>");
  const LongInfos infos(reader);
  EXPECT_EQ("1.2", Text(infos.version));
  EXPECT_EQ("doc", Text(infos.reference));
  EXPECT_EQ("me", Text(infos.responsible));
  EXPECT_EQ("20", Attribute(infos.date, "Day"));
  EXPECT_EQ("s", Attribute(infos.specification, "Name"));
  EXPECT_EQ(4, infos.count);
}

TEST(ZORClashParsing, GetClashGeneralInfosGivesTheVersionAsItStands) {
  LoadedReader reader("<ClashElement/>");
  EXPECT_EQ("1.1", Text(reader.version));
  EXPECT_EQ("", Text(LongInfos(reader).version));
}

TEST(ZORClashParsing, GetClashGeneralInfosOfMissingAttributesEmptiesThem) {
  LoadedReader reader("<ClashElement/>");
  const LongInfos infos(reader);
  EXPECT_EQ("", Text(infos.reference));
  EXPECT_EQ("", Text(infos.responsible));
}

TEST(ZORClashParsing, GetClashGeneralInfosLeavesWhatIsNotFound) {
  LoadedReader reader("<ClashElement><Other/></ClashElement>");
  DOM_Node kept = reader->GetNodeList().item(0);
  ZORUnicodeString version, reference, responsible;
  DOM_Node date = kept, specification = kept;
  int count = 77;
  reader->GetClashGeneralInfos(version, reference, date, specification, count, responsible);
  EXPECT_EQ(kept, date);
  EXPECT_EQ(kept, specification);
  EXPECT_EQ(77, count);
}

TEST(ZORClashParsing, GetClashGeneralInfosGivesTheDocumentsOwnNodes) {
  LoadedReader reader("<ClashElement><Date/><ClashSpec/></ClashElement>");
  const LongInfos infos(reader);
  EXPECT_EQ(reader->GetNodeList().item(0), infos.date);
  EXPECT_EQ(reader->GetNodeList().item(1), infos.specification);
}

TEST(ZORClashParsing, GetClashGeneralInfosTakesTheLastDateAndSpecification) {
  LoadedReader reader(
      "<ClashElement><Date Day=\"1\"/><ClashSpec Name=\"1\"/><Date Day=\"2\"/>"
      "<ClashSpec Name=\"2\"/></ClashElement>");
  const LongInfos infos(reader);
  EXPECT_EQ("2", Attribute(infos.date, "Day"));
  EXPECT_EQ("2", Attribute(infos.specification, "Name"));
}

TEST(ZORClashParsing, GetClashGeneralInfosTakesTheLastCountThatIsANumber) {
  LoadedReader reader(
      "<ClashElement><ClashResult NbInterf=\"3\"/><ClashResult NbInterf=\"5\"/>"
      "<ClashResult NbInterf=\"many\"/><ClashResult/></ClashElement>");
  EXPECT_EQ(5, LongInfos(reader).count);
}

TEST(ZORClashParsing, GetClashGeneralInfosDoesNotLookDeeper) {
  LoadedReader reader(
      "<ClashElement><Box><Date/><ClashSpec/><ClashResult NbInterf=\"3\"/></Box></ClashElement>");
  const LongInfos infos(reader);
  EXPECT_TRUE(infos.date.isNull());
  EXPECT_TRUE(infos.specification.isNull());
  EXPECT_EQ(77, infos.count);
}

TEST(ZORClashParsing, GetClashGeneralInfosWorksInADocumentOfAnyKind) {
  LoadedReader reader("<Drawing Responsible=\"me\"><Date/></Drawing>");
  const LongInfos infos(reader);
  EXPECT_EQ("me", Text(infos.responsible));
  EXPECT_EQ("Date", Name(infos.date));
}

TEST(ZORClashParsing, GetClashGeneralInfosReadsTheCountAsAnInteger) {
  EXPECT_EQ(3, CountOf("3.0"));
  EXPECT_EQ(12, CountOf("12.9"));
  EXPECT_EQ(1, CountOf("1e2"));
  EXPECT_EQ(-2, CountOf("-2"));
  EXPECT_EQ(4, CountOf("  4 of 5"));
}

TEST(ZORClashParsing, GetClashGeneralInfosOfACountThatIsNoNumberLeavesIt) {
  EXPECT_EQ(77, CountOf("abc"));
  EXPECT_EQ(77, CountOf(""));
  EXPECT_EQ(77, CountOf(".5"));
}

// ---- Short form

TEST(ZORClashParsing, GetClashGeneralInfosShortReadsTheFirstResultSet) {
  LoadedReader reader(
      "<ClashElement> <Date/><ClashResult Name=\"a\" NbInterf=\"2\"/>"
      "<ClashResult Name=\"b\" NbInterf=\"3\"/></ClashElement>");
  const FirstResult first(reader);
  EXPECT_EQ("a", Text(first.name));
  EXPECT_EQ(2, first.count);
  EXPECT_EQ(3, LongInfos(reader).count);
}

TEST(ZORClashParsing, GetClashGeneralInfosShortTruncatesTowardZero) {
  EXPECT_EQ(3, FirstCountOf("3.0"));
  EXPECT_EQ(12, FirstCountOf("12.9"));
  EXPECT_EQ(-12, FirstCountOf("-12.9"));
  EXPECT_EQ(100, FirstCountOf("1e2"));
  EXPECT_EQ(0, FirstCountOf(".5"));
}

TEST(ZORClashParsing, GetClashGeneralInfosShortOfNoNumberIsZero) {
  EXPECT_EQ(0, FirstCountOf("abc"));
  EXPECT_EQ(0, FirstCountOf(""));
}

TEST(ZORClashParsing, GetClashGeneralInfosShortWithoutAttributesIsEmptyAndZero) {
  LoadedReader reader("<ClashElement><ClashResult/></ClashElement>");
  const FirstResult first(reader);
  EXPECT_EQ("", Text(first.name));
  EXPECT_EQ(0, first.count);
}

// The first result set decides even when only a later one declares a number.
TEST(ZORClashParsing, GetClashGeneralInfosShortDoesNotLookForANumberFurtherOn) {
  LoadedReader reader(
      "<ClashElement><ClashResult Name=\"a\"/><ClashResult NbInterf=\"3\"/></ClashElement>");
  EXPECT_EQ(0, FirstResult(reader).count);
}

TEST(ZORClashParsing, GetClashGeneralInfosShortWithoutResultSetTouchesNothing) {
  LoadedReader reader("<ClashElement><Date/></ClashElement>");
  const FirstResult first(reader);
  EXPECT_EQ(kUntouched, Text(first.name));
  EXPECT_EQ(77, first.count);
}

TEST(ZORClashParsing, GetClashGeneralInfosShortWithoutChildrenTouchesNothing) {
  LoadedReader reader("<ClashElement/>");
  const FirstResult first(reader);
  EXPECT_EQ(kUntouched, Text(first.name));
  EXPECT_EQ(77, first.count);
}

// ---- Result sets of a list

TEST(ZORClashParsing, GetClashResultGeneralInfoReadsTheFirstResultSetOfTheList) {
  LoadedReader reader(
      "<ClashElement>\n<Date/><ClashResult Name=\"a\" ComputationCase=\"all\"><Interference/>t"
      "</ClashResult><ClashResult Name=\"b\" ComputationCase=\"one\"/></ClashElement>");
  ZORUnicodeString name, computationCase;
  const DOM_NodeList children =
      reader->GetClashResultGeneralInfo(reader->GetNodeList(), name, computationCase);
  EXPECT_EQ("a", Text(name));
  EXPECT_EQ("all", Text(computationCase));
  ASSERT_EQ(2u, children.getLength());
  EXPECT_EQ("Interference", Name(children.item(0)));
  EXPECT_EQ(DOM_Node::TEXT_NODE, children.item(1).getNodeType());
}

TEST(ZORClashParsing, GetClashResultGeneralInfoOfMissingAttributesEmptiesThem) {
  LoadedReader reader("<ClashElement><ClashResult/></ClashElement>");
  ZORUnicodeString name = kUntouched, computationCase = kUntouched;
  EXPECT_EQ(
      0u,
      reader->GetClashResultGeneralInfo(reader->GetNodeList(), name, computationCase).getLength());
  EXPECT_EQ("", Text(name));
  EXPECT_EQ("", Text(computationCase));
}

TEST(ZORClashParsing, GetClashResultGeneralInfoWithoutResultSetTouchesNothing) {
  LoadedReader reader("<ClashElement>t<Date/></ClashElement>");
  ZORUnicodeString name = kUntouched, computationCase = kUntouched;
  EXPECT_EQ(
      0u,
      reader->GetClashResultGeneralInfo(reader->GetNodeList(), name, computationCase).getLength());
  EXPECT_EQ(kUntouched, Text(name));
  EXPECT_EQ(kUntouched, Text(computationCase));
}

TEST(ZORClashParsing, GetClashResultGeneralInfoOfAnEmptyListTouchesNothing) {
  LoadedReader reader("<ClashElement><ClashResult Name=\"a\"/></ClashElement>");
  ZORUnicodeString name = kUntouched, computationCase = kUntouched;
  EXPECT_EQ(0u,
            reader->GetClashResultGeneralInfo(DOM_NodeList(), name, computationCase).getLength());
  EXPECT_EQ(kUntouched, Text(name));
  EXPECT_EQ(kUntouched, Text(computationCase));
}

// ---- Attributes of components

constexpr const char* kComponents =
    "<Components>\n"
    "<C Alias=\"one\" Weight=\"3\"><ComponentAttributes>"
    "<ComponentAttribute Name=\"colour\" AttrValue=\"red\"/>"
    "<Attribute Name=\"size\" AttrValue=\"wrong element\"/>"
    "<ComponentAttribute Name=\"size\" AttrValue=\"7\"/>"
    "<ComponentAttribute Name=\"size\" AttrValue=\"8\"/></ComponentAttributes>"
    "<ComponentAttributes><ComponentAttribute Name=\"late\" AttrValue=\"9\"/>"
    "<ComponentAttribute Name=\"colour\" AttrValue=\"blue\"/>"
    "<ComponentAttribute Name=\"hollow\"/></ComponentAttributes></C>"
    "<C><ComponentAttribute Name=\"colour\" AttrValue=\"green\"/></C>"
    "</Components>";

TEST(ZORClashParsing, GetAttrValueGivesTheFirstMatchInDocumentOrder) {
  LoadedReader reader(kComponents);
  EXPECT_EQ("red", Text(reader->GetAttrValue(1, "colour")));
  EXPECT_EQ("7", Text(reader->GetAttrValue(1, "size")));
}

TEST(ZORClashParsing, GetAttrValueLooksIntoEveryContainer) {
  LoadedReader reader(kComponents);
  EXPECT_EQ("9", Text(reader->GetAttrValue(1, "late")));
}

TEST(ZORClashParsing, GetAttrValueOfAnAttributeWithoutValueIsEmpty) {
  LoadedReader reader(kComponents);
  EXPECT_EQ("", Text(reader->GetAttrValue(1, "hollow")));
}

// A first match without value is still the match.
TEST(ZORClashParsing, GetAttrValueStopsAtAMatchWithoutValue) {
  LoadedReader reader(
      "<Components><C><ComponentAttributes><ComponentAttribute Name=\"a\"/>"
      "<ComponentAttribute Name=\"a\" AttrValue=\"1\"/></ComponentAttributes><ComponentAttributes>"
      "<ComponentAttribute Name=\"a\" AttrValue=\"2\"/></ComponentAttributes></C></Components>");
  EXPECT_EQ("", Text(reader->GetAttrValue(0, "a")));
}

TEST(ZORClashParsing, GetAttrValueWithoutMatchIsEmpty) {
  LoadedReader reader(kComponents);
  EXPECT_EQ("", Text(reader->GetAttrValue(1, "Colour")));
  EXPECT_EQ("", Text(reader->GetAttrValue(1, "Alias")));
  EXPECT_EQ("", Text(reader->GetAttrValue(2, "colour")));
}

TEST(ZORClashParsing, GetAttrValueAtATextNodeIsEmpty) {
  LoadedReader reader(kComponents);
  EXPECT_EQ("", Text(reader->GetAttrValue(0, "colour")));
}

TEST(ZORClashParsing, GetAttrValuePastTheEndIsEmpty) {
  LoadedReader reader(kComponents);
  EXPECT_EQ("", Text(reader->GetAttrValue(3, "colour")));
}

TEST(ZORClashParsing, GetCompoAttrGivesTheComponentsOwnAttribute) {
  LoadedReader reader(kComponents);
  EXPECT_EQ("one", Text(reader->GetCompoAttr(1, "Alias")));
  EXPECT_EQ("3", Text(reader->GetCompoAttr(1, "Weight")));
}

TEST(ZORClashParsing, GetCompoAttrOfAMissingAttributeIsEmpty) {
  LoadedReader reader(kComponents);
  EXPECT_EQ("", Text(reader->GetCompoAttr(1, "weight")));
  EXPECT_EQ("", Text(reader->GetCompoAttr(1, "")));
}

TEST(ZORClashParsing, GetCompoAttrAtATextNodeIsEmpty) {
  LoadedReader reader(kComponents);
  EXPECT_EQ("", Text(reader->GetCompoAttr(0, "Alias")));
}

TEST(ZORClashParsing, GetCompoAttrPastTheEndIsEmpty) {
  LoadedReader reader(kComponents);
  EXPECT_EQ("", Text(reader->GetCompoAttr(3, "Alias")));
}

TEST(ZORClashParsing, CommentsShiftPositionsButNotWhatIsFoundByName) {
  LoadedReader plain("<ClashElement><ClashResult Name=\"a\"/></ClashElement>");
  LoadedReader shifted("<ClashElement>\n<!-- c --><ClashResult Name=\"a\"/></ClashElement>");
  EXPECT_EQ("a", Text(FirstResult(plain).name));
  EXPECT_EQ("a", Text(FirstResult(shifted).name));
  EXPECT_EQ("a", Text(plain->GetCompoAttr(0, "Name")));
  EXPECT_EQ("", Text(shifted->GetCompoAttr(0, "Name")));
  EXPECT_EQ("", Text(shifted->GetCompoAttr(1, "Name")));
  EXPECT_EQ("a", Text(shifted->GetCompoAttr(2, "Name")));
}

}  // namespace
