#include "toolkit/records/InterferenceRecord.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/ScopedVariable.h"

namespace {

using namespace ZORToolkit;
using testing::HasSubstr;

std::string InOneSet(const std::string& inInterferences) {
  return "<ClashElement Version='1.2'><ClashResult Name='set' ComputationCase='case'>" +
         inInterferences + "</ClashResult></ClashElement>";
}

InterferenceRecord RecordOf(const std::string& inText) {
  ClashDocument document("test.xml", inText);
  return ReadInterference(document, 1);
}
InterferenceRecord RecordOfProducts(const std::string& inProducts) {
  return RecordOf(InOneSet("<Interference>" + inProducts + "</Interference>"));
}

constexpr char kMatrix[] =
    "<Matrix><Point Ux='1' Uy='2' Uz='3'/>"
    "<Vector CorrespondingData='Rx' Vx='0' Vy='1' Vz='0'/>"
    "<Vector CorrespondingData='Ry' Vx='-1' Vy='0' Vz='0'/>"
    "<Vector CorrespondingData='Rz' Vx='0' Vy='0' Vz='1'/></Matrix>";

TEST(Number, TextIsKeptAsItIs) {
  EXPECT_EQ("1,50", Number(std::string("1,50")).text);
  EXPECT_EQ("about 3", Number(std::string("about 3")).text);
}

TEST(Number, ValueIsReadWithPointOrComma) {
  EXPECT_EQ(1.5, Number(std::string("1.5")).value);
  EXPECT_EQ(1.5, Number(std::string("1,5")).value);
  EXPECT_EQ(-30, Number(std::string("-3e1")).value);
}

TEST(Number, TextThatIsNoFiniteNumberHasNoValue) {
  for (const char* const text : {"", "x", "nan", "inf", "1e999"})
    EXPECT_EQ(std::nullopt, Number(std::string(text)).value) << text;
}

TEST(Number, TextOfAValueReadsBackAsTheSame) {
  EXPECT_EQ("0.1", Number(0.1).text);
  EXPECT_EQ(0.1, Number(std::string(Number(0.1).text)).value);
}

TEST(InterferenceRecord, NumbersHaveTextAndValue) {
  const InterferenceRecord record = RecordOf(
      InOneSet("<Interference Value='-2,5' DistanceClearance='1,25'><GeometricAspect "
               "IntersectCurveLength='7' ExtractOrDistValue='8,5'><Point Ux='1,5' Uy='2' Uz='x'/>"
               "</GeometricAspect></Interference>"));
  EXPECT_EQ("-2,5", record.value.text);
  EXPECT_EQ(-2.5, record.value.value);
  EXPECT_EQ("1.25", record.clearance.text);
  EXPECT_EQ(8.5, record.distance.value);
  ASSERT_EQ(1u, record.points.size());
  EXPECT_EQ(1.5, record.points[0][0].value);
  EXPECT_EQ(std::nullopt, record.points[0][2].value);
}

TEST(InterferenceRecord, OfThreeProductsTheFirstAndTheLastCount) {
  const InterferenceRecord record = RecordOfProducts(
      "<Product DescriptionID='a' Alias='A' Preview='1.jpg'/><Product DescriptionID='b' Alias='B' "
      "Preview='2.jpg'/><Product DescriptionID='c' Alias='C' ShapeName='s' Preview='3.jpg'>" +
      std::string(kMatrix) + "</Product>");
  EXPECT_EQ("a", record.products[0].id);
  EXPECT_EQ("1.jpg", record.products[0].preview);
  EXPECT_EQ("c", record.products[1].id);
  EXPECT_EQ("C", record.products[1].alias);
  EXPECT_EQ("C -- s", record.products[1].label);
  EXPECT_EQ("3.jpg", record.products[1].preview);
  EXPECT_EQ(3, record.products[1].placement[11]);
}

TEST(InterferenceRecord, WithoutProductsThereAreNone) {
  const InterferenceRecord record = RecordOfProducts("");
  EXPECT_FALSE(record.products[0].exists);
  EXPECT_FALSE(record.products[1].exists);
  EXPECT_TRUE(record.products[0].element.IsEmpty());
  EXPECT_FALSE(record.element.IsEmpty());
}

TEST(InterferenceRecord, LabelsOfASingleInterferenceAreThoseOfOneInASet) {
  for (const char* const alias : {"a", "a --++-- b", "a --++--  --++-- c", " --++-- b", "a&#10;b",
                                  "", "a --++-- ", "日本 --++-- 語"}) {
    const std::string interference = "<Interference><Product Alias='" + std::string(alias) +
                                     "' ShapeName='s'/><Product Alias='z'/></Interference>";
    const InterferenceRecord single =
        RecordOf("<InterferenceElement>" + interference + "</InterferenceElement>");
    EXPECT_EQ(RecordOf(InOneSet(interference)).products[0].label, single.products[0].label)
        << alias;
    EXPECT_EQ("z -- ", single.products[1].label);
  }
}

TEST(InterferenceRecord, PlacementIsAsTheReaderTakesIt) {
  const InterferenceRecord record =
      RecordOfProducts("<Product>" + std::string(kMatrix) + "</Product>");
  EXPECT_EQ((Placement{0, 1, 0, -1, 0, 0, 0, 0, 1, 1, 2, 3}), record.products[0].placement);
  EXPECT_EQ("", record.products[0].whyMisread);
}

TEST(InterferenceRecord, ProductWithoutMatrixHasAPlacementOfZeros) {
  const ProductRecord product = RecordOfProducts("<Product Alias='a'/>").products[0];
  EXPECT_EQ(Placement{}, product.placement);
  EXPECT_EQ("the result has no matrix of it", product.whyMisread);
}

TEST(InterferenceRecord, DecimalCommaInAMatrixIsReported) {
  std::string matrix = kMatrix;
  matrix.replace(matrix.find("Uy='2'"), 6, "Uy='2,5'");
  const ProductRecord product = RecordOfProducts("<Product>" + matrix + "</Product>").products[0];
  EXPECT_EQ("its numbers are cut at a decimal comma", product.whyMisread);
  EXPECT_EQ(2, product.placement[10]);
}

TEST(InterferenceRecord, MissingNumberOfAMatrixIsReported) {
  std::string matrix = kMatrix;
  matrix.replace(matrix.find("Uy='2'"), 6, "");
  const ProductRecord product = RecordOfProducts("<Product>" + matrix + "</Product>").products[0];
  EXPECT_EQ("a number of its matrix is missing", product.whyMisread);
  EXPECT_EQ(-1, product.placement[10]);
}

TEST(InterferenceRecord, ARuleGoesBeforeTheInterferencesOwnClearance) {
  const InterferenceRecord record = RecordOf(
      InOneSet("<Interference DistanceClearance='1'><ViolatedRule Clearance='2,5' TypeCalc='t'/>"
               "</Interference>"));
  EXPECT_EQ(2.5, record.clearance.value);
  EXPECT_EQ("t", record.computationCase);
  EXPECT_EQ("set", record.result);
}

TEST(InterferenceRecord, ResultTypeIsUnderstoodInAnyLanguageAndKeptAsWritten) {
  for (const char* const word :
       {"Clearance", "Jeu", "Abstand", "Gioco", "Holgura", "クリアランス"}) {
    const InterferenceRecord record =
        RecordOf(InOneSet("<Interference ResultType='" + std::string(word) + "'/>"));
    EXPECT_EQ("Clearance", record.type);
    EXPECT_EQ(word, record.typeAsWritten);
  }
}

TEST(InterferenceRecord, RowLeavesTheRestEmpty) {
  ClashDocument document(
      "test.xml", InOneSet("<Interference Value='3'><Product Alias='a' Preview='p'/>"
                           "<Picture HRef='x'/><GeometricAspect><Point Ux='1' Uy='2' Uz='3'/>"
                           "</GeometricAspect></Interference>"));
  int visited = 0;
  ForEachInterference(document, RecordPart::kRow, [&](const InterferenceRecord& inRecord) {
    ++visited;
    EXPECT_EQ(3, inRecord.value.value);
    EXPECT_EQ("a", inRecord.products[0].alias);
    EXPECT_EQ("", inRecord.products[0].preview + inRecord.picture);
    EXPECT_TRUE(inRecord.points.empty());
  });
  EXPECT_EQ(1, visited);
}

TEST(InterferenceRecord, OfSeveralPicturesTheFirstCounts) {
  EXPECT_EQ("1", RecordOfProducts("<Picture HRef='1'/><Picture HRef='2'/>").picture);
  EXPECT_EQ("", RecordOfProducts("<Picture/><Picture HRef='2'/>").picture);
}

TEST(InterferenceRecord, NumberThatThereIsNotIsRefused) {
  ClashDocument document("test.xml", InOneSet("<Interference/>"));
  for (const long long number : {0LL, -1LL, 2LL, 1LL << 40}) {
    try {
      ReadInterference(document, number);
      ADD_FAILURE() << number;
    } catch (const Error& error) {
      EXPECT_THAT(error.what(), HasSubstr("the document has 1 interference"));
    }
  }
}

TEST(InterferenceRecord, DocumentOfAnotherKindIsRefused) {
  ClashDocument document("test.xml", "<Components/>");
  EXPECT_THROW(CountInterferences(document), Error);
}

TEST(Projection, OrthographicIsNamedInSixLanguages) {
  for (const char* const word : {"Cylindric", "Cylindrique", "Zylindrisch", "Cilindrica",
                                 "Cilíndrica", "円筒", "CYLINDRIC", " cylindric ", "Parallel"})
    EXPECT_EQ(Projection::kOrthographic, ProjectionNamed(word)) << word;
}

TEST(Projection, PerspectiveIsNamedInSixLanguages) {
  for (const char* const word : {"Conic", "Conique", "Konisch", "Conica", "Cónica", "円錐"})
    EXPECT_EQ(Projection::kPerspective, ProjectionNamed(word)) << word;
}

TEST(Projection, UnknownWordIsPerspective) {
  for (const char* const word : {"", " ", "otherwise"})
    EXPECT_EQ(Projection::kPerspective, ProjectionNamed(word));
}

}  // namespace
