// Finding interferences by number, their labels, their short and full readings.
#include <gtest/gtest.h>

#include <array>
#include <string>
#include <tuple>

#include "support/LoadedReader.h"

namespace {

using support::Attribute;
using support::ClashInfos;
using support::IthInterference;
using support::kUntouched;
using support::LoadedReader;
using support::SharedReader;
using support::ShortInfos;
using support::Text;

// Interferences 1 and 2, then 3 to 5, with other nodes between.
constexpr const char* kTwoResultSets =
    "<ClashElement>\n"
    "<Interference Name=\"directly under the root\"/>"
    "<ClashResult Name=\"first\" ComputationCase=\"case 1\">\n"
    "  <Interference Name=\"1\" Value=\"v1\"/><!-- c --><Other/><Interference Name=\"2\" "
    "Value=\"v2\"/>"
    "</ClashResult><Other><Interference Name=\"not in a result set\"/></Other>"
    "<ClashResult Name=\"second\" ComputationCase=\"case 2\">"
    "<Interference Name=\"3\" Value=\"v3\"/><Interference Name=\"4\" Value=\"v4\"/>"
    "<Interference Name=\"5\" Value=\"v5\"/></ClashResult></ClashElement>";

std::string NameOfIth(LoadedReader& ioReader, int inIndex) {
  IthInterference ith;
  ith.Read(*ioReader, inIndex);
  return ith.result == S_OK ? Attribute(ith.interference, "Name") : "none";
}

// ---- GetithInterference

TEST(ZORClashParsing, GetithInterferenceCountsOverAllResultSets) {
  LoadedReader reader(kTwoResultSets);
  for (int index = 1; index <= 5; ++index)
    EXPECT_EQ(std::to_string(index), NameOfIth(reader, index));
}

TEST(ZORClashParsing, GetithInterferenceThreeOfTwiceTwoIsTheFirstOfTheSecondSet) {
  LoadedReader reader(
      "<ClashElement><ClashResult><Interference/><Interference/></ClashResult>"
      "<ClashResult><Interference Name=\"it\"/><Interference/></ClashResult></ClashElement>");
  EXPECT_EQ("it", NameOfIth(reader, 3));
}

TEST(ZORClashParsing, GetithInterferenceOutsideFails) {
  LoadedReader reader(kTwoResultSets);
  for (int index : {0, -1, 6, 2147483647, -2147483647 - 1})
    EXPECT_EQ("none", NameOfIth(reader, index)) << index;
}

TEST(ZORClashParsing, GetithInterferenceThatFailsTouchesNothing) {
  LoadedReader reader(kTwoResultSets);
  DOM_Node interference = reader->GetNodeList().item(0);
  const DOM_Node before = interference;
  ZORUnicodeString a = kUntouched, b = kUntouched, c = kUntouched, d = kUntouched;
  EXPECT_EQ(E_FAIL, reader->GetithInterference(6, interference, a, b, c, d));
  EXPECT_EQ(before, interference);
  for (const ZORUnicodeString& text : {a, b, c, d}) EXPECT_EQ(kUntouched, Text(text));
}

TEST(ZORClashParsing, GetithInterferenceOfARootWithoutChildrenFails) {
  LoadedReader reader("<ClashElement/>");
  EXPECT_EQ("none", NameOfIth(reader, 1));
}

TEST(ZORClashParsing, GetithInterferenceDoesNotFindOneDirectlyUnderTheRoot) {
  LoadedReader reader("<InterferenceElement><Interference Name=\"1\"/></InterferenceElement>");
  EXPECT_EQ("none", NameOfIth(reader, 1));
}

TEST(ZORClashParsing, GetithInterferenceWorksInADocumentOfAnyKind) {
  LoadedReader reader("<Drawing><ClashResult><Interference Name=\"1\"/></ClashResult></Drawing>");
  EXPECT_EQ("1", NameOfIth(reader, 1));
}

TEST(ZORClashParsing, GetithInterferenceGivesADeepCopyWithoutParent) {
  SharedReader reader(
      "<ClashElement><ClashResult><Interference Name=\"1\">t<Product Alias=\"a\"/></Interference>"
      "</ClashResult></ClashElement>");
  IthInterference ith;
  ASSERT_EQ(S_OK, ith.Read(*reader, 1).result);
  EXPECT_TRUE(ith.interference.getParentNode().isNull());
  EXPECT_EQ(reader.document, ith.interference.getOwnerDocument());
  EXPECT_NE(reader.root.getFirstChild().getFirstChild(), ith.interference);
  EXPECT_EQ("1", Attribute(ith.interference, "Name"));
  EXPECT_EQ(2u, ith.interference.getChildNodes().getLength());
  EXPECT_EQ("a", Attribute(ith.interference.getLastChild(), "Alias"));
}

TEST(ZORClashParsing, ChangingTheCopyOfAnInterferenceChangesNoDocument) {
  SharedReader reader(
      "<ClashElement><ClashResult><Interference Name=\"1\"><Product Alias=\"a\"/></Interference>"
      "</ClashResult></ClashElement>");
  IthInterference ith;
  ASSERT_EQ(S_OK, ith.Read(*reader, 1).result);
  DOM_Element(ith.interference).setAttribute("Name", "changed");
  DOM_Element(ith.interference.getFirstChild()).setAttribute("Alias", "changed");
  ith.interference.appendChild(reader.document.createElement("Product"));
  const DOM_Node own = reader.root.getFirstChild().getFirstChild();
  EXPECT_EQ("1", Attribute(own, "Name"));
  EXPECT_EQ("a", Attribute(own.getFirstChild(), "Alias"));
  EXPECT_EQ(1u, own.getChildNodes().getLength());
  IthInterference again;
  again.Read(*reader, 1);
  EXPECT_EQ("1", Attribute(again.interference, "Name"));
  EXPECT_EQ("a -- ", Text(again.firstLabel));
}

// ---- Labels and previews

IthInterference FirstWith(const std::string& inProducts) {
  LoadedReader reader("<ClashElement><ClashResult><Interference>" + inProducts +
                      "</Interference></ClashResult></ClashElement>");
  IthInterference ith;
  ith.Read(*reader, 1);
  return ith;
}

TEST(ZORClashParsing, LabelIsInstanceAndShape) {
  const IthInterference ith = FirstWith(
      "<Product Alias=\"root --++-- arm --++-- bolt.1\" ShapeName=\"M4\" Preview=\"a.jpg\"/>"
      "<Product Alias=\"plate\" ShapeName=\"steel\" Preview=\"b.jpg\"/>");
  EXPECT_EQ("bolt.1 -- M4", Text(ith.firstLabel));
  EXPECT_EQ("plate -- steel", Text(ith.secondLabel));
  EXPECT_EQ("a.jpg", Text(ith.firstPreview));
  EXPECT_EQ("b.jpg", Text(ith.secondPreview));
}

TEST(ZORClashParsing, LabelIsMadeOfTheAliasNotOfTheDescription) {
  const IthInterference ith = FirstWith("<Product Alias=\"alias\" DescriptionID=\"description\"/>");
  EXPECT_EQ("alias -- ", Text(ith.firstLabel));
}

TEST(ZORClashParsing, LabelWithoutShapeKeepsTheSeparator) {
  const IthInterference ith = FirstWith("<Product Alias=\"a\"/><Product/>");
  EXPECT_EQ("a -- ", Text(ith.firstLabel));
  EXPECT_EQ(" -- ", Text(ith.secondLabel));
  EXPECT_EQ("", Text(ith.firstPreview));
  EXPECT_EQ("", Text(ith.secondPreview));
}

// A label is never empty, and so a first product without names still is the first.
TEST(ZORClashParsing, LabelOfAFirstProductWithoutNamesIsTheFirst) {
  const IthInterference ith = FirstWith("<Product/><Product Alias=\"b\"/>");
  EXPECT_EQ(" -- ", Text(ith.firstLabel));
  EXPECT_EQ("b -- ", Text(ith.secondLabel));
}

TEST(ZORClashParsing, LabelOfAThirdProductReplacesTheSecond) {
  const IthInterference ith = FirstWith(
      "<Product Alias=\"a\"/><Product Alias=\"b\" Preview=\"b.jpg\"/><Product Alias=\"c\"/>");
  EXPECT_EQ("a -- ", Text(ith.firstLabel));
  EXPECT_EQ("c -- ", Text(ith.secondLabel));
  EXPECT_EQ("", Text(ith.secondPreview));
}

TEST(ZORClashParsing, LabelsWithoutProductsStayUntouched) {
  LoadedReader reader("<ClashElement><ClashResult><Interference/></ClashResult></ClashElement>");
  IthInterference ith;
  ith.secondLabel = ith.firstPreview = ith.secondPreview = kUntouched;
  EXPECT_EQ(S_OK, ith.Read(*reader, 1).result);
  EXPECT_EQ("", Text(ith.firstLabel));
  EXPECT_EQ(kUntouched, Text(ith.secondLabel));
  EXPECT_EQ(kUntouched, Text(ith.firstPreview));
  EXPECT_EQ(kUntouched, Text(ith.secondPreview));
}

// The first product is told by the empty first label, also when the caller has filled it.
TEST(ZORClashParsing, LabelThatTheCallerFilledCountsAsAFirstProduct) {
  LoadedReader reader(
      "<ClashElement><ClashResult><Interference><Product Alias=\"a\"/><Product Alias=\"b\"/>"
      "</Interference></ClashResult></ClashElement>");
  IthInterference ith;
  ith.firstLabel = "filled";
  ith.Read(*reader, 1);
  EXPECT_EQ("filled", Text(ith.firstLabel));
  EXPECT_EQ("b -- ", Text(ith.secondLabel));
}

// ---- GetClashInfos, short form

using FiveTexts = std::array<std::string, 5>;

FiveTexts ShortOf(const std::string& inInterference) {
  LoadedReader reader("<ClashElement><ClashResult>" + inInterference +
                      "</ClashResult></ClashElement>");
  return ShortInfos().Read(*reader, 1).Texts();
}

TEST(ZORClashParsing, ShortInfosReadValuesAsTheyStand) {
  EXPECT_EQ((FiveTexts{"-2,5", " Collision ", "rule", "root --++-- a", "b"}),
            ShortOf("<Interference Value=\"-2,5\" ResultType=\" Collision \" ResultTypeNoNLS=\"x\">"
                    "<ViolatedRule Name=\"rule\"/><Product Alias=\"root --++-- a\"/>"
                    "<Product Alias=\"b\"/></Interference>"));
}

TEST(ZORClashParsing, ShortInfosOfAnEmptyInterferenceKeepTheRuleAndEmptyTheRest) {
  EXPECT_EQ((FiveTexts{"", "", kUntouched, "", ""}), ShortOf("<Interference/>"));
}

TEST(ZORClashParsing, ShortInfosOfAFirstProductWithoutAliasGiveTheSecondItsPlace) {
  EXPECT_EQ((FiveTexts{"", "", kUntouched, "b", ""}),
            ShortOf("<Interference><Product/><Product Alias=\"b\"/></Interference>"));
}

TEST(ZORClashParsing, ShortInfosOfAThirdProductReplaceTheSecond) {
  EXPECT_EQ((FiveTexts{"", "", kUntouched, "a", "c"}),
            ShortOf("<Interference><Product Alias=\"a\"/><Product Alias=\"b\"/>"
                    "<Product Alias=\"c\"/></Interference>"));
}

TEST(ZORClashParsing, ShortInfosTakeTheLastRule) {
  EXPECT_EQ((FiveTexts{"", "", "2", "", ""}),
            ShortOf("<Interference><ViolatedRule Name=\"1\"/><ViolatedRule Name=\"2\"/>"
                    "</Interference>"));
}

TEST(ZORClashParsing, ShortInfosCountOverAllResultSets) {
  LoadedReader reader(kTwoResultSets);
  for (int index = 1; index <= 5; ++index)
    EXPECT_EQ("v" + std::to_string(index), ShortInfos().Read(*reader, index).Texts()[0]);
}

TEST(ZORClashParsing, ShortInfosOutsideOnlyEmptyTheAliases) {
  LoadedReader reader(kTwoResultSets);
  for (int index : {0, -1, 6})
    EXPECT_EQ((FiveTexts{kUntouched, kUntouched, kUntouched, "", ""}),
              ShortInfos().Read(*reader, index).Texts());
}

TEST(ZORClashParsing, ShortInfosWithoutDocumentOnlyEmptyTheAliases) {
  LoadedReader reader("");
  EXPECT_EQ((FiveTexts{kUntouched, kUntouched, kUntouched, "", ""}),
            ShortInfos().Read(*reader, 1).Texts());
}

// ---- GetClashInfos, full form: which interference, and what stands around it

TEST(ZORClashParsing, FullInfosReadTheInterferenceOfTheIndex) {
  LoadedReader reader(
      "<ClashElement><ClashResult><Interference DistanceClearance=\"1\"/>"
      "<Interference DistanceClearance=\"2\"/></ClashResult>"
      "<ClashResult><Interference DistanceClearance=\"3\"/></ClashResult></ClashElement>");
  for (int index = 1; index <= 3; ++index)
    EXPECT_EQ(std::to_string(index), ClashInfos("").Read(*reader, "1.2", index)[2]);
}

TEST(ZORClashParsing, FullInfosOfAnInterferenceOfTheFirstSetNameTheLastSet) {
  LoadedReader reader(kTwoResultSets);
  ClashInfos infos;
  infos.Read(*reader, "1.2", 1);
  EXPECT_EQ("second", Text(infos.resultName));
  EXPECT_EQ("case 2", infos[4]);
}

// The result's name is given as the rule's clearance too: it is the own set's when that replaces
// the clearance.
TEST(ZORClashParsing, FullInfosNameTheOwnSetBeforeTheLast) {
  LoadedReader reader(
      "<ClashElement><ClashResult Name='A'><Interference/></ClashResult>"
      "<ClashResult Name='B'/></ClashElement>");
  std::array<ZORUnicodeString, 41> texts;
  std::apply([&](auto&... outTexts) { reader->GetClashInfos("1.1", 1, texts[6], outTexts...); },
             texts);
  EXPECT_EQ("A", Text(texts[1]));
  EXPECT_EQ("B", Text(texts[6]));
}

TEST(ZORClashParsing, FullInfosOfALaterSetWithoutAttributesEmptyNameAndCase) {
  LoadedReader reader(
      "<ClashElement><ClashResult Name=\"a\" ComputationCase=\"c\"><Interference/></ClashResult>"
      "<ClashResult/></ClashElement>");
  ClashInfos infos;
  infos.Read(*reader, "1.2", 1);
  EXPECT_EQ("", Text(infos.resultName));
  EXPECT_EQ("", infos[4]);
}

TEST(ZORClashParsing, FullInfosComputationCaseGivesWayToTheRulesType) {
  LoadedReader reader(
      "<ClashElement><ClashResult ComputationCase=\"case\"><Interference>"
      "<ViolatedRule TypeCalc=\"type\"/></Interference></ClashResult></ClashElement>");
  EXPECT_EQ("type", ClashInfos().Read(*reader, "1.2", 1)[4]);
}

TEST(ZORClashParsing, FullInfosComputationCaseWithoutRuleIsThatOfTheSet) {
  LoadedReader reader(
      "<ClashElement><ClashResult ComputationCase=\"case\"><Interference/></ClashResult>"
      "</ClashElement>");
  EXPECT_EQ("case", ClashInfos().Read(*reader, "1.2", 1)[4]);
}

TEST(ZORClashParsing, FullInfosRulesTypeGivesWayToALaterSet) {
  LoadedReader reader(
      "<ClashElement><ClashResult ComputationCase=\"case 1\"><Interference>"
      "<ViolatedRule TypeCalc=\"type\"/></Interference></ClashResult>"
      "<ClashResult ComputationCase=\"case 2\"/></ClashElement>");
  EXPECT_EQ("case 2", ClashInfos().Read(*reader, "1.2", 1)[4]);
}

TEST(ZORClashParsing, FullInfosRulesClearanceReplacesTheClearance) {
  LoadedReader reader(
      "<ClashElement><ClashResult><Interference DistanceClearance=\"1\">"
      "<ViolatedRule Clearance=\"2,5\"/></Interference></ClashResult></ClashElement>");
  const ClashInfos infos = ClashInfos().Read(*reader, "1.2", 1);
  EXPECT_EQ("2.5", infos[2]);
  EXPECT_EQ("2.5", infos[7]);
}

TEST(ZORClashParsing, FullInfosRuleWithoutClearanceLeavesTheClearance) {
  LoadedReader reader(
      "<ClashElement><ClashResult><Interference DistanceClearance=\"1\"><ViolatedRule/>"
      "</Interference></ClashResult></ClashElement>");
  const ClashInfos infos = ClashInfos().Read(*reader, "1.2", 1);
  EXPECT_EQ("1", infos[2]);
  EXPECT_EQ("", infos[7]);
}

// Nobody empties the rule's clearance: a text that the caller left there counts as one.
TEST(ZORClashParsing, FullInfosClearanceOfAnEarlierCallReplacesTheClearance) {
  LoadedReader reader(
      "<ClashElement><ClashResult><Interference DistanceClearance=\"1\"/></ClashResult>"
      "</ClashElement>");
  ClashInfos infos("");
  infos.Set(7, "9");
  infos.Read(*reader, "1.2", 1);
  EXPECT_EQ("9", infos[2]);
}

TEST(ZORClashParsing, FullInfosOfAnotherVersionGiveNameAndCaseOnly) {
  LoadedReader reader(
      "<ClashElement Version=\"1.1\"><ClashResult Name=\"n\" ComputationCase=\"c\">"
      "<Interference DistanceClearance=\"1\"><Product DescriptionID=\"d\"/>"
      "<ViolatedRule TypeCalc=\"t\" Clearance=\"2\"/></Interference></ClashResult></ClashElement>");
  ClashInfos infos("");
  infos.Read(*reader, "1.1", 1);
  EXPECT_EQ("n", Text(infos.resultName));
  for (int number = 1; number <= 41; ++number)
    EXPECT_EQ(number == 4 ? "c" : "", infos[number]) << number;
}

TEST(ZORClashParsing, FullInfosVersionIsComparedExactly) {
  LoadedReader reader(
      "<ClashElement><ClashResult><Interference DistanceClearance=\"1\"/></ClashResult>"
      "</ClashElement>");
  for (const char* version : {"", "1.20", " 1.2", "1.3", "12"})
    EXPECT_EQ("", ClashInfos("").Read(*reader, version, 1)[2]) << version;
  EXPECT_EQ("1", ClashInfos("").Read(*reader, "1.2", 1)[2]);
}

// The clearance is replaced whether the interference is read or not.
TEST(ZORClashParsing, FullInfosOfAnotherVersionStillReplaceTheClearance) {
  LoadedReader reader("<ClashElement><ClashResult><Interference/></ClashResult></ClashElement>");
  ClashInfos infos("");
  infos.Set(7, "9");
  EXPECT_EQ("9", infos.Read(*reader, "1.1", 1)[2]);
}

TEST(ZORClashParsing, FullInfosOutsideOnlyNameTheLastSet) {
  LoadedReader reader(kTwoResultSets);
  for (int index : {0, -1, 6}) {
    ClashInfos infos;
    infos.Read(*reader, "1.2", index);
    EXPECT_EQ("second", Text(infos.resultName));
    for (int number = 1; number <= 41; ++number) {
      const bool reset = number == 8 || number == 9 || number == 13 || number == 14;
      const std::string expected = number == 4 ? "case 2" : reset ? "" : kUntouched;
      EXPECT_EQ(expected, infos[number]) << index << ", output " << number;
    }
  }
}

TEST(ZORClashParsing, FullInfosWithoutResultSetOnlyEmptyFourOutputs) {
  LoadedReader reader("<ClashElement><Interference DistanceClearance=\"1\"/></ClashElement>");
  ClashInfos infos;
  infos.Read(*reader, "1.2", 1);
  EXPECT_EQ(kUntouched, Text(infos.resultName));
  for (int number = 1; number <= 41; ++number) {
    const bool reset = number == 8 || number == 9 || number == 13 || number == 14;
    EXPECT_EQ(reset ? "" : kUntouched, infos[number]) << number;
  }
}

TEST(ZORClashParsing, FullInfosWithoutProductsLeaveBothDescriptionsEmpty) {
  LoadedReader reader("<ClashElement><ClashResult><Interference/></ClashResult></ClashElement>");
  const ClashInfos infos = ClashInfos().Read(*reader, "1.2", 1);
  for (int number : {8, 9, 13, 14}) EXPECT_EQ("", infos[number]) << number;
  for (int number : {10, 11, 15, 16, 17, 18, 19, 20, 21, 22})
    EXPECT_EQ(kUntouched, infos[number]) << number;
}

// Outputs of the call before do not make the first product look like a second one.
TEST(ZORClashParsing, FullInfosReadTwiceIntoTheSameOutputsGiveTheSame) {
  LoadedReader reader(
      "<ClashElement><ClashResult><Interference><Product DescriptionID=\"a\"/>"
      "<Product DescriptionID=\"b\" Alien=\"NO\"/></Interference></ClashResult></ClashElement>");
  ClashInfos infos;
  for (int call = 0; call < 2; ++call) {
    infos.Read(*reader, "1.2", 1);
    EXPECT_EQ("a", infos[8]);
    EXPECT_EQ("b", infos[9]);
    EXPECT_EQ("YES", infos[13]);
    EXPECT_EQ("NO", infos[14]);
  }
}

// ---- GetClashInfos, full form, of other kinds of document

TEST(ZORClashParsing, FullInfosOfASingleInterferenceIgnoreIndexAndVersion) {
  LoadedReader reader(
      "<InterferenceElement> <Other/><Interference DistanceClearance=\"1,5\"/>"
      "<Interference DistanceClearance=\"2\"/></InterferenceElement>");
  for (int index : {-1, 0, 1, 2})
    for (const char* version : {"1.2", "1.1", ""})
      EXPECT_EQ("1.5", ClashInfos("").Read(*reader, version, index)[2]);
}

TEST(ZORClashParsing, FullInfosOfASingleInterferenceEmptyTheResultName) {
  LoadedReader reader("<InterferenceElement><Interference/></InterferenceElement>");
  EXPECT_EQ("", Text(ClashInfos().Read(*reader, "1.2", 1).resultName));
  EXPECT_EQ(kUntouched, ClashInfos().Read(*reader, "1.2", 1)[4]);
}

TEST(ZORClashParsing, FullInfosOfASingleInterferenceTakeTheRulesClearance) {
  LoadedReader reader(
      "<InterferenceElement><Interference DistanceClearance=\"1\"><ViolatedRule Clearance=\"2\"/>"
      "</Interference></InterferenceElement>");
  EXPECT_EQ("2", ClashInfos().Read(*reader, "1.1", 5)[2]);
}

TEST(ZORClashParsing, FullInfosOfOtherKindsReadAnInterferenceUnderTheRoot) {
  LoadedReader federator(
      "<FederatorClashElement><Interference DistanceClearance=\"1\"/></FederatorClashElement>");
  EXPECT_EQ("1", ClashInfos("").Read(*federator, "", 9)[2]);
  LoadedReader unknown("<Drawing><Interference DistanceClearance=\"2\"/></Drawing>");
  EXPECT_EQ("2", ClashInfos("").Read(*unknown, "", 9)[2]);
}

TEST(ZORClashParsing, FullInfosOfOtherKindsWithoutInterferenceOnlyResetFive) {
  LoadedReader reader(
      "<InterferenceElement><ClashResult Name=\"n\"><Interference/></ClashResult>"
      "</InterferenceElement>");
  ClashInfos infos;
  infos.Read(*reader, "1.2", 1);
  EXPECT_EQ("", Text(infos.resultName));
  for (int number = 1; number <= 41; ++number) {
    const bool reset = number == 8 || number == 9 || number == 13 || number == 14;
    EXPECT_EQ(reset ? "" : kUntouched, infos[number]) << number;
  }
}

}  // namespace
