// Vectors in single precision, for drawing.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_VEC3_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_VEC3_H

#include <array>
#include <cmath>

namespace ZORRayCaster {

/// A direction, a place in camera space (x right, y down, z forward, the eye at the origin), or a
/// colour in proportion to light.
/// Nothing is set at first, since millions are made for a picture.
struct Vec3 {
  float x;
  float y;
  float z;

  friend Vec3 operator+(Vec3 inA, Vec3 inB) {
    return {inA.x + inB.x, inA.y + inB.y, inA.z + inB.z};
  }
  friend Vec3 operator-(Vec3 inA, Vec3 inB) {
    return {inA.x - inB.x, inA.y - inB.y, inA.z - inB.z};
  }
  friend Vec3 operator*(float inFactor, Vec3 inA) {
    return {inFactor * inA.x, inFactor * inA.y, inFactor * inA.z};
  }
};

inline Vec3 ToVec3(const std::array<float, 3>& inArray) {
  return {inArray[0], inArray[1], inArray[2]};
}
inline float Dot(Vec3 inA, Vec3 inB) { return inA.x * inB.x + inA.y * inB.y + inA.z * inB.z; }
inline Vec3 Cross(Vec3 inA, Vec3 inB) {
  return {inA.y * inB.z - inA.z * inB.y, inA.z * inB.x - inA.x * inB.z,
          inA.x * inB.y - inA.y * inB.x};
}
/// The zero vector stays as it is.
inline Vec3 Normalize(Vec3 inA) {
  const float square = Dot(inA, inA);
  return square > 0 ? (1 / std::sqrt(square)) * inA : inA;
}
inline Vec3 Lerp(Vec3 inA, Vec3 inB, float inT) { return inA + inT * (inB - inA); }

/// A linear map.
struct Linear {
  Vec3 columns[3];

  friend Vec3 operator*(const Linear& inMap, Vec3 inVector) {
    return inVector.x * inMap.columns[0] + inVector.y * inMap.columns[1] +
           inVector.z * inMap.columns[2];
  }
};

/// A linear map and a translation.
struct Affine {
  Linear linear;
  Vec3 translation;

  friend Vec3 operator*(const Affine& inMap, Vec3 inPoint) {
    return inMap.linear * inPoint + inMap.translation;
  }
};

}  // namespace ZORRayCaster

#endif
