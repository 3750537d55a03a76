#include "platform/knowledge/ZORParmDictionary.h"

#include <gtest/gtest.h>

#include <clocale>
#include <cmath>
#include <optional>
#include <string>

namespace {

constexpr double kPi = 3.14159265358979323846;

// The value that a magnitude's unit reads; nothing when it refuses. A refusal leaves the output.
std::optional<double> Decoded(const char* inMagnitude, const char* inText) {
  const ZORICkeMagnitude_var magnitude = ZORParmDictionary::FindMagnitude(inMagnitude);
  if (magnitude.IsNull()) ADD_FAILURE() << "no magnitude " << inMagnitude;
  double value = -77;
  if (magnitude->Unit()->Decode(inText, value) != ZORCke::False) return value;
  EXPECT_EQ(value, -77) << inText;
  return std::nullopt;
}

std::optional<double> Length(const char* inText) { return Decoded("LENGTH", inText); }

unsigned int ReferencesOf(ZORBaseUnknown* inComponent) {
  inComponent->AddRef();
  return inComponent->Release();
}

}  // namespace

TEST(ZORParmDictionary, FindMagnitudeKnowsSixExactly) {
  for (const char* const name : {"LENGTH", "ANGLE", "MASS", "TIME", "AREA", "VOLUME"}) {
    const ZORICkeMagnitude_var magnitude = ZORParmDictionary::FindMagnitude(name);
    ASSERT_FALSE(magnitude.IsNull()) << name;
    EXPECT_TRUE(magnitude->Name() == name);
    EXPECT_FALSE(magnitude->Unit().IsNull());
  }
}

TEST(ZORParmDictionary, FindMagnitudeOfAnotherIsEmpty) {
  EXPECT_TRUE(ZORParmDictionary::FindMagnitude("Length").IsNull());
  EXPECT_TRUE(ZORParmDictionary::FindMagnitude("FORCE").IsNull());
  EXPECT_TRUE(ZORParmDictionary::FindMagnitude("").IsNull());
}

TEST(ZORParmDictionary, HandlesAreCounted) {
  const ZORICkeMagnitude_var magnitude = ZORParmDictionary::FindMagnitude("LENGTH");
  const unsigned int before = ReferencesOf(magnitude.GetInterface());
  const unsigned int unitBefore = ReferencesOf(magnitude->Unit().GetInterface());
  {
    const ZORICkeMagnitude_var again = ZORParmDictionary::FindMagnitude("LENGTH");
    EXPECT_TRUE(again == magnitude) << "there is one dictionary";
    const ZORICkeUnit_var unit = again->Unit();
    EXPECT_EQ(ReferencesOf(magnitude.GetInterface()), before + 1);
    EXPECT_EQ(ReferencesOf(unit.GetInterface()), unitBefore);
  }
  EXPECT_EQ(ReferencesOf(magnitude.GetInterface()), before);
}

TEST(ZORParmDictionary, ComponentsAnswerTheirInterfaces) {
  const ZORBaseUnknown_var magnitude(ZORParmDictionary::FindMagnitude("MASS"));
  EXPECT_FALSE(magnitude.IsNull());
  EXPECT_FALSE(ZORICkeMagnitude_var(magnitude).IsNull());
  EXPECT_TRUE(ZORICkeUnit_var(magnitude).IsNull());
  void* found = nullptr;
  EXPECT_EQ(magnitude->QueryInterface("ZORICkeMagnitude", &found), S_OK);
  magnitude->Release();
  EXPECT_EQ(magnitude->QueryInterface("ZORICkeUnit", &found), E_NOINTERFACE);
}

TEST(ZORParmDictionary, EmptyMagnitudeRaisesOnCalls) {
  EXPECT_THROW(ZORParmDictionary::FindMagnitude("FORCE")->Unit(), ZORNullVarError);
}

TEST(ZORICkeUnit, DecodeGivesLengthsInMetres) {
  EXPECT_EQ(Length("0.5m"), 0.5);
  EXPECT_EQ(Length("25 mm"), 0.025);
  EXPECT_EQ(Length("12.5mm"), 0.0125);
  EXPECT_EQ(Length("3 cm"), 0.03);
  EXPECT_EQ(Length("2km"), 2000.0);
  EXPECT_NEAR(*Length("1 inch"), 0.0254, 1e-15);
  EXPECT_NEAR(*Length("1in"), 0.0254, 1e-15);
  EXPECT_NEAR(*Length("1 ft"), 0.3048, 1e-15);
  EXPECT_EQ(Length("7 micrometer"), 7e-6);
  EXPECT_EQ(Length("7\xC2\xB5m"), 7e-6);
}

TEST(ZORICkeUnit, DecodeReadsEveryPlainNumber) {
  EXPECT_EQ(Length("-3m"), -3.0);
  EXPECT_EQ(Length("+3m"), 3.0);
  EXPECT_EQ(Length(".5m"), 0.5);
  EXPECT_EQ(Length("5.m"), 5.0);
  EXPECT_EQ(Length("1e3mm"), 1.0);
  EXPECT_EQ(Length("1.5E-3 m"), 0.0015);
  EXPECT_EQ(Length("0mm"), 0.0);
}

TEST(ZORICkeUnit, DecodeToleratesBlanks) {
  EXPECT_EQ(Length("  25 mm\t"), 0.025);
  EXPECT_EQ(Length("25   mm"), 0.025);
  EXPECT_EQ(Length("25\xC2\xA0mm"), 0.025);
  EXPECT_EQ(Length("25\xE2\x80\xAFmm"), 0.025);
}

TEST(ZORICkeUnit, DecodeRefusesNumbersWithoutUnit) {
  for (const char* const text : {"12.5", "0", "-1", "1e3", "12.5 ", "5%"})
    EXPECT_EQ(Length(text), std::nullopt) << text;
}

TEST(ZORICkeUnit, DecodeRefusesUnitsWithoutNumber) {
  for (const char* const text : {"", " ", "mm", " mm", "-mm", "+ 5mm", "+-5mm", "--5mm", ".mm"})
    EXPECT_EQ(Length(text), std::nullopt) << text;
}

TEST(ZORICkeUnit, DecodeRefusesDecimalCommas) {
  EXPECT_EQ(Length("1,5mm"), std::nullopt);
  EXPECT_EQ(Length("1,000 mm"), std::nullopt);
}

TEST(ZORICkeUnit, DecodeRefusesUnitsOfOtherMagnitudes) {
  for (const char* const text : {"3kg", "3s", "3m2", "3 mm^3", "3 m-1", "3 1/m", "3 rad", "3 K"})
    EXPECT_EQ(Length(text), std::nullopt) << text;
}

TEST(ZORICkeUnit, DecodeRefusesWhatIsNoUnit) {
  for (const char* const text :
       {"3 furlongish", "3MM", "3 mm 4", "3 4mm", "3 mm*4", "3 mm.25", "3 m @ 5", "3 m from 2",
        "3 lg(re mm)", "3 mm mm", "3 (mm)", "3mm;", "3 mm\xFF", "3 *mm", "3 /mm", "3 mm/"})
    EXPECT_EQ(Length(text), std::nullopt) << text;
}

TEST(ZORICkeUnit, DecodeRefusesWhatIsNoFiniteNumber) {
  for (const char* const text :
       {"inf m", "nan m", "infinity m", "-inf m", "1e999 m", "1e308 km", "0x10 m"})
    EXPECT_EQ(Length(text), std::nullopt) << text;
}

TEST(ZORICkeUnit, DecodeKnowsTheOtherMagnitudes) {
  EXPECT_NEAR(*Decoded("ANGLE", "180 degree"), kPi, 1e-12);
  EXPECT_NEAR(*Decoded("ANGLE", "180\xC2\xB0"), kPi, 1e-12);
  EXPECT_EQ(Decoded("ANGLE", "2 rad"), 2.0);
  EXPECT_EQ(Decoded("MASS", "500 g"), 0.5);
  EXPECT_EQ(Decoded("MASS", "2 kg"), 2.0);
  EXPECT_EQ(Decoded("TIME", "2 min"), 120.0);
  EXPECT_EQ(Decoded("AREA", "3 m2"), 3.0);
  EXPECT_NEAR(*Decoded("AREA", "100 cm^2"), 0.01, 1e-15);
  EXPECT_NEAR(*Decoded("VOLUME", "1 l"), 0.001, 1e-15);
  EXPECT_NEAR(*Decoded("VOLUME", "1000 mm3"), 1e-6, 1e-18);
}

TEST(ZORICkeUnit, DecodeTellsAnglesFromPlainNumbers) {
  EXPECT_EQ(Decoded("ANGLE", "5 percent"), std::nullopt);
  EXPECT_EQ(Decoded("ANGLE", "5 sr"), std::nullopt);
  EXPECT_EQ(Decoded("ANGLE", "5"), std::nullopt);
}

TEST(ZORICkeUnit, DecodeTellsTimesFromFrequenciesAndDates) {
  EXPECT_EQ(Decoded("TIME", "5 Hz"), std::nullopt);
  EXPECT_EQ(Decoded("TIME", "5 seconds since 1970-01-01"), std::nullopt);
}

// Not every number can come back to the bit; none may lose more than its last one.
TEST(ZORICkeUnit, MillimetresComeBackFromMetres) {
  for (int i = 1; i <= 100000; ++i) {
    const double written = i / 100.0;
    ZORUnicodeString text;
    text.BuildFromNum(written, "%.2fmm");
    const double back = *Length(text.ConvertToChar()) * 1000.0;
    ASSERT_LE(std::abs(back - written), std::nextafter(written, 1e9) - written) << written;
  }
}

TEST(ZORICkeUnit, DecodeDoesNotWriteToTheErrorStream) {
  testing::internal::CaptureStderr();
  EXPECT_EQ(Length("3 furlongish"), std::nullopt);
  EXPECT_EQ(testing::internal::GetCapturedStderr(), "");
}
