#include "platform/mathematics/ZORMathTransformation.h"

#include <gtest/gtest.h>

#include <vector>

#include "platform/mathematics/ZORMathPointf.h"
#include "platform/mathematics/ZORMathVectorf.h"
#include "platform/system/ZORErrors.h"

namespace {

std::vector<double> Coordinates(const ZORMathVector& inVector) {
  return {inVector.x, inVector.y, inVector.z};
}

std::vector<double> Coefficients(const ZORMathTransformation& inTransformation) {
  std::vector<double> coefficients(12, -1);
  inTransformation.GetCoefficients(coefficients.data());
  return coefficients;
}

// A quarter turn about z, then a translation.
ZORMathTransformation TurnedAndMoved() {
  ZORMathTransformation transformation;
  transformation.SetMatrix(ZORMath3x3Matrix({0, 1, 0}, {-1, 0, 0}, {0, 0, 1}));
  transformation.SetVector({10, 20, 30});
  return transformation;
}

using Numbers = std::vector<double>;

}  // namespace

TEST(ZORMath3x3Matrix, DefaultIsTheIdentity) {
  const ZORMath3x3Matrix identity;
  EXPECT_EQ(Coordinates(identity.GetColumn(0)), (Numbers{1, 0, 0}));
  EXPECT_EQ(Coordinates(identity.GetColumn(1)), (Numbers{0, 1, 0}));
  EXPECT_EQ(Coordinates(identity.GetColumn(2)), (Numbers{0, 0, 1}));
  EXPECT_EQ(identity.Determinant(), 1.0);
}

TEST(ZORMath3x3Matrix, IsBuiltFromColumns) {
  const ZORMath3x3Matrix matrix({1, 2, 3}, {4, 5, 6}, {7, 8, 10});
  EXPECT_EQ(Coordinates(matrix * ZORMathVector(1, 0, 0)), (Numbers{1, 2, 3}));
  EXPECT_EQ(Coordinates(matrix * ZORMathVector(0, 1, 0)), (Numbers{4, 5, 6}));
  EXPECT_EQ(Coordinates(matrix * ZORMathVector(1, 1, 1)), (Numbers{12, 15, 19}));
  EXPECT_EQ(matrix.Determinant(), -3.0);
}

TEST(ZORMath3x3Matrix, ProductAppliesTheRightOneFirst) {
  const ZORMath3x3Matrix turn({0, 1, 0}, {-1, 0, 0}, {0, 0, 1});
  const ZORMath3x3Matrix stretch({2, 0, 0}, {0, 1, 0}, {0, 0, 1});
  EXPECT_EQ(Coordinates((turn * stretch) * ZORMathVector(1, 1, 0)), (Numbers{-1, 2, 0}));
  EXPECT_EQ(Coordinates((stretch * turn) * ZORMathVector(1, 1, 0)), (Numbers{-2, 1, 0}));
}

TEST(ZORMath3x3Matrix, ZeroAndMirrorDeterminants) {
  EXPECT_EQ(ZORMath3x3Matrix({}, {}, {}).Determinant(), 0.0);
  EXPECT_EQ(ZORMath3x3Matrix({-1, 0, 0}, {0, 1, 0}, {0, 0, 1}).Determinant(), -1.0);
}

TEST(ZORMath3x3Matrix, ColumnOutsideIsFatal) {
  EXPECT_THROW(ZORMath3x3Matrix().GetColumn(3), ZORFatalError);
  EXPECT_THROW(ZORMath3x3Matrix().GetColumn(-1), ZORFatalError);
}

TEST(ZORMathTransformation, DefaultIsTheIdentity) {
  EXPECT_EQ(Coefficients(ZORMathTransformation()), (Numbers{1, 0, 0, 0, 1, 0, 0, 0, 1, 0, 0, 0}));
}

TEST(ZORMathTransformation, CoefficientsAreColumnsThenTranslation) {
  EXPECT_EQ(Coefficients(TurnedAndMoved()), (Numbers{0, 1, 0, -1, 0, 0, 0, 0, 1, 10, 20, 30}));
}

TEST(ZORMathTransformation, KeepsAMatrixOfZeros) {
  ZORMathTransformation transformation;
  transformation.SetMatrix(ZORMath3x3Matrix({}, {}, {}));
  transformation.SetVector({});
  EXPECT_EQ(Coefficients(transformation), Numbers(12, 0.0));
}

TEST(ZORMathTransformation, MapsPoints) {
  EXPECT_EQ(Coordinates(TurnedAndMoved() * ZORMathVector(1, 2, 3)), (Numbers{8, 21, 33}));
}

TEST(ZORMathTransformation, ProductAppliesTheRightOneFirst) {
  ZORMathTransformation moved;
  moved.SetVector({1, 0, 0});
  EXPECT_EQ(Coordinates((TurnedAndMoved() * moved) * ZORMathVector()), (Numbers{10, 21, 30}));
  EXPECT_EQ(Coordinates((moved * TurnedAndMoved()) * ZORMathVector()), (Numbers{11, 20, 30}));
}

TEST(ZORMathTransformation, GivesBackWhatWasSet) {
  const ZORMathTransformation transformation = TurnedAndMoved();
  EXPECT_EQ(Coordinates(transformation.GetVector()), (Numbers{10, 20, 30}));
  EXPECT_EQ(Coordinates(transformation.GetMatrix().GetColumn(0)), (Numbers{0, 1, 0}));
}

TEST(ZORMathPointf, DefaultIsTheOrigin) {
  const ZORMathPointf origin;
  EXPECT_EQ(origin.x, 0.0f);
  EXPECT_EQ(origin.y, 0.0f);
  EXPECT_EQ(origin.z, 0.0f);
  const ZORMathPointf point(1, 2.5f, -3);
  EXPECT_EQ(point.y, 2.5f);
}

TEST(ZORMathVectorf, DefaultIsZero) {
  const ZORMathVectorf zero;
  EXPECT_EQ(zero.x, 0.0f);
  EXPECT_EQ(zero.z, 0.0f);
  EXPECT_EQ(ZORMathVectorf(0, 0, 1).z, 1.0f);
}
