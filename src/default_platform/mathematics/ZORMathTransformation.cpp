#include "platform/mathematics/ZORMathTransformation.h"

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
