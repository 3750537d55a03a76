// A matrix of three rows and three columns.
#ifndef ZOR_PLATFORM_MATHEMATICS_ZORMATH3X3MATRIX_H
#define ZOR_PLATFORM_MATHEMATICS_ZORMATH3X3MATRIX_H

#include "ZORPlatformExport.h"
#include "platform/ZORPlatformAdditions.h"
#include "platform/mathematics/ZORMathVector.h"

/// A 3 by 3 matrix of doubles, held as three columns; the identity by default.
class ZOR_PLATFORM_EXPORT ZORMath3x3Matrix {
 public:
  ZORMath3x3Matrix();
  ZORMath3x3Matrix(const ZORMathVector& inFirstColumn, const ZORMathVector& inSecondColumn,
                   const ZORMathVector& inThirdColumn);

#if ZOR_PLATFORM_ADDITIONS
  /// @param inColumn 0 to 2; another one raises ZORFatalError.
  const ZORMathVector& GetColumn(int inColumn) const;
  ZORMathVector operator*(const ZORMathVector& inVector) const;
  ZORMath3x3Matrix operator*(const ZORMath3x3Matrix& inOther) const;
  double Determinant() const;
#endif

 private:
  ZORMathVector columns_[3];
};

#endif
