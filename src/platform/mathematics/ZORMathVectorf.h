// A vector in single precision.
#ifndef ZOR_PLATFORM_MATHEMATICS_ZORMATHVECTORF_H
#define ZOR_PLATFORM_MATHEMATICS_ZORMATHVECTORF_H

/// Three single-precision coordinates of a direction with a length; (0, 0, 0) by default.
struct ZORMathVectorf {
  ZORMathVectorf() = default;
  ZORMathVectorf(float inX, float inY, float inZ) : x(inX), y(inY), z(inZ) {}

  float x = 0;
  float y = 0;
  float z = 0;
};

#endif
