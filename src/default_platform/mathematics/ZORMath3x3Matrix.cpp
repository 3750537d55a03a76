#include "platform/mathematics/ZORMath3x3Matrix.h"

#include "platform/system/ZORErrors.h"

ZORMath3x3Matrix::ZORMath3x3Matrix()
    : columns_{ZORMathVector(1, 0, 0), ZORMathVector(0, 1, 0), ZORMathVector(0, 0, 1)} {}

ZORMath3x3Matrix::ZORMath3x3Matrix(const ZORMathVector& inFirstColumn,
                                   const ZORMathVector& inSecondColumn,
                                   const ZORMathVector& inThirdColumn)
    : columns_{inFirstColumn, inSecondColumn, inThirdColumn} {}

const ZORMathVector& ZORMath3x3Matrix::GetColumn(int inColumn) const {
  if (inColumn < 0 || inColumn > 2)
    throw ZORFatalError("AssertionFailed:iColumn >= 0 && iColumn <= 2");
  return columns_[inColumn];
}

ZORMathVector ZORMath3x3Matrix::operator*(const ZORMathVector& inVector) const {
  const auto& [first, second, third] = columns_;
  return {first.x * inVector.x + second.x * inVector.y + third.x * inVector.z,
          first.y * inVector.x + second.y * inVector.y + third.y * inVector.z,
          first.z * inVector.x + second.z * inVector.y + third.z * inVector.z};
}

ZORMath3x3Matrix ZORMath3x3Matrix::operator*(const ZORMath3x3Matrix& inOther) const {
  return {*this * inOther.columns_[0], *this * inOther.columns_[1], *this * inOther.columns_[2]};
}

double ZORMath3x3Matrix::Determinant() const {
  const auto& [a, b, c] = columns_;
  return a.x * (b.y * c.z - b.z * c.y) + a.y * (b.z * c.x - b.x * c.z) +
         a.z * (b.x * c.y - b.y * c.x);
}
