// Arithmetic of vectors.
#ifndef ZOR_DEFAULT_PLATFORM_SPACE_ANALYSIS_VECTORS_H
#define ZOR_DEFAULT_PLATFORM_SPACE_ANALYSIS_VECTORS_H

#include <cmath>

#include "platform/mathematics/ZORMathVector.h"

namespace ZORDefault {

inline ZORMathVector operator+(const ZORMathVector& inA, const ZORMathVector& inB) {
  return {inA.x + inB.x, inA.y + inB.y, inA.z + inB.z};
}
inline ZORMathVector operator-(const ZORMathVector& inA, const ZORMathVector& inB) {
  return {inA.x - inB.x, inA.y - inB.y, inA.z - inB.z};
}
inline ZORMathVector operator*(double inFactor, const ZORMathVector& inA) {
  return {inFactor * inA.x, inFactor * inA.y, inFactor * inA.z};
}
inline double Dot(const ZORMathVector& inA, const ZORMathVector& inB) {
  return inA.x * inB.x + inA.y * inB.y + inA.z * inB.z;
}
inline ZORMathVector Cross(const ZORMathVector& inA, const ZORMathVector& inB) {
  return {inA.y * inB.z - inA.z * inB.y, inA.z * inB.x - inA.x * inB.z,
          inA.x * inB.y - inA.y * inB.x};
}
inline double Length(const ZORMathVector& inA) { return std::hypot(inA.x, inA.y, inA.z); }
inline bool IsFinite(const ZORMathVector& inA) {
  return std::isfinite(inA.x) && std::isfinite(inA.y) && std::isfinite(inA.z);
}

}  // namespace ZORDefault

#endif
