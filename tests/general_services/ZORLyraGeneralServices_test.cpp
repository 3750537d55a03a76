// Texts from documents and towards them; lengths.
#include "ZORLyraGeneralServices.h"

#include <gtest/gtest.h>

#include <climits>
#include <string>

#include "platform/xml/DOM_DOMException.h"
#include "platform/xml/DOM_NamedNodeMap.h"
#include "support/LoadedReader.h"

namespace {

using support::SharedReader;
using support::Text;
using Services = ZORLyraGeneralServices;

std::string Text(const DOMString& inText) { return Text(inText.DOMStringToZORUnicodeString()); }

// ---- From a document

TEST(ZORLyraGeneralServices, GetAttrOnNodeGivesTheValue) {
  const SharedReader document("<Box Name=\"a &lt; b\" Other=\"\"/>");
  EXPECT_EQ("a < b", Text(Services::GetAttrOnNode(document.root, "Name")));
}

TEST(ZORLyraGeneralServices, GetAttrOnNodeOfAnEmptyAttributeIsEmpty) {
  const SharedReader document("<Box Name=\"\"/>");
  EXPECT_EQ("", Text(Services::GetAttrOnNode(document.root, "Name")));
}

TEST(ZORLyraGeneralServices, GetAttrOnNodeOfAMissingAttributeIsEmpty) {
  const SharedReader document("<Box Name=\"n\"/>");
  EXPECT_EQ("", Text(Services::GetAttrOnNode(document.root, "name")));
  EXPECT_EQ("", Text(Services::GetAttrOnNode(document.root, "")));
}

TEST(ZORLyraGeneralServices, GetAttrOnNodeOfANodeThatHasNoAttributesIsEmpty) {
  const SharedReader document("<Box>text<!-- c --></Box>");
  EXPECT_EQ("", Text(Services::GetAttrOnNode(document.root.getFirstChild(), "Name")));
  EXPECT_EQ("", Text(Services::GetAttrOnNode(document.root.getLastChild(), "Name")));
  EXPECT_EQ("", Text(Services::GetAttrOnNode(document.document, "Name")));
}

TEST(ZORLyraGeneralServices, GetAttrOnNodeOfANullNodeIsEmpty) {
  EXPECT_EQ("", Text(Services::GetAttrOnNode(DOM_Node(), "Name")));
}

TEST(ZORLyraGeneralServices, GetAttrOnNodeKeepsCharactersOutsideTheBasicPlane) {
  const SharedReader document("<Box Name=\"螺栓 🔩\"/>");
  const ZORUnicodeString value = Services::GetAttrOnNode(document.root, "Name");
  EXPECT_EQ("螺栓 🔩", Text(value));
  EXPECT_EQ(5, value.GetLengthInChar());
}

TEST(ZORLyraGeneralServices, GetDOMNameOfATextIsTheText) {
  EXPECT_EQ("a b", Text(Services::GetDOMName(DOMString("a b"))));
}

TEST(ZORLyraGeneralServices, GetDOMNameOfANullTextIsEmpty) {
  EXPECT_EQ("", Text(Services::GetDOMName(DOMString())));
}

TEST(ZORLyraGeneralServices, GetDOMNameOfAnElementIsItsTagName) {
  const SharedReader document("<z:Box xmlns:z=\"urn:z\"/>");
  EXPECT_EQ("z:Box", Text(Services::GetDOMName(document.root)));
}

TEST(ZORLyraGeneralServices, GetDOMNameOfANodeIsItsName) {
  const SharedReader document("<Box Name=\"n\">t<!-- c --><?target data?><![CDATA[d]]></Box>");
  const DOM_Node element = document.root;
  EXPECT_EQ("Box", Text(Services::GetDOMName(element)));
  EXPECT_EQ("Name", Text(Services::GetDOMName(element.getAttributes().item(0))));
  const DOM_NodeList children = element.getChildNodes();
  EXPECT_EQ("#text", Text(Services::GetDOMName(children.item(0))));
  EXPECT_EQ("#comment", Text(Services::GetDOMName(children.item(1))));
  EXPECT_EQ("target", Text(Services::GetDOMName(children.item(2))));
  EXPECT_EQ("#cdata-section", Text(Services::GetDOMName(children.item(3))));
  EXPECT_EQ("#document", Text(Services::GetDOMName(DOM_Node(document.document))));
}

TEST(ZORLyraGeneralServices, GetDOMNameOfNullHandlesIsEmpty) {
  EXPECT_EQ("", Text(Services::GetDOMName(DOM_Element())));
  EXPECT_EQ("", Text(Services::GetDOMName(DOM_Node())));
}

TEST(ZORLyraGeneralServices, GetDOMNameOutlivesTheDocument) {
  ZORUnicodeString name;
  {
    const SharedReader document("<Box/>");
    name = Services::GetDOMName(document.root);
  }
  EXPECT_EQ("Box", Text(name));
}

// ---- Towards a document

TEST(ZORLyraGeneralServices, GetDOMStringOfAnIntIsDecimal) {
  EXPECT_EQ("0", Text(Services::GetDOMString(0)));
  EXPECT_EQ("42", Text(Services::GetDOMString(42)));
  EXPECT_EQ("-7", Text(Services::GetDOMString(-7)));
  EXPECT_EQ("2147483647", Text(Services::GetDOMString(INT_MAX)));
  EXPECT_EQ("-2147483648", Text(Services::GetDOMString(INT_MIN)));
}

TEST(ZORLyraGeneralServices, GetDOMStringOfADoubleHasSixDecimals) {
  EXPECT_EQ("0.000000", Text(Services::GetDOMString(0.0)));
  EXPECT_EQ("2.500000", Text(Services::GetDOMString(2.5)));
  EXPECT_EQ("-0.000100", Text(Services::GetDOMString(-0.0001)));
  EXPECT_EQ("0.333333", Text(Services::GetDOMString(1.0 / 3.0)));
  EXPECT_EQ("0.666667", Text(Services::GetDOMString(2.0 / 3.0)));
  EXPECT_EQ("-0.000000", Text(Services::GetDOMString(-0.0)));
}

TEST(ZORLyraGeneralServices, GetDOMStringOfALargeDoubleHasNoExponent) {
  EXPECT_EQ("100000000000000000000.000000", Text(Services::GetDOMString(1e20)));
  const std::string largest = Text(Services::GetDOMString(1.7976931348623157e308));
  EXPECT_EQ(309u + 7u, largest.size());
  EXPECT_EQ("17976931348623157", largest.substr(0, 17));
  EXPECT_EQ(std::string::npos, largest.find('e'));
}

TEST(ZORLyraGeneralServices, GetDOMStringOfATextIsTheText) {
  EXPECT_EQ("", Text(Services::GetDOMString(ZORUnicodeString())));
  EXPECT_EQ("a <&> b", Text(Services::GetDOMString(ZORUnicodeString("a <&> b"))));
  EXPECT_EQ("螺栓 🔩", Text(Services::GetDOMString(ZORUnicodeString("螺栓 🔩"))));
}

// The way goes through the narrow form, which cannot carry half of a surrogate pair.
TEST(ZORLyraGeneralServices, GetDOMStringCarriesWhatTheNarrowFormCarries) {
  const ZORUC2Bytes half[] = {u'a', 0xD83D, u'b'};
  ZORUnicodeString text;
  text.BuildFromUTF16(half, 3);
  EXPECT_EQ(std::string(text.ConvertToChar()), Text(Services::GetDOMString(text)));
  EXPECT_EQ(
      "a\xEF\xBF\xBD"
      "b",
      Text(Services::GetDOMString(text)));
}

// And it ends at a zero.
TEST(ZORLyraGeneralServices, GetDOMStringEndsAtAZero) {
  const ZORUC2Bytes units[] = {u'a', 0, u'b'};
  ZORUnicodeString text;
  text.BuildFromUTF16(units, 3);
  EXPECT_EQ(1u, Services::GetDOMString(text).length());
}

// The attributes of an element in their order: "Ux=1.000000 Uy=…".
std::string Attributes(const DOM_Element& inElement) {
  const DOM_NamedNodeMap attributes = inElement.getAttributes();
  std::string text;
  for (unsigned int i = 0; i < attributes.getLength(); ++i)
    text += (i == 0 ? "" : " ") + Text(attributes.item(i).getNodeName()) + "=" +
            Text(attributes.item(i).getNodeValue());
  return text;
}

TEST(ZORLyraGeneralServices, GetDOMVectorOfAPointCarriesItsCoordinates) {
  const DOM_Element element = Services::GetDOMVector("Point", DOM_Document::createDocument(),
                                                     ZORMathPointf(1.0f, 2.5f, -3.0f));
  EXPECT_EQ("Point", Text(element.getTagName()));
  EXPECT_EQ("Ux=1.000000 Uy=2.500000 Uz=-3.000000", Attributes(element));
}

TEST(ZORLyraGeneralServices, GetDOMVectorOfAVectorHasTheSameAttributes) {
  const DOM_Element element = Services::GetDOMVector("Vector", DOM_Document::createDocument(),
                                                     ZORMathVectorf(0.0f, 0.0f, 1.0f));
  EXPECT_EQ("Vector", Text(element.getTagName()));
  EXPECT_EQ("Ux=0.000000 Uy=0.000000 Uz=1.000000", Attributes(element));
  EXPECT_FALSE(element.hasChildNodes());
}

TEST(ZORLyraGeneralServices, GetDOMVectorWidensSinglePrecision) {
  const DOM_Element element = Services::GetDOMVector("P", DOM_Document::createDocument(),
                                                     ZORMathPointf(0.1f, 16777216.0f, 1e-7f));
  EXPECT_EQ("Ux=0.100000 Uy=16777216.000000 Uz=0.000000", Attributes(element));
  const DOM_Element large = Services::GetDOMVector("P", DOM_Document::createDocument(),
                                                   ZORMathVectorf(123456.789f, 0.0f, 0.0f));
  EXPECT_EQ("Ux=123456.789062 Uy=0.000000 Uz=0.000000", Attributes(large));
}

TEST(ZORLyraGeneralServices, GetDOMVectorIsNotAttached) {
  SharedReader document("<Box/>");
  const DOM_Element element =
      Services::GetDOMVector("P", document.document, ZORMathPointf(1.0f, 2.0f, 3.0f));
  EXPECT_TRUE(element.getParentNode().isNull());
  EXPECT_EQ(document.document, element.getOwnerDocument());
  EXPECT_FALSE(document.root.hasChildNodes());
  document.root.appendChild(element);
  EXPECT_EQ(element, document.root.getFirstChild());
}

TEST(ZORLyraGeneralServices, GetDOMVectorOfABadNameRaisesTheDocumentsError) {
  EXPECT_THROW(Services::GetDOMVector("1 2", DOM_Document::createDocument(), ZORMathPointf()),
               DOM_DOMException);
  EXPECT_THROW(Services::GetDOMVector("", DOM_Document::createDocument(), ZORMathVectorf()),
               DOM_DOMException);
}

TEST(ZORLyraGeneralServices, GetDOMVectorOfANullDocumentRaisesTheDocumentsError) {
  EXPECT_THROW(Services::GetDOMVector("P", DOM_Document(), ZORMathPointf()), DOM_DOMException);
}

// ---- Lengths

TEST(ZORLyraGeneralServices, ConvertValueInMMReadsALengthWithItsUnit) {
  EXPECT_DOUBLE_EQ(500.0, Services::ConvertValueInMM("0.5m"));
  EXPECT_DOUBLE_EQ(25.0, Services::ConvertValueInMM("25mm"));
  EXPECT_DOUBLE_EQ(25.4, Services::ConvertValueInMM("1 inch"));
  EXPECT_DOUBLE_EQ(30.0, Services::ConvertValueInMM("3cm"));
  EXPECT_DOUBLE_EQ(2000.0, Services::ConvertValueInMM("2e3 mm"));
}

TEST(ZORLyraGeneralServices, ConvertValueInMMReadsABareNumberAsMillimetres) {
  EXPECT_DOUBLE_EQ(12.5, Services::ConvertValueInMM("12.5"));
  EXPECT_DOUBLE_EQ(0.0, Services::ConvertValueInMM("0"));
  EXPECT_DOUBLE_EQ(1000.0, Services::ConvertValueInMM("1e3"));
}

TEST(ZORLyraGeneralServices, ConvertValueInMMToleratesBlanks) {
  EXPECT_DOUBLE_EQ(3.0, Services::ConvertValueInMM(" 3 mm "));
  EXPECT_DOUBLE_EQ(3.0, Services::ConvertValueInMM(" 3 "));
}

TEST(ZORLyraGeneralServices, ConvertValueInMMOfUnreadableTextIsItsMarker) {
  for (const char* text : {"abc", "mm", "m", "1,5mm", "12 kg", "3 s", "1 2", "--1", "5 parsnips"})
    EXPECT_DOUBLE_EQ(-0.1, Services::ConvertValueInMM(text)) << text;
}

TEST(ZORLyraGeneralServices, ConvertValueInMMOfAnEmptyTextIsItsMarker) {
  EXPECT_DOUBLE_EQ(-0.1, Services::ConvertValueInMM(""));
  EXPECT_DOUBLE_EQ(-0.1, Services::ConvertValueInMM("   "));
}

TEST(ZORLyraGeneralServices, ConvertValueInMMGivesNegativeLengths) {
  EXPECT_DOUBLE_EQ(-4.0, Services::ConvertValueInMM("-4"));
  EXPECT_DOUBLE_EQ(-500.0, Services::ConvertValueInMM("-0.5m"));
}

// Lengths that happen to equal the two markers are not told from them.
TEST(ZORLyraGeneralServices, ConvertValueInMMGivesLengthsThatEqualAMarker) {
  EXPECT_DOUBLE_EQ(-0.1, Services::ConvertValueInMM("-0.1"));
  EXPECT_DOUBLE_EQ(-1.0, Services::ConvertValueInMM("-1mm"));
}

TEST(ZORLyraGeneralServices, ConvertValueInMMLeavesTheCallersText) {
  const ZORUnicodeString text("12.5");
  Services::ConvertValueInMM(text);
  EXPECT_EQ("12.5", Text(text));
}

}  // namespace
