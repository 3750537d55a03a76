// The 41 texts of one interference.
#include <gtest/gtest.h>

#include <array>
#include <string>
#include <tuple>

#include "support/LoadedReader.h"
#include "support/PlatformFolder.h"
#include "support/ScopedVariable.h"

namespace {

using support::ClashInfos;
using support::kUntouched;
using support::PlatformFolder;
using support::ScopedVariable;
using support::SharedReader;
using support::Text;

// Reads an interference given as text; every output but the first Alien flag was kUntouched.
ClashInfos Read(const std::string& inInterference) {
  SharedReader reader(inInterference);
  ClashInfos infos;
  infos.Set(13, "");
  infos.ReadElement(*reader, reader.root);
  return infos;
}

std::string ResultTypeOf(const std::string& inAttributes) {
  return Read("<Interference " + inAttributes + "/>")[1];
}
std::string StatusOf(const std::string& inStatus) {
  return Read("<Interference Status=\"" + inStatus + "\"/>")[3];
}
std::string RetrieveOf(const std::string& inRetrieve) {
  return Read("<Interference RetrieveInf=\"" + inRetrieve + "\"/>")[5];
}

// What is read into one string that is given for two outputs.
std::string ReadIntoOne(int inNumber, int inOther, const char* inFirstAlien) {
  SharedReader reader(
      "<Interference><Product DescriptionID='Id' Alien='Alien' ShapeSource='Source' Alias='Alias' "
      "ProcessMode='KORVAPDM' ShapeName='Shape'/></Interference>");
  std::array<ZORUnicodeString, 41> texts;
  texts[12] = inFirstAlien;
  std::array<ZORUnicodeString*, 41> outputs;
  for (std::size_t i = 0; i < texts.size(); ++i) outputs[i] = &texts[i];
  outputs[static_cast<std::size_t>(inOther) - 1] = outputs[static_cast<std::size_t>(inNumber) - 1];
  std::apply([&](auto*... outTexts) { reader->GetInterferenceDataV12(reader.root, *outTexts...); },
             outputs);
  return Text(*outputs[static_cast<std::size_t>(inNumber) - 1]);
}

// ---- Order of the outputs, which shows where a host gives one string twice

TEST(InterferenceData, FirstProductIsFilledInItsOrder) {
  EXPECT_EQ("Alien", ReadIntoOne(8, 13, ""));
  EXPECT_EQ("Source", ReadIntoOne(13, 21, ""));
  EXPECT_EQ("Id", ReadIntoOne(21, 15, ""));
  EXPECT_EQ("Alias", ReadIntoOne(15, 17, ""));
  EXPECT_EQ("KORVAPDM", ReadIntoOne(17, 10, ""));
  EXPECT_EQ("Shape", ReadIntoOne(10, 19, ""));
}

TEST(InterferenceData, SecondProductIsFilledInItsOrder) {
  EXPECT_EQ("Alien", ReadIntoOne(9, 14, "known"));
  EXPECT_EQ("Source", ReadIntoOne(14, 22, "known"));
  EXPECT_EQ("Id", ReadIntoOne(22, 16, "known"));
  EXPECT_EQ("Alias", ReadIntoOne(16, 18, "known"));
  EXPECT_EQ("KORVAPDM", ReadIntoOne(18, 11, "known"));
  EXPECT_EQ("Shape", ReadIntoOne(11, 20, "known"));
}

// ---- Result type

TEST(InterferenceData, NeutralResultTypeWins) {
  EXPECT_EQ("Contact", ResultTypeOf("ResultTypeNoNLS=\"Contact\" ResultType=\"Kollision\""));
}

TEST(InterferenceData, NeutralResultTypeStandsAsItIs) {
  EXPECT_EQ(" anything ", ResultTypeOf("ResultTypeNoNLS=\" anything \" ResultType=\"Clash\""));
}

TEST(InterferenceData, NeutralResultTypeThatIsEmptyStillWins) {
  EXPECT_EQ("", ResultTypeOf("ResultTypeNoNLS=\"\" ResultType=\"Clash\""));
}

TEST(InterferenceData, ResultTypeOfEveryLanguageIsRecognised) {
  for (const char* language : {"en", "fr", "de", "ja"}) {
    const ScopedVariable user("ZOR_LANG", language);
    for (const char* word : {"Clash", "Collision", "Kollision"})
      EXPECT_EQ("Clash", ResultTypeOf("ResultType=\"" + std::string(word) + "\"")) << word;
    for (const char* word : {"Contact", "Kontakt"})
      EXPECT_EQ("Contact", ResultTypeOf("ResultType=\"" + std::string(word) + "\"")) << word;
    for (const char* word : {"Clearance", "Jeu", "Abstand"})
      EXPECT_EQ("Clearance", ResultTypeOf("ResultType=\"" + std::string(word) + "\"")) << word;
  }
}

TEST(InterferenceData, ResultTypeIsStrippedOfSpaces) {
  EXPECT_EQ("Clash", ResultTypeOf("ResultType=\"  Clash \""));
}

TEST(InterferenceData, ResultTypeMayBePartOfTheListOfWords) {
  const PlatformFolder folder;
  folder.WriteCatalogue("ZORLyraITFClashDialog3",
                        "ClashAllLanguages = \"Alpha Beta\"\nContactAllLanguages = \"Gamma\"\n"
                        "ClearanceAllLanguages = \"Delta\"\n");
  EXPECT_EQ("Clash", ResultTypeOf("ResultType=\"pha Be\""));
  EXPECT_EQ("Contact", ResultTypeOf("ResultType=\"amm\""));
  EXPECT_EQ("Clearance", ResultTypeOf("ResultType=\"Delta\""));
  EXPECT_EQ("error", ResultTypeOf("ResultType=\"alpha\""));
}

TEST(InterferenceData, ResultTypeMayBeTheWordOfTheCurrentLanguageAlone) {
  const PlatformFolder folder;
  folder.WriteCatalogue("ZORLyraITFClashDialog3",
                        "ClashAllLanguages = \"x\"\nContactAllLanguages = \"x\"\n"
                        "ClearanceAllLanguages = \"x\"\n"
                        "Clash = \" Uno \"\nContact = \"Due\"\nClearance = \"Tre\"\n");
  EXPECT_EQ("Clash", ResultTypeOf("ResultType=\"Uno\""));
  EXPECT_EQ("Contact", ResultTypeOf("ResultType=\" Due\""));
  EXPECT_EQ("Clearance", ResultTypeOf("ResultType=\"Tre\""));
  EXPECT_EQ("error", ResultTypeOf("ResultType=\"Un\""));
}

TEST(InterferenceData, ResultTypeThatFitsSeveralIsTheFirstOfThem) {
  const PlatformFolder folder;
  folder.WriteCatalogue("ZORLyraITFClashDialog3",
                        "ClashAllLanguages = \"a\"\nContactAllLanguages = \"a b\"\n"
                        "ClearanceAllLanguages = \"a b c\"\nClearance = \"a\"\n");
  EXPECT_EQ("Clash", ResultTypeOf("ResultType=\"a\""));
  EXPECT_EQ("Contact", ResultTypeOf("ResultType=\"b\""));
  EXPECT_EQ("Clearance", ResultTypeOf("ResultType=\"c\""));
}

TEST(InterferenceData, ResultTypeOfAnUnknownWordIsError) {
  EXPECT_EQ("error", ResultTypeOf("ResultType=\"Penetration\""));
}

TEST(InterferenceData, ResultTypeThatIsMissingIsError) { EXPECT_EQ("error", ResultTypeOf("")); }

// ---- Status and age

TEST(InterferenceData, StatusWordsBecomeFixedOnes) {
  EXPECT_EQ("Relevant", StatusOf("Relevant"));
  EXPECT_EQ("Irrelevant", StatusOf("Irrelevant"));
  EXPECT_EQ("Not inspected", StatusOf("Not inspected"));
}

TEST(InterferenceData, StatusWordsOfTheUsersLanguageBecomeFixedOnes) {
  const ScopedVariable user("ZOR_LANG", "fr");
  EXPECT_EQ("Relevant", StatusOf("Pertinent"));
  EXPECT_EQ("Irrelevant", StatusOf("Non pertinent"));
  EXPECT_EQ("Not inspected", StatusOf("Non inspecté"));
}

TEST(InterferenceData, StatusWordOfAnotherLanguageIsError) {
  EXPECT_EQ("error", StatusOf("Pertinent"));
  const ScopedVariable user("ZOR_LANG", "fr");
  EXPECT_EQ("error", StatusOf("Relevant"));
}

TEST(InterferenceData, StatusIsReadInTheLanguageOfTheMoment) {
  EXPECT_EQ("Relevant", StatusOf("Relevant"));
  {
    const ScopedVariable user("ZOR_LANG", "fr");
    EXPECT_EQ("Relevant", StatusOf("Pertinent"));
  }
  EXPECT_EQ("Relevant", StatusOf("Relevant"));
}

TEST(InterferenceData, StatusIsStrippedOfSpaces) { EXPECT_EQ("Relevant", StatusOf("  Relevant ")); }

TEST(InterferenceData, StatusMustBeTheWholeWord) {
  EXPECT_EQ("error", StatusOf("elevant"));
  EXPECT_EQ("error", StatusOf("relevant"));
  EXPECT_EQ("error", StatusOf("NotInspected"));
}

TEST(InterferenceData, StatusThatIsMissingIsError) {
  EXPECT_EQ("error", Read("<Interference/>")[3]);
}

TEST(InterferenceData, StatusTextsOfTheCatalogueAreStripped) {
  const PlatformFolder folder;
  folder.WriteCatalogue("ZORLyraITFClashDialog3",
                        "Relevant = \" yes \"\nIrrelevant = \"no\"\nNotInspected = \"open\"\n"
                        "Old = \" before \"\nNew = \"now\"\n");
  EXPECT_EQ("Relevant", StatusOf("yes"));
  EXPECT_EQ("Irrelevant", StatusOf("no"));
  EXPECT_EQ("Not inspected", StatusOf("open"));
  EXPECT_EQ("Old", RetrieveOf("before"));
  EXPECT_EQ("New", RetrieveOf(" now"));
}

TEST(InterferenceData, RetrieveWordsBecomeFixedOnes) {
  EXPECT_EQ("Old", RetrieveOf("Old"));
  EXPECT_EQ("New", RetrieveOf(" New "));
}

TEST(InterferenceData, RetrieveWordsOfTheUsersLanguageBecomeFixedOnes) {
  const ScopedVariable user("ZOR_LANG", "fr");
  EXPECT_EQ("Old", RetrieveOf("Ancien"));
  EXPECT_EQ("New", RetrieveOf("Nouveau"));
}

TEST(InterferenceData, RetrieveWordThatIsUnknownStaysStripped) {
  EXPECT_EQ("Nouveau", RetrieveOf("  Nouveau "));
  EXPECT_EQ("old", RetrieveOf("old"));
  EXPECT_EQ("", RetrieveOf("   "));
}

TEST(InterferenceData, RetrieveThatIsMissingIsEmpty) { EXPECT_EQ("", Read("<Interference/>")[5]); }

// ---- Without the catalogue

TEST(InterferenceData, WithoutCatalogueNoWordIsKnown) {
  const PlatformFolder folder;
  folder.DamageCatalogue("ZORLyraITFClashDialog3");
  EXPECT_EQ("error", ResultTypeOf("ResultType=\"Clash\""));
  EXPECT_EQ("error", StatusOf("Relevant"));
  EXPECT_EQ("New", RetrieveOf(" New "));
}

// Every text of the catalogue is empty then, and an empty word equals the first of them.
TEST(InterferenceData, WithoutCatalogueEmptyWordsEqualTheFirstText) {
  const PlatformFolder folder;
  folder.DamageCatalogue("ZORLyraITFClashDialog3");
  EXPECT_EQ("Clash", ResultTypeOf(""));
  EXPECT_EQ("Clash", ResultTypeOf("ResultType=\"  \""));
  EXPECT_EQ("Relevant", StatusOf(""));
  EXPECT_EQ("Old", RetrieveOf(""));
}

TEST(InterferenceData, WithoutCatalogueTheNeutralResultTypeStands) {
  const PlatformFolder folder;
  folder.DamageCatalogue("ZORLyraITFClashDialog3");
  EXPECT_EQ("Contact", ResultTypeOf("ResultTypeNoNLS=\"Contact\""));
}

// ---- Clearance

TEST(InterferenceData, ClearanceHasItsCommaMadeAPoint) {
  EXPECT_EQ("1.5", Read("<Interference DistanceClearance=\"1,5\"/>")[2]);
  EXPECT_EQ("1.5", Read("<Interference DistanceClearance=\"1.5\"/>")[2]);
}

TEST(InterferenceData, ClearanceHasOnlyItsFirstCommaMadeAPoint) {
  EXPECT_EQ("1.2,3", Read("<Interference DistanceClearance=\"1,2,3\"/>")[2]);
}

TEST(InterferenceData, ClearanceThatIsMissingIsEmpty) { EXPECT_EQ("", Read("<Interference/>")[2]); }

// The rule replaces the clearance only where interferences are found by number.
TEST(InterferenceData, ClearanceOfAnElementInHandIsItsOwn) {
  const ClashInfos infos =
      Read("<Interference DistanceClearance=\"1\"><ViolatedRule Clearance=\"2\"/></Interference>");
  EXPECT_EQ("1", infos[2]);
  EXPECT_EQ("2", infos[7]);
}

// ---- An element without anything

TEST(InterferenceData, EmptyInterferenceResetsAFewAndLeavesTheRest) {
  const ClashInfos infos = Read("<Interference/>");
  for (int number = 1; number <= 41; ++number) {
    const std::string expected = number == 1 || number == 3     ? "error"
                                 : number == 32                 ? "NOVIEWPOINT"
                                 : number == 2 || number == 5   ? ""
                                 : number == 13 || number == 28 ? ""
                                                                : kUntouched;
    EXPECT_EQ(expected, infos[number]) << number;
  }
}

// ---- Rule and comment

TEST(InterferenceData, RuleFillsItsFiveOutputs) {
  const ClashInfos infos = Read(
      "<Interference><ViolatedRule Name=\"n, o\" Clearance=\"0,5\" TypeCalc=\"t,c\" "
      "Severity=\"s,1\""
      " PenetrationCandidate=\"p,2\"/></Interference>");
  EXPECT_EQ("t,c", infos[4]);
  EXPECT_EQ("n, o", infos[6]);
  EXPECT_EQ("0.5", infos[7]);
  EXPECT_EQ("s,1", infos[23]);
  EXPECT_EQ("p,2", infos[24]);
}

TEST(InterferenceData, RuleWithoutAttributesEmptiesItsOutputs) {
  const ClashInfos infos = Read("<Interference><ViolatedRule/></Interference>");
  for (int number : {4, 6, 7, 23, 24}) EXPECT_EQ("", infos[number]) << number;
}

TEST(InterferenceData, RuleThatComesLastWins) {
  const ClashInfos infos = Read(
      "<Interference><ViolatedRule Name=\"1\" Severity=\"high\"/><ViolatedRule Name=\"2\"/>"
      "</Interference>");
  EXPECT_EQ("2", infos[6]);
  EXPECT_EQ("", infos[23]);
}

TEST(InterferenceData, CommentIsItsValueAsItStands) {
  EXPECT_EQ(" a, b ",
            Read("<Interference><Comment Value=\" a, b \">not this</Comment></Interference>")[12]);
}

TEST(InterferenceData, CommentThatComesLastWins) {
  EXPECT_EQ("2",
            Read("<Interference><Comment Value=\"1\"/><Comment Value=\"2\"/></Interference>")[12]);
  EXPECT_EQ("", Read("<Interference><Comment Value=\"1\"/><Comment/></Interference>")[12]);
}

TEST(InterferenceData, ElementsOfOtherNamesAreIgnored) {
  const ClashInfos infos = Read(
      "<Interference><Rule Name=\"r\"/><comment Value=\"c\"/><Box><Comment Value=\"deep\"/></Box>"
      "<Picture HRef=\"p\"/></Interference>");
  EXPECT_EQ(kUntouched, infos[6]);
  EXPECT_EQ(kUntouched, infos[12]);
}

TEST(InterferenceData, NameOfTheElementInHandDoesNotMatter) {
  EXPECT_EQ("1.5", Read("<Anything DistanceClearance=\"1,5\"/>")[2]);
}

TEST(InterferenceData, NullElementReadsAsAnEmptyOne) {
  ZORClashParsing reader(nullptr, 0);
  ClashInfos infos;
  infos.Set(13, "").ReadElement(reader, DOM_Node());
  EXPECT_EQ("error", infos[1]);
  EXPECT_EQ("NOVIEWPOINT", infos[32]);
  EXPECT_EQ(kUntouched, infos[8]);
}

// ---- Products

constexpr const char* kTwoProducts =
    "<Interference>"
    "<Product DescriptionID=\"r --++-- a\" Alias=\"alias a\" Alien=\"NO\" ProcessMode=\"mode a\""
    " ShapeName=\"shape a\" ShapeSource=\"source a\" Preview=\"p\"/>"
    "<Product DescriptionID=\"r --++-- b\" Alias=\"alias b\" Alien=\"MAYBE\" ProcessMode=\"mode b\""
    " ShapeName=\"shape b\" ShapeSource=\"source b\"/></Interference>";

TEST(InterferenceData, FirstProductFillsItsSevenOutputs) {
  const ClashInfos infos = Read(kTwoProducts);
  EXPECT_EQ("r --++-- a", infos[8]);
  EXPECT_EQ("mode a", infos[10]);
  EXPECT_EQ("NO", infos[13]);
  EXPECT_EQ("r --++-- a", infos[15]);
  EXPECT_EQ("a", infos[17]);
  EXPECT_EQ("shape a", infos[19]);
  EXPECT_EQ("source a", infos[21]);
}

TEST(InterferenceData, SecondProductFillsItsSevenOutputs) {
  const ClashInfos infos = Read(kTwoProducts);
  EXPECT_EQ("r --++-- b", infos[9]);
  EXPECT_EQ("mode b", infos[11]);
  EXPECT_EQ("MAYBE", infos[14]);
  EXPECT_EQ("r --++-- b", infos[16]);
  EXPECT_EQ("b", infos[18]);
  EXPECT_EQ("shape b", infos[20]);
  EXPECT_EQ("source b", infos[22]);
}

TEST(InterferenceData, ProductWithoutAlienFlagIsAlien) {
  const ClashInfos infos = Read("<Interference><Product/><Product Alien=\"\"/></Interference>");
  EXPECT_EQ("YES", infos[13]);
  EXPECT_EQ("YES", infos[14]);
}

TEST(InterferenceData, ProductWithoutAnythingIsStillTheFirst) {
  const ClashInfos infos =
      Read("<Interference><Product/><Product DescriptionID=\"b\"/></Interference>");
  for (int number : {8, 10, 15, 17, 19, 21}) EXPECT_EQ("", infos[number]) << number;
  EXPECT_EQ("b", infos[9]);
}

TEST(InterferenceData, OneProductLeavesTheSecondOutputs) {
  const ClashInfos infos = Read("<Interference><Product DescriptionID=\"a\"/></Interference>");
  EXPECT_EQ("a", infos[8]);
  for (int number : {9, 11, 14, 16, 18, 20, 22}) EXPECT_EQ(kUntouched, infos[number]) << number;
}

TEST(InterferenceData, ThirdProductReplacesTheSecond) {
  const ClashInfos infos = Read(
      "<Interference><Product DescriptionID=\"a\"/><Product DescriptionID=\"b\" ShapeName=\"s\"/>"
      "<Product DescriptionID=\"c\"/></Interference>");
  EXPECT_EQ("a", infos[8]);
  EXPECT_EQ("c", infos[9]);
  EXPECT_EQ("", infos[20]);
}

TEST(InterferenceData, AlienFlagThatTheCallerFilledMakesEveryProductTheSecond) {
  SharedReader reader(kTwoProducts);
  ClashInfos infos;
  infos.ReadElement(*reader, reader.root);
  EXPECT_EQ(kUntouched, infos[8]);
  EXPECT_EQ(kUntouched, infos[13]);
  EXPECT_EQ("r --++-- b", infos[9]);
}

// ---- Instance names

std::string InstanceOf(const std::string& inAttributes) {
  return Read("<Interference><Product " + inAttributes + "/></Interference>")[17];
}

TEST(InterferenceData, InstanceIsTheLastSegmentOfTheDescription) {
  EXPECT_EQ("C", InstanceOf("DescriptionID=\"A --++-- B --++-- C\""));
}

TEST(InterferenceData, InstanceOfADescriptionWithoutSeparatorIsItself) {
  EXPECT_EQ("A", InstanceOf("DescriptionID=\"A\""));
  EXPECT_EQ("A --+-- B", InstanceOf("DescriptionID=\"A --+-- B\""));
  EXPECT_EQ("A--++--B", InstanceOf("DescriptionID=\"A--++--B\""));
}

TEST(InterferenceData, InstanceOfNoDescriptionIsEmpty) {
  EXPECT_EQ("", InstanceOf("Alias=\"a\""));
  EXPECT_EQ("", InstanceOf("DescriptionID=\" --++-- \""));
}

TEST(InterferenceData, InstanceOfADescriptionThatEndsInASeparatorIsTheSegmentBefore) {
  EXPECT_EQ("A", InstanceOf("DescriptionID=\"A --++-- \""));
}

// Two separators share no character, so the rest of the second stays with its segment.
TEST(InterferenceData, InstanceKeepsASeparatorThatIsCutShort) {
  EXPECT_EQ("--++-- B", InstanceOf("DescriptionID=\"A --++-- --++-- B\""));
}

TEST(InterferenceData, InstanceSkipsEmptySegments) {
  EXPECT_EQ("B", InstanceOf("DescriptionID=\"A --++--  --++-- B\""));
  EXPECT_EQ("B", InstanceOf("DescriptionID=\" --++-- B\""));
}

TEST(InterferenceData, InstanceStartsBehindALineFeed) {
  EXPECT_EQ("B", InstanceOf("DescriptionID=\"A&#10;B\""));
}

TEST(InterferenceData, InstanceKeepsItsSpaces) {
  EXPECT_EQ(" B ", InstanceOf("DescriptionID=\"A --++--  B \""));
}

TEST(InterferenceData, InstanceKeepsCharactersOutsideTheBasicPlane) {
  EXPECT_EQ("螺栓 🔩", InstanceOf("DescriptionID=\"機械 --++-- 螺栓 🔩\""));
}

TEST(InterferenceData, InstanceOfAManagedProductIsItsAlias) {
  EXPECT_EQ(
      "x --++-- y",
      InstanceOf("ProcessMode=\"KORVAPDM\" DescriptionID=\"A --++-- B\" Alias=\"x --++-- y\""));
  EXPECT_EQ("", InstanceOf("ProcessMode=\"KORVAPDM\" DescriptionID=\"A\""));
}

TEST(InterferenceData, InstanceOfAnotherProcessModeIsOfTheDescription) {
  EXPECT_EQ("A", InstanceOf("ProcessMode=\"korvapdm\" DescriptionID=\"A\" Alias=\"x\""));
  EXPECT_EQ("A", InstanceOf("ProcessMode=\" KORVAPDM\" DescriptionID=\"A\" Alias=\"x\""));
}

TEST(InterferenceData, InstanceOfASecondManagedProductIsItsAlias) {
  EXPECT_EQ("b", Read("<Interference><Product DescriptionID=\"a\"/>"
                      "<Product ProcessMode=\"KORVAPDM\" Alias=\"b\" DescriptionID=\"c\"/>"
                      "</Interference>")[18]);
}

TEST(InterferenceData, InstanceOfManySegmentsIsFoundQuickly) {
  std::string description;
  for (int i = 0; i < 100'000; ++i) description += "s --++-- ";
  EXPECT_EQ("last", InstanceOf("DescriptionID=\"" + description + "last\""));
}

// ---- Geometry

TEST(InterferenceData, GeometryHasItsCommasMadePoints) {
  const ClashInfos infos = Read(
      "<Interference><GeometricAspect IntersectCurveLength=\"1,5\" ExtractOrDistValue=\"-0,25\"/>"
      "</Interference>");
  EXPECT_EQ("1.5", infos[25]);
  EXPECT_EQ("-0.25", infos[26]);
}

TEST(InterferenceData, GeometryEmptiesTheReservedOutput) {
  EXPECT_EQ("", Read("<Interference><GeometricAspect/></Interference>")[27]);
  EXPECT_EQ(kUntouched, Read("<Interference/>")[27]);
}

TEST(InterferenceData, GeometryWithoutAttributesEmptiesItsOutputs) {
  const ClashInfos infos = Read("<Interference><GeometricAspect/></Interference>");
  EXPECT_EQ("", infos[25]);
  EXPECT_EQ("", infos[26]);
  EXPECT_EQ("", infos[28]);
  EXPECT_EQ("NOVIEWPOINT", infos[32]);
}

TEST(InterferenceData, PointsAreJoinedBySlashes) {
  EXPECT_EQ("1/2.5/-3/4.5,6/0/0",
            Read("<Interference><GeometricAspect><Point Ux=\"1\" Uy=\"2,5\" Uz=\"-3\"/> <Other/>"
                 "<Point Ux=\"4,5,6\" Uy=\"0\" Uz=\"0\"/></GeometricAspect></Interference>")[28]);
}

TEST(InterferenceData, PointWithoutCoordinatesKeepsItsSlashes) {
  EXPECT_EQ("//",
            Read("<Interference><GeometricAspect><Point/></GeometricAspect></Interference>")[28]);
  EXPECT_EQ("//3///", Read("<Interference><GeometricAspect><Point Uz=\"3\"/><Point/>"
                           "</GeometricAspect></Interference>")[28]);
}

TEST(InterferenceData, PointsOfASecondGeometryFollow) {
  const ClashInfos infos = Read(
      "<Interference><GeometricAspect IntersectCurveLength=\"1\"><Point Ux=\"1\" Uy=\"2\" "
      "Uz=\"3\"/>"
      "</GeometricAspect><GeometricAspect><Point Ux=\"4\" Uy=\"5\" Uz=\"6\"/></GeometricAspect>"
      "</Interference>");
  EXPECT_EQ("1/2/3/4/5/6", infos[28]);
  EXPECT_EQ("", infos[25]);
}

TEST(InterferenceData, PointsOutsideTheGeometryAreNotRead) {
  EXPECT_EQ("", Read("<Interference><Point Ux=\"1\" Uy=\"2\" Uz=\"3\"/></Interference>")[28]);
}

// ---- Viewpoint

std::string WithViewpoint(const std::string& inAttributes, const std::string& inChildren) {
  return "<Interference><GeometricAspect><Viewpoint " + inAttributes + ">" + inChildren +
         "</Viewpoint></GeometricAspect></Interference>";
}

TEST(InterferenceData, ViewpointHasItsCommasMadePointsButForTheFocusDistance) {
  const ClashInfos infos = Read(WithViewpoint(
      "FocusDistance=\"2,5\" NearPlane=\"0,1\" FarPlane=\"1,2,3\" ProjectionType=\"a,b,c\"", ""));
  EXPECT_EQ("2,5", infos[29]);
  EXPECT_EQ("0.1", infos[30]);
  EXPECT_EQ("1.2,3", infos[31]);
  EXPECT_EQ("a.b,c", infos[32]);
}

TEST(InterferenceData, ViewpointWithoutProjectionEmptiesIt) {
  EXPECT_EQ("", Read(WithViewpoint("", ""))[32]);
}

TEST(InterferenceData, ViewpointWithoutAttributesEmptiesItsFourOutputs) {
  const ClashInfos infos = Read(WithViewpoint("", ""));
  for (int number : {29, 30, 31, 32}) EXPECT_EQ("", infos[number]) << number;
  for (int number = 33; number <= 41; ++number) EXPECT_EQ(kUntouched, infos[number]) << number;
}

TEST(InterferenceData, ViewpointPointIsItsOwnAndNotOneOfTheGeometry) {
  const ClashInfos infos = Read(WithViewpoint("", "<Point Ux=\"1,5\" Uy=\"2\" Uz=\"3,0,0\"/>"));
  EXPECT_EQ("1.5", infos[33]);
  EXPECT_EQ("2", infos[34]);
  EXPECT_EQ("3.0,0", infos[35]);
  EXPECT_EQ("", infos[28]);
}

TEST(InterferenceData, SightVectorIsRead) {
  const ClashInfos infos = Read(
      WithViewpoint("", "<Vector CorrespondingData=\"Sight\" Vx=\"-0,5\" Vy=\"0\" Vz=\"1,\"/>"));
  EXPECT_EQ("-0.5", infos[36]);
  EXPECT_EQ("0", infos[37]);
  EXPECT_EQ("1.", infos[38]);
}

TEST(InterferenceData, SecondVectorIsNeverRead) {
  const ClashInfos infos = Read(WithViewpoint(
      "",
      "<Vector CorrespondingData=\"Sight\" Vx=\"1\" Vy=\"2\" Vz=\"3\"/>"
      "<Vector CorrespondingData=\"Up\" Vx=\"4\" Vy=\"5\" Vz=\"6\"/>"
      "<Vector CorrespondingData=\"sight\" Vx=\"7\" Vy=\"8\" Vz=\"9\"/><Vector Vx=\"0\"/>"));
  EXPECT_EQ("1", infos[36]);
  EXPECT_EQ("2", infos[37]);
  EXPECT_EQ("3", infos[38]);
  for (int number : {39, 40, 41}) EXPECT_EQ(kUntouched, infos[number]) << number;
}

TEST(InterferenceData, SightVectorThatComesLastWins) {
  const ClashInfos infos =
      Read(WithViewpoint("",
                         "<Vector CorrespondingData=\"Sight\" Vx=\"1\" Vy=\"2\" Vz=\"3\"/>"
                         "<Vector CorrespondingData=\"Sight\" Vx=\"4\"/>"));
  EXPECT_EQ("4", infos[36]);
  EXPECT_EQ("", infos[37]);
  EXPECT_EQ("", infos[38]);
  EXPECT_EQ(kUntouched, infos[39]);
}

TEST(InterferenceData, ViewpointOutsideTheGeometryIsNotRead) {
  EXPECT_EQ("NOVIEWPOINT",
            Read("<Interference><Viewpoint ProjectionType=\"Conic\"/></Interference>")[32]);
}

TEST(InterferenceData, OutputsOfAnEarlierReadingAreResetWhereTheyMustBe) {
  SharedReader reader(
      "<Box><Interference><GeometricAspect><Point Ux=\"1\" Uy=\"2\" Uz=\"3\"/>"
      "<Viewpoint "
      "ProjectionType=\"Conic\"/></GeometricAspect></Interference><Interference/></Box>");
  ClashInfos infos("");
  infos.ReadElement(*reader, reader.root.getFirstChild());
  EXPECT_EQ("1/2/3", infos[28]);
  EXPECT_EQ("Conic", infos[32]);
  infos.ReadElement(*reader, reader.root.getLastChild());
  EXPECT_EQ("", infos[28]);
  EXPECT_EQ("NOVIEWPOINT", infos[32]);
}

}  // namespace
