// Lengths on a platform that knows no magnitude "LENGTH", or no unit for it. The default platform
// knows both, so this program takes the place of its dictionary.
#include <gtest/gtest.h>

#include <string>

#include "ZORLyraGeneralServices.h"
#include "platform/knowledge/ZORParmDictionary.h"

namespace {

class UnitlessMagnitude : public ZORICkeMagnitude {
 public:
  ZORUnicodeString Name() const override { return "LENGTH"; }
  ZORICkeUnit_var Unit() const override { return ZORICkeUnit_var(); }
};

// Refuses every text, after it has spoilt the value; keeps what it was asked.
class RefusingUnit : public ZORICkeUnit {
 public:
  explicit RefusingUnit(std::string& outAsked) : asked_(outAsked) {}
  ZORCke::Boolean Decode(const ZORUnicodeString& inText, double& outValue) const override {
    asked_ += "[" + std::string(inText.ConvertToChar()) + "]";
    outValue = 77.0;
    return ZORCke::False;
  }

 private:
  std::string& asked_;
};

// Takes every text as a length of two metres.
class LenientUnit : public ZORICkeUnit {
 public:
  ZORCke::Boolean Decode(const ZORUnicodeString&, double& outValue) const override {
    outValue = 2.0;
    return ZORCke::True;
  }
};

class MagnitudeOf : public ZORICkeMagnitude {
 public:
  explicit MagnitudeOf(const ZORICkeUnit_var& inUnit) : unit_(inUnit) {}
  ZORUnicodeString Name() const override { return "LENGTH"; }
  ZORICkeUnit_var Unit() const override { return unit_; }

 private:
  ZORICkeUnit_var unit_;
};

// A handle that holds the only reference of a new component.
template <class Handle, class Component>
Handle Owned(Component* inComponent) {
  const Handle handle(inComponent);
  inComponent->Release();
  return handle;
}

ZORICkeMagnitude_var known;  // what the dictionary knows
std::string lookedUp;        // what it was asked for

}  // namespace

ZORICkeMagnitude_var ZORParmDictionary::FindMagnitude(const ZORUnicodeString& inName) {
  lookedUp = inName.ConvertToChar();
  return known;
}

namespace {

class WithoutLengthMagnitude : public testing::Test {
 protected:
  ~WithoutLengthMagnitude() override { known = ZORICkeMagnitude_var(); }
};

TEST_F(WithoutLengthMagnitude, ConvertValueInMMIsMinusOneUnscaled) {
  EXPECT_EQ(-1.0, ZORLyraGeneralServices::ConvertValueInMM("25mm"));
  EXPECT_EQ("LENGTH", lookedUp);
}

TEST_F(WithoutLengthMagnitude, ConvertValueInMMWithoutUnitIsMinusOneUnscaled) {
  known = Owned<ZORICkeMagnitude_var>(new UnitlessMagnitude);
  EXPECT_EQ(-1.0, ZORLyraGeneralServices::ConvertValueInMM("25mm"));
}

TEST_F(WithoutLengthMagnitude, ConvertValueInMMOffersTheTextAloneAndThenWithMillimetres) {
  std::string asked;
  known =
      Owned<ZORICkeMagnitude_var>(new MagnitudeOf(Owned<ZORICkeUnit_var>(new RefusingUnit(asked))));
  EXPECT_DOUBLE_EQ(-0.1, ZORLyraGeneralServices::ConvertValueInMM("12.5"));
  EXPECT_EQ("[12.5][12.5mm]", asked);
  asked.clear();
  EXPECT_DOUBLE_EQ(-0.1, ZORLyraGeneralServices::ConvertValueInMM(""));
  EXPECT_EQ("[][mm]", asked);
}

TEST_F(WithoutLengthMagnitude, ConvertValueInMMScalesWhatTheUnitReads) {
  known = Owned<ZORICkeMagnitude_var>(new MagnitudeOf(Owned<ZORICkeUnit_var>(new LenientUnit)));
  EXPECT_EQ(2000.0, ZORLyraGeneralServices::ConvertValueInMM("anything"));
}

}  // namespace
