// Components, specification, linked documents and rebuilding a session.
#include <gtest/gtest.h>

#include <array>
#include <memory>
#include <string>
#include <vector>

#include "support/AbandonedMemory.h"
#include "support/LoadedReader.h"

namespace {

using support::Attribute;
using support::kUntouched;
using support::LoadedReader;
using support::Name;
using support::SpecifiedProducts;
using support::Text;

// ---- Components by position

constexpr const char* kComponents =
    "<Components>\n"
    "<Component Alias=\"one\" ComponentType=\"Part\"/><!-- c --><Other "
    "Alias=\"two\"/></Components>";

TEST(ZORClashParsing, GetNbProdCountsNodesOfAllTypes) {
  EXPECT_EQ(4, LoadedReader(kComponents)->GetNbProd());
  EXPECT_EQ(0, LoadedReader("<Components/>")->GetNbProd());
  EXPECT_EQ(5, LoadedReader("<Components> <C/> <C/> </Components>")->GetNbProd());
}

TEST(ZORClashParsing, GetNbProdWithoutRootIsZero) { EXPECT_EQ(0, LoadedReader("")->GetNbProd()); }

TEST(ZORClashParsing, GetPrdIdAndNameAreTheAlias) {
  LoadedReader reader(kComponents);
  EXPECT_EQ("one", Text(reader->GetPrdId(1)));
  EXPECT_EQ("one", Text(reader->GetPrdName(1)));
  EXPECT_EQ("two", Text(reader->GetPrdId(3)));
  EXPECT_EQ("two", Text(reader->GetPrdName(3)));
}

TEST(ZORClashParsing, GetPrdIdAtATextNodeOrCommentIsEmpty) {
  LoadedReader reader(kComponents);
  for (int position : {0, 2}) {
    EXPECT_EQ("", Text(reader->GetPrdId(position)));
    EXPECT_EQ("", Text(reader->GetPrdName(position)));
    EXPECT_EQ("", Text(reader->GetPrdType(position)));
  }
}

TEST(ZORClashParsing, GetPrdTypeIsTheComponentsType) {
  LoadedReader reader(kComponents);
  EXPECT_EQ("Part", Text(reader->GetPrdType(1)));
  EXPECT_EQ("", Text(reader->GetPrdType(3)));
}

TEST(ZORClashParsing, ComponentsPastTheEndAreEmpty) {
  LoadedReader reader(kComponents);
  for (int position : {4, 2147483647}) {
    EXPECT_EQ("", Text(reader->GetPrdId(position)));
    EXPECT_EQ("", Text(reader->GetPrdName(position)));
    EXPECT_EQ("", Text(reader->GetPrdType(position)));
    EXPECT_EQ(0, reader->GetNbRealAttr(position));
    EXPECT_EQ(0, reader->GetNbShapes(position));
    EXPECT_EQ("", Text(reader->GetShapeAttrValue(position, 0, "ShapeName")));
  }
}

// ---- Real attributes

struct RealAttribute {
  RealAttribute(LoadedReader& ioReader, int inPosition, int inNumber) {
    ioReader->GetSetOfRealAttr(inPosition, inNumber, name, type, value);
  }
  std::array<std::string, 3> Texts() const { return {Text(name), Text(type), Text(value)}; }
  ZORUnicodeString name = kUntouched;
  ZORUnicodeString type = kUntouched;
  ZORUnicodeString value = kUntouched;
};

using ThreeTexts = std::array<std::string, 3>;

constexpr const char* kAttributes =
    "<Components><C> <ComponentAttributes>"
    "<ComponentAttribute Name=\"f\" AttrType=\"Feature\" AttrValue=\"0\"/>"
    "<ComponentAttribute Name=\"a\" AttrType=\"String\" AttrValue=\"1\"/> <Other "
    "AttrType=\"String\"/>"
    "<ComponentAttribute Name=\"b\"/></ComponentAttributes><ComponentAttributes>"
    "<ComponentAttribute Name=\"g\" AttrType=\"Feature\" AttrValue=\"0\"/>"
    "<ComponentAttribute Name=\"c\" AttrType=\"feature\" "
    "AttrValue=\"3\"/></ComponentAttributes></C>"
    "<C><ComponentAttribute AttrType=\"String\"/></C></Components>";

TEST(ZORClashParsing, GetNbRealAttrLeavesFeaturesOut) {
  LoadedReader reader(
      "<Components><C><ComponentAttributes><ComponentAttribute AttrType=\"Feature\"/>"
      "<ComponentAttribute AttrType=\"Feature\"/>"
      "<ComponentAttribute Name=\"n\" AttrType=\"String\" AttrValue=\"v\"/>"
      "</ComponentAttributes></C></Components>");
  EXPECT_EQ(1, reader->GetNbRealAttr(0));
  EXPECT_EQ((ThreeTexts{"n", "String", "v"}), RealAttribute(reader, 0, 1).Texts());
}

TEST(ZORClashParsing, GetNbRealAttrCountsOverAllContainers) {
  LoadedReader reader(kAttributes);
  EXPECT_EQ(3, reader->GetNbRealAttr(0));
}

TEST(ZORClashParsing, GetNbRealAttrOutsideContainersIsZero) {
  LoadedReader reader(kAttributes);
  EXPECT_EQ(0, reader->GetNbRealAttr(1));
}

TEST(ZORClashParsing, GetSetOfRealAttrCountsRealAttributesFromOne) {
  LoadedReader reader(kAttributes);
  EXPECT_EQ((ThreeTexts{"a", "String", "1"}), RealAttribute(reader, 0, 1).Texts());
  EXPECT_EQ((ThreeTexts{"c", "feature", "3"}), RealAttribute(reader, 0, 3).Texts());
}

TEST(ZORClashParsing, GetSetOfRealAttrWithoutTypeIsReal) {
  LoadedReader reader(kAttributes);
  EXPECT_EQ((ThreeTexts{"b", "", ""}), RealAttribute(reader, 0, 2).Texts());
}

TEST(ZORClashParsing, GetSetOfRealAttrOutsideTouchesNothing) {
  LoadedReader reader(kAttributes);
  for (int number : {0, -1, 4})
    EXPECT_EQ((ThreeTexts{kUntouched, kUntouched, kUntouched}),
              RealAttribute(reader, 0, number).Texts());
  EXPECT_EQ((ThreeTexts{kUntouched, kUntouched, kUntouched}), RealAttribute(reader, 2, 1).Texts());
}

// ---- Shapes

constexpr const char* kShapes =
    "<Components><C><ComponentShapes>t<ComponentShape ShapeType=\"t0\" ShapeId=\"i0\""
    " ShapeName=\"n0\" ShapeOnDisk=\"d0\" Own=\"o0\"/><Other/><ComponentShape ShapeName=\"n1\"/>"
    "</ComponentShapes><ComponentShapes><ComponentShape ShapeName=\"n2\"/></ComponentShapes></C>"
    "<C><ComponentShape ShapeName=\"n\"/></C></Components>";

TEST(ZORClashParsing, GetNbShapesCountsOverAllContainers) {
  LoadedReader reader(kShapes);
  EXPECT_EQ(3, reader->GetNbShapes(0));
  EXPECT_EQ(0, reader->GetNbShapes(1));
}

TEST(ZORClashParsing, GetShapeAttrValueCountsShapesFromZero) {
  LoadedReader reader(kShapes);
  EXPECT_EQ("n0", Text(reader->GetShapeAttrValue(0, 0, "ShapeName")));
  EXPECT_EQ("n1", Text(reader->GetShapeAttrValue(0, 1, "ShapeName")));
  EXPECT_EQ("n2", Text(reader->GetShapeAttrValue(0, 2, "ShapeName")));
}

TEST(ZORClashParsing, GetShapeAttrValueGivesAnyAttribute) {
  LoadedReader reader(kShapes);
  EXPECT_EQ("t0", Text(reader->GetShapeAttrValue(0, 0, "ShapeType")));
  EXPECT_EQ("i0", Text(reader->GetShapeAttrValue(0, 0, "ShapeId")));
  EXPECT_EQ("d0", Text(reader->GetShapeAttrValue(0, 0, "ShapeOnDisk")));
  EXPECT_EQ("o0", Text(reader->GetShapeAttrValue(0, 0, "Own")));
}

TEST(ZORClashParsing, GetShapeAttrValueThatIsNotFoundIsEmpty) {
  LoadedReader reader(kShapes);
  EXPECT_EQ("", Text(reader->GetShapeAttrValue(0, 1, "ShapeType")));
  EXPECT_EQ("", Text(reader->GetShapeAttrValue(0, 3, "ShapeName")));
  EXPECT_EQ("", Text(reader->GetShapeAttrValue(0, -1, "ShapeName")));
  EXPECT_EQ("", Text(reader->GetShapeAttrValue(1, 0, "ShapeName")));
}

// ---- Position

std::vector<double> PositionOf(const std::string& inComponent) {
  LoadedReader reader("<Components>" + inComponent + "</Components>");
  double* numbers = nullptr;
  reader->GetPosition(0, numbers);
  const std::unique_ptr<double[]> owned(numbers);
  return {numbers, numbers + 12};
}

TEST(ZORClashParsing, GetPositionGivesColumnsThenTranslation) {
  EXPECT_EQ((std::vector<double>{1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12}),
            PositionOf("<C>t<ShapePosition><T Ux=\"10\" Uy=\"11\" Uz=\"12\"/> "
                       "<Rz Ux=\"7\" Uy=\"8\" Uz=\"9\"/><Rx Ux=\"1\" Uy=\"2\" Uz=\"3\"/><Other/>"
                       "<Ry Ux=\"4\" Uy=\"5\" Uz=\"6\"/></ShapePosition></C>"));
}

TEST(ZORClashParsing, GetPositionOfAMissingOrUnreadableNumberIsZero) {
  EXPECT_EQ((std::vector<double>{0, 0, 0, 0, 2, 0, 0, 0, 0, 0, 0, 0}),
            PositionOf("<C><ShapePosition><Rx/><Ry Ux=\"x\" Uy=\"2\"/><Rz Ux=\"\"/><T Uz=\"-\"/>"
                       "</ShapePosition></C>"));
}

TEST(ZORClashParsing, GetPositionReadsFloatingNumbers) {
  EXPECT_EQ((std::vector<double>{-1.5, 2e-3, 3, 0.5, -0.0, 6, 1e300, 8, 9, 10, 11, 12}),
            PositionOf("<C><ShapePosition><Rx Ux=\"-1.5\" Uy=\"2e-3\" Uz=\" 3mm\"/>"
                       "<Ry Ux=\".5\" Uy=\"-0\" Uz=\"+6\"/><Rz Ux=\"1E300\" Uy=\"8\" Uz=\"9\"/>"
                       "<T Ux=\"10\" Uy=\"11\" Uz=\"12\"/></ShapePosition></C>"));
}

// Placements are read as they stand: a decimal comma ends the number.
TEST(ZORClashParsing, GetPositionEndsANumberAtAComma) {
  const std::vector<double> numbers = PositionOf(
      "<C><ShapePosition><Rx Ux=\"1,9\" Uy=\"0\" Uz=\"0\"/><Ry/><Rz/><T/></ShapePosition></C>");
  EXPECT_EQ(1.0, numbers[0]);
}

TEST(ZORClashParsing, GetPositionWithoutSourceStillGivesAnArray) {
  LoadedReader reader("<Components>t<C/></Components>");
  for (int position : {0, 1, 2, 2147483647}) {
    double* numbers = nullptr;
    reader->GetPosition(position, numbers);
    ASSERT_NE(nullptr, numbers);
    for (int i = 0; i < 12; ++i) numbers[i] = i;  // all of it belongs to the caller
    EXPECT_EQ(11.0, numbers[11]);
    delete[] numbers;
  }
}

TEST(ZORClashParsing, GetPositionWithoutDocumentStillGivesAnArray) {
  LoadedReader reader("");
  double* numbers = nullptr;
  reader->GetPosition(0, numbers);
  EXPECT_NE(nullptr, numbers);
  delete[] numbers;
}

TEST(ZORClashParsing, GetPositionGivesANewArrayAtEachCall) {
  LoadedReader reader("<Components><C/></Components>");
  double* first = nullptr;
  double* second = nullptr;
  reader->GetPosition(0, first);
  reader->GetPosition(0, second);
  EXPECT_NE(first, second);
  delete[] first;
  delete[] second;
}

// ---- Specification

constexpr const char* kSpecifications =
    "<ClashElement> <Specification/><ProductsInSpec>t"
    "<Specification><ProdListe2 Alias=\"a2\" Alien=\"n2\" ShapeName=\"s2\" DisplayableID=\"i2\""
    " DocumentVersion=\"v2\"/><ProdListe1 Alias=\"a1\" Alien=\"n1\" ShapeName=\"s1\""
    " DisplayableID=\"i1\" DocumentVersion=\"v1\"/></Specification><Other/>"
    "<Specification><ProdListe1/></Specification></ProductsInSpec>"
    "<ProductsInSpec><Specification> <ProdListe2 Alias=\"last\"/></Specification></ProductsInSpec>"
    "</ClashElement>";

using TenTexts = std::array<std::string, 10>;

TenTexts AllUntouched() {
  TenTexts texts;
  texts.fill(kUntouched);
  return texts;
}

TEST(ZORClashParsing, GetSpecInfosCountsOverAllContainers) {
  LoadedReader reader(kSpecifications);
  int count = 77;
  reader->GetSpecInfos(count);
  EXPECT_EQ(3, count);
}

TEST(ZORClashParsing, GetSpecInfosWithoutSpecificationIsZero) {
  for (const char* text : {"", "<ClashElement/>", "<ClashElement><Specification/></ClashElement>",
                           "<ClashElement><ProductsInSpec/></ClashElement>"}) {
    LoadedReader reader(text);
    int count = 77;
    reader->GetSpecInfos(count);
    EXPECT_EQ(0, count) << text;
  }
}

TEST(ZORClashParsing, GetProductsInSpecFillsTenOutputs) {
  LoadedReader reader(kSpecifications);
  EXPECT_EQ((TenTexts{"a1", "a2", "i1", "i2", "v1", "v2", "n1", "n2", "s1", "s2"}),
            SpecifiedProducts().Read(*reader, 1).Texts());
}

TEST(ZORClashParsing, GetProductsInSpecLeavesTheOutputsOfAMissingSet) {
  LoadedReader reader(kSpecifications);
  EXPECT_EQ(
      (TenTexts{"", kUntouched, "", kUntouched, "", kUntouched, "", kUntouched, "", kUntouched}),
      SpecifiedProducts().Read(*reader, 2).Texts());
}

TEST(ZORClashParsing, GetProductsInSpecCountsOverAllContainers) {
  LoadedReader reader(kSpecifications);
  EXPECT_EQ((TenTexts{kUntouched, "last", kUntouched, "", kUntouched, "", kUntouched, "",
                      kUntouched, ""}),
            SpecifiedProducts().Read(*reader, 3).Texts());
}

TEST(ZORClashParsing, GetProductsInSpecZeroTouchesNothing) {
  LoadedReader reader(kSpecifications);
  EXPECT_EQ(AllUntouched(), SpecifiedProducts().Read(*reader, 0).Texts());
}

TEST(ZORClashParsing, GetProductsInSpecOutsideTouchesNothing) {
  LoadedReader reader(kSpecifications);
  EXPECT_EQ(AllUntouched(), SpecifiedProducts().Read(*reader, -1).Texts());
  EXPECT_EQ(AllUntouched(), SpecifiedProducts().Read(*reader, 4).Texts());
}

TEST(ZORClashParsing, GetProductsInSpecWithoutDocumentTouchesNothing) {
  LoadedReader reader("");
  EXPECT_EQ(AllUntouched(), SpecifiedProducts().Read(*reader, 1).Texts());
}

// ---- Linked documents

TEST(ZORClashParsing, GetListOfLinkedElementsGivesTheChildrenOfElements) {
  LoadedReader reader(
      "<FederatorClashElement> <Elements>t<Element Link=\"1\"/><Other Link=\"2\"/></Elements>"
      "<Elements><Element Link=\"3\"/></Elements></FederatorClashElement>");
  const DOM_NodeList linked = reader->GetListOfLinkedElements();
  ASSERT_EQ(3u, linked.getLength());
  EXPECT_EQ("#text", Name(linked.item(0)));
  EXPECT_EQ("1", Attribute(linked.item(1), "Link"));
  EXPECT_EQ("2", Attribute(linked.item(2), "Link"));
}

TEST(ZORClashParsing, GetListOfLinkedElementsOfOtherKindsIsEmpty) {
  EXPECT_EQ(0u, LoadedReader("<ClashElement><Elements><Element/></Elements></ClashElement>")
                    ->GetListOfLinkedElements()
                    .getLength());
  EXPECT_EQ(0u, LoadedReader("<Drawing><Elements><Element/></Elements></Drawing>")
                    ->GetListOfLinkedElements()
                    .getLength());
}

TEST(ZORClashParsing, GetListOfLinkedElementsWithoutElementsIsEmpty) {
  EXPECT_EQ(0u, LoadedReader("<FederatorClashElement/>")->GetListOfLinkedElements().getLength());
  EXPECT_EQ(0u, LoadedReader("<FederatorClashElement><Elements/></FederatorClashElement>")
                    ->GetListOfLinkedElements()
                    .getLength());
  EXPECT_EQ(0u, LoadedReader("")->GetListOfLinkedElements().getLength());
}

TEST(ZORClashParsing, GetAttOfLinkedElementFillsSevenOutputs) {
  LoadedReader reader(
      "<FederatorClashElement><Elements><Element Link=\"l\" FirstProductName=\"n1\""
      " SecondProductName=\"n2\" FirstProductId=\"i1\" SecondProductId=\"i2\""
      " FirstProductURL=\"u1\" SecondProductURL=\"u2\"/></Elements></FederatorClashElement>");
  std::array<ZORUnicodeString, 7> out;
  reader->GetAttOfLinkedElement(reader->GetListOfLinkedElements().item(0), out[0], out[1], out[2],
                                out[3], out[4], out[5], out[6]);
  const char* const expected[] = {"l", "n1", "n2", "i1", "i2", "u1", "u2"};
  for (std::size_t i = 0; i < out.size(); ++i) EXPECT_EQ(expected[i], Text(out[i]));
}

TEST(ZORClashParsing, GetAttOfLinkedElementWithoutAttributesEmptiesTheOutputs) {
  LoadedReader reader("<ClashElement>t<Element link=\"l\"/></ClashElement>");
  for (const DOM_Node& node :
       {DOM_Node(), reader->GetNodeList().item(0), reader->GetNodeList().item(1)}) {
    std::array<ZORUnicodeString, 7> out;
    out.fill(kUntouched);
    reader->GetAttOfLinkedElement(node, out[0], out[1], out[2], out[3], out[4], out[5], out[6]);
    for (const ZORUnicodeString& text : out) EXPECT_EQ("", Text(text));
  }
}

// ---- Rebuilding a session

using Numbers = std::array<double, 12>;
constexpr Numbers kIdentity{1, 0, 0, 0, 1, 0, 0, 0, 1, 0, 0, 0};
constexpr Numbers kAllZero{};

struct Session {
  explicit Session(LoadedReader& ioReader) {
    ioReader->GetReBuildSessionInfos(aliases, descriptionIds, positions);
  }
  ~Session() { delete[] positions; }
  Session(const Session&) = delete;
  Session& operator=(const Session&) = delete;

  static std::vector<std::string> Texts(const ZORListValZORUnicodeString& inList) {
    std::vector<std::string> texts;
    for (int i = 1; i <= inList.Size(); ++i) texts.push_back(Text(inList[i]));
    return texts;
  }
  Numbers PositionAt(std::size_t inPlace) const {
    Numbers numbers;
    positions[inPlace].GetCoefficients(numbers.data());
    return numbers;
  }

  ZORListValZORUnicodeString aliases, descriptionIds;
  ZORMathTransformation* positions = nullptr;
};

using Strings = std::vector<std::string>;

std::string ResultSet(const std::string& inNbInterf, const std::string& inContent) {
  return "<ClashElement><ClashResult NbInterf=\"" + inNbInterf + "\">" + inContent +
         "</ClashResult></ClashElement>";
}

// A matrix whose twelve numbers are inFirst, inFirst + 1, …
std::string Matrix(int inFirst) {
  const auto number = [&](int inOffset) {
    return "=\"" + std::to_string(inFirst + inOffset) + "\" ";
  };
  const auto vector = [&](const std::string& inName, int inOffset) {
    return "<Vector CorrespondingData=\"" + inName + "\" Vx" + number(inOffset) + "Vy" +
           number(inOffset + 1) + "Vz" + number(inOffset + 2) + "/>";
  };
  return "<Matrix> <Point Ux" + number(9) + "Uy" + number(10) + "Uz" + number(11) + "/>" +
         vector("Rz", 6) + vector("Rx", 0) + vector("Ry", 3) + vector("Rw", 100) + "</Matrix>";
}

std::string Product(const std::string& inAlias, const std::string& inId,
                    const std::string& inContent = "") {
  return "<Product Alias=\"" + inAlias + "\" DescriptionID=\"" + inId + "\">" + inContent +
         "</Product>";
}

TEST(ZORClashParsing, RebuildGivesProductsAndPlacements) {
  LoadedReader reader(ResultSet("1", "t<Interference>" + Product("a", "A", Matrix(1)) +
                                         Product("b", "B", Matrix(21)) + "</Interference>"));
  const Session session(reader);
  EXPECT_EQ((Strings{"a", "b"}), Session::Texts(session.aliases));
  EXPECT_EQ((Strings{"A", "B"}), Session::Texts(session.descriptionIds));
  EXPECT_EQ((Numbers{1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12}), session.PositionAt(0));
  EXPECT_EQ((Numbers{21, 22, 23, 24, 25, 26, 27, 28, 29, 30, 31, 32}), session.PositionAt(1));
}

TEST(ZORClashParsing, RebuildTakesNoMoreInterferencesThanDeclared) {
  LoadedReader reader(ResultSet(
      "2", "<Interference>" + Product("a", "A", Matrix(1)) + Product("b", "B", Matrix(2)) +
               "</Interference><Interference>" + Product("c", "C", Matrix(3)) +
               Product("d", "D", Matrix(4)) + "</Interference><Interference>" + Product("e", "E") +
               Product("f", "F") + "</Interference>"));
  const Session session(reader);
  EXPECT_EQ((Strings{"a", "b", "c", "d"}), Session::Texts(session.aliases));
  EXPECT_EQ((Strings{"A", "B", "C", "D"}), Session::Texts(session.descriptionIds));
  for (std::size_t place = 0; place < 4; ++place)
    EXPECT_EQ(static_cast<double>(place + 1), session.PositionAt(place)[0]);
}

TEST(ZORClashParsing, RebuildLeavesPlacementsBeyondTheLastInterferenceAsIdentities) {
  LoadedReader reader(
      ResultSet("2", "<Interference>" + Product("a", "A", Matrix(1)) + "</Interference>"));
  const Session session(reader);
  EXPECT_EQ(2, session.aliases.Size());
  EXPECT_EQ(1.0, session.PositionAt(0)[0]);
  EXPECT_EQ(kIdentity, session.PositionAt(2));
  EXPECT_EQ(kIdentity, session.PositionAt(3));
}

TEST(ZORClashParsing, RebuildOfAProductWithoutMatrixIsAllZero) {
  LoadedReader reader(ResultSet("1", "<Interference>" + Product("a", "A") +
                                         Product("b", "B", "<Matrix/>") + "</Interference>"));
  const Session session(reader);
  EXPECT_EQ(kAllZero, session.PositionAt(0));
  EXPECT_EQ(kAllZero, session.PositionAt(1));
}

TEST(ZORClashParsing, RebuildOfAnInterferenceWithoutProductsAppendsEmptyTextsAndIdentities) {
  LoadedReader reader(ResultSet("1", "<Interference/>"));
  const Session session(reader);
  EXPECT_EQ((Strings{"", ""}), Session::Texts(session.aliases));
  EXPECT_EQ((Strings{"", ""}), Session::Texts(session.descriptionIds));
  EXPECT_EQ(kIdentity, session.PositionAt(0));
  EXPECT_EQ(kIdentity, session.PositionAt(1));
}

TEST(ZORClashParsing, RebuildOfMissingNumbersIsMinusOne) {
  LoadedReader reader(ResultSet(
      "1", "<Interference>" +
               Product("a", "A",
                       "<Matrix><Point Ux=\"5\" Uy=\"x\"/><Vector CorrespondingData=\"Ry\""
                       " Vy=\"\" Vz=\"7\"/></Matrix>") +
               "</Interference>"));
  const Session session(reader);
  EXPECT_EQ((Numbers{0, 0, 0, -1, -1, 7, 0, 0, 0, 5, -1, -1}), session.PositionAt(0));
}

// Placements are read as they stand: a decimal comma ends the number.
TEST(ZORClashParsing, RebuildEndsANumberAtAComma) {
  LoadedReader reader(ResultSet(
      "1", "<Interference>" +
               Product("a", "A", "<Matrix><Point Ux=\"-2,9\" Uy=\"1.5e1\" Uz=\",5\"/></Matrix>") +
               "</Interference>"));
  const Session session(reader);
  EXPECT_EQ((Numbers{0, 0, 0, 0, 0, 0, 0, 0, 0, -2, 15, -1}), session.PositionAt(0));
}

TEST(ZORClashParsing, RebuildTakesTheLastPointAndVectorOfAKind) {
  LoadedReader reader(ResultSet(
      "1",
      "<Interference>" +
          Product("a", "A",
                  "<Matrix><Point Ux=\"1\" Uy=\"1\" Uz=\"1\"/><Point Ux=\"2\" Uy=\"2\" Uz=\"2\"/>"
                  "<Vector CorrespondingData=\"Rx\" Vx=\"3\" Vy=\"3\" Vz=\"3\"/>"
                  "<Vector CorrespondingData=\"Rx\" Vx=\"4\" Vy=\"4\" Vz=\"4\"/></Matrix>") +
          "</Interference>"));
  const Session session(reader);
  EXPECT_EQ((Numbers{4, 4, 4, 0, 0, 0, 0, 0, 0, 2, 2, 2}), session.PositionAt(0));
}

// The first product is told by its description identifier: without one, the next takes its place.
TEST(ZORClashParsing, RebuildOfAFirstProductWithoutDescriptionGivesTheSecondItsPlace) {
  LoadedReader reader(ResultSet("1", "<Interference>" + Product("a", "", Matrix(1)) +
                                         Product("b", "B", Matrix(21)) + "</Interference>"));
  const Session session(reader);
  EXPECT_EQ((Strings{"b", ""}), Session::Texts(session.aliases));
  EXPECT_EQ((Strings{"B", ""}), Session::Texts(session.descriptionIds));
  EXPECT_EQ(21.0, session.PositionAt(0)[0]);
  EXPECT_EQ(kIdentity, session.PositionAt(1));
}

TEST(ZORClashParsing, RebuildOfAThirdProductReplacesTheSecond) {
  LoadedReader reader(ResultSet("1", "<Interference>" + Product("a", "A") +
                                         Product("b", "B", Matrix(21)) +
                                         Product("c", "C", Matrix(41)) + "</Interference>"));
  const Session session(reader);
  EXPECT_EQ((Strings{"a", "c"}), Session::Texts(session.aliases));
  EXPECT_EQ(41.0, session.PositionAt(1)[0]);
}

TEST(ZORClashParsing, RebuildWithoutDeclaredInterferencesGivesNothing) {
  for (const char* declared : {"0", "-3", "", "abc"}) {
    LoadedReader reader(
        ResultSet(declared, "<Interference>" + Product("a", "A") + "</Interference>"));
    const Session session(reader);
    EXPECT_EQ(0, session.aliases.Size()) << declared;
    EXPECT_EQ(0, session.descriptionIds.Size()) << declared;
    EXPECT_EQ(nullptr, session.positions) << declared;
  }
}

TEST(ZORClashParsing, RebuildReadsTheDeclaredNumberAsAnInteger) {
  LoadedReader reader(ResultSet("1.9", "<Interference>" + Product("a", "A") +
                                           "</Interference><Interference>" + Product("b", "B") +
                                           "</Interference>"));
  EXPECT_EQ(2, Session(reader).aliases.Size());
}

TEST(ZORClashParsing, RebuildAppendsToTheLists) {
  LoadedReader reader(ResultSet("1", "<Interference>" + Product("a", "A") + "</Interference>"));
  ZORListValZORUnicodeString aliases, ids;
  aliases.Append("before");
  ZORMathTransformation* positions = nullptr;
  reader->GetReBuildSessionInfos(aliases, ids, positions);
  delete[] positions;
  EXPECT_EQ((Strings{"before", "a", ""}), Session::Texts(aliases));
  EXPECT_EQ((Strings{"A", ""}), Session::Texts(ids));
}

TEST(ZORClashParsing, RebuildOfALaterSetWithoutInterferencesKeepsTheArray) {
  LoadedReader reader("<ClashElement><ClashResult NbInterf=\"1\"><Interference>" +
                      Product("a", "A", Matrix(1)) +
                      "</Interference></ClashResult><ClashResult NbInterf=\"0\"/></ClashElement>");
  const Session session(reader);
  ASSERT_NE(nullptr, session.positions);
  EXPECT_EQ(1.0, session.PositionAt(0)[0]);
}

// The array of an earlier result set is abandoned, and so it is by promise that it leaks here.
TEST(ZORClashParsing, RebuildEndsOnTheArrayOfTheLastSetWithInterferences) {
  LoadedReader reader(
      "<ClashElement><ClashResult NbInterf=\"1\"><Interference>" + Product("a", "A", Matrix(1)) +
      "</Interference></ClashResult><ClashResult NbInterf=\"1\"><Interference>" +
      Product("b", "B", Matrix(21)) + "</Interference></ClashResult></ClashElement>");
  ZORListValZORUnicodeString aliases, ids;
  ZORMathTransformation* positions = nullptr;
  {
    const support::AbandonedMemory abandoned;
    reader->GetReBuildSessionInfos(aliases, ids, positions);
  }
  EXPECT_EQ((Strings{"a", "", "b", ""}), Session::Texts(aliases));
  EXPECT_EQ((Strings{"A", "", "B", ""}), Session::Texts(ids));
  EXPECT_EQ(21.0, positions[0].GetMatrix().GetColumn(0).x);
  delete[] positions;
}

}  // namespace
