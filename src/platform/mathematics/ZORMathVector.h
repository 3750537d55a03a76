// A vector in double precision.
#ifndef ZOR_PLATFORM_MATHEMATICS_ZORMATHVECTOR_H
#define ZOR_PLATFORM_MATHEMATICS_ZORMATHVECTOR_H

/// Three double-precision coordinates; (0, 0, 0) by default.
struct ZORMathVector {
  ZORMathVector() = default;
  ZORMathVector(double inX, double inY, double inZ) : x(inX), y(inY), z(inZ) {}

  double x = 0;
  double y = 0;
  double z = 0;
};

#endif
