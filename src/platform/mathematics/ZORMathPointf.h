// A point in single precision.
#ifndef ZOR_PLATFORM_MATHEMATICS_ZORMATHPOINTF_H
#define ZOR_PLATFORM_MATHEMATICS_ZORMATHPOINTF_H

/// Three single-precision coordinates of a position; (0, 0, 0) by default.
struct ZORMathPointf {
  ZORMathPointf() = default;
  ZORMathPointf(float inX, float inY, float inZ) : x(inX), y(inY), z(inZ) {}

  float x = 0;
  float y = 0;
  float z = 0;
};

#endif
