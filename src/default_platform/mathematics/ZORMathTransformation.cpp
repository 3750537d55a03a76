#include "platform/mathematics/ZORMathTransformation.h"

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

ZORMathTransformation::ZORMathTransformation() = default;

void ZORMathTransformation::SetMatrix(const ZORMath3x3Matrix& inMatrix) { matrix_ = inMatrix; }

void ZORMathTransformation::SetVector(const ZORMathVector& inTranslation) {
  vector_ = inTranslation;
}

const ZORMath3x3Matrix& ZORMathTransformation::GetMatrix() const { return matrix_; }
const ZORMathVector& ZORMathTransformation::GetVector() const { return vector_; }

void ZORMathTransformation::GetCoefficients(double outCoefficients[12]) const {
  const ZORMathVector* const columns[] = {&matrix_.GetColumn(0), &matrix_.GetColumn(1),
                                          &matrix_.GetColumn(2), &vector_};
  for (const ZORMathVector* const column : columns) {
    *outCoefficients++ = column->x;
    *outCoefficients++ = column->y;
    *outCoefficients++ = column->z;
  }
}

ZORMathVector ZORMathTransformation::operator*(const ZORMathVector& inPoint) const {
  const ZORMathVector turned = matrix_ * inPoint;
  return {turned.x + vector_.x, turned.y + vector_.y, turned.z + vector_.z};
}

ZORMathTransformation ZORMathTransformation::operator*(const ZORMathTransformation& inOther) const {
  ZORMathTransformation product;
  product.matrix_ = matrix_ * inOther.matrix_;
  product.vector_ = *this * inOther.vector_;
  return product;
}
