#include "foundation/Vector3.h"

#include <gtest/gtest.h>

#include <limits>

using namespace ZORFoundation;

namespace {

/// A vector of another kind, with a constructor.
struct Point {
  Point(double inX, double inY, double inZ) : x(inX), y(inY), z(inZ) {}
  double x, y, z;
};

template <IsVector3 Vector>
void ExpectIs(const Vector& inVector, double inX, double inY, double inZ) {
  EXPECT_EQ(static_cast<double>(inVector.x), inX);
  EXPECT_EQ(static_cast<double>(inVector.y), inY);
  EXPECT_EQ(static_cast<double>(inVector.z), inZ);
}

/// A quarter turn about z, then a shift.
constexpr Transform<double> kTurnAndShift = {{{{0, 1, 0}, {-1, 0, 0}, {0, 0, 1}}}, {10, 20, 30}};

}  // namespace

TEST(Vector3, ArithmeticIsByCoordinate) {
  constexpr Vector3d a = {1, 2, 3}, b = {10, 20, 30};
  ExpectIs(a + b, 11, 22, 33);
  ExpectIs(b - a, 9, 18, 27);
  ExpectIs(2.0 * a, 2, 4, 6);
  EXPECT_EQ(Dot(a, b), 140);
  ExpectIs(Lerp(a, b, 0.0), 1, 2, 3);
  ExpectIs(Lerp(a, b, 1.0), 10, 20, 30);
}

TEST(Vector3, CrossIsRightHanded) {
  ExpectIs(Cross(Vector3d{1, 0, 0}, Vector3d{0, 1, 0}), 0, 0, 1);
  ExpectIs(Cross(Vector3d{0, 1, 0}, Vector3d{1, 0, 0}), 0, 0, -1);
}

TEST(Vector3, LengthDoesNotOverflow) {
  EXPECT_EQ(Length(Vector3d{2, 3, 6}), 7);
  EXPECT_DOUBLE_EQ(Length(Vector3d{3e200, 4e200, 0}), 5e200);
  EXPECT_EQ(Length(Vector3f{0, 0, 0}), 0);
}

TEST(Vector3, NormalisedHasLengthOneAndZeroStays) {
  ExpectIs(Normalised(Vector3d{0, 0, 4}), 0, 0, 1);
  ExpectIs(Normalised(Vector3f{0, 0, 0}), 0, 0, 0);
}

TEST(Vector3, FiniteIsEachCoordinate) {
  EXPECT_TRUE(IsFinite(Vector3d{1, 2, 3}));
  EXPECT_FALSE(IsFinite(Vector3d{1, std::numeric_limits<double>::infinity(), 3}));
  EXPECT_FALSE(IsFinite(Vector3f{1, 2, std::numeric_limits<float>::quiet_NaN()}));
}

TEST(Vector3, ServesOtherTypesWithThreeCoordinates) {
  ExpectIs(Point(1, 2, 3) + Point(1, 1, 1), 2, 3, 4);
  ExpectIs(Cross(Point(1, 0, 0), Point(0, 1, 0)), 0, 0, 1);
  EXPECT_EQ(Dot(Point(1, 2, 3), Point(1, 1, 1)), 6);
}

TEST(Transform, TurnsThenShifts) { ExpectIs(kTurnAndShift * Vector3d{1, 0, 0}, 10, 21, 30); }

TEST(Transform, ProductAppliesTheRightOneFirst) {
  constexpr Transform<double> scale = {{{{2, 0, 0}, {0, 2, 0}, {0, 0, 2}}}, {0, 0, 0}};
  ExpectIs(kTurnAndShift * scale * Vector3d{1, 0, 0}, 10, 22, 30);
  ExpectIs(scale * kTurnAndShift * Vector3d{1, 0, 0}, 20, 42, 60);
}
