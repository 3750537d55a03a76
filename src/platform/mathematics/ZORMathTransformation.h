// A placement: a matrix and a translation.
#ifndef ZOR_PLATFORM_MATHEMATICS_ZORMATHTRANSFORMATION_H
#define ZOR_PLATFORM_MATHEMATICS_ZORMATHTRANSFORMATION_H

#include "ZORPlatformExport.h"
#include "platform/ZORPlatformAdditions.h"
#include "platform/mathematics/ZORMath3x3Matrix.h"
#include "platform/mathematics/ZORMathVector.h"

/// Maps a point p to matrix * p + vector; the identity by default. Lengths in millimetres.
class ZOR_PLATFORM_EXPORT ZORMathTransformation {
 public:
  ZORMathTransformation();
  void SetMatrix(const ZORMath3x3Matrix& inMatrix);
  void SetVector(const ZORMathVector& inTranslation);

#if ZOR_PLATFORM_ADDITIONS
  const ZORMath3x3Matrix& GetMatrix() const;
  const ZORMathVector& GetVector() const;
  /// The twelve numbers: first, second and third column of the matrix, then the translation.
  void GetCoefficients(double outCoefficients[12]) const;
  ZORMathVector operator*(const ZORMathVector& inPoint) const;
  /// The transformation that applies inOther first.
  ZORMathTransformation operator*(const ZORMathTransformation& inOther) const;
#endif

 private:
  ZORMath3x3Matrix matrix_;
  ZORMathVector vector_;
};

#endif
