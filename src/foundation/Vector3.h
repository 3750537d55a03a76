// Vectors, matrices and transforms of three dimensions.
#ifndef ZOR_FOUNDATION_VECTOR3_H
#define ZOR_FOUNDATION_VECTOR3_H

#include <array>
#include <cmath>

namespace ZORFoundation {

/// A position, a direction or a colour. Uninitialised by default, since millions are made.
template <class Number>
struct Vector3 {
  Number x, y, z;
};
using Vector3f = Vector3<float>;
using Vector3d = Vector3<double>;

/// Any type with public members x, y and z, such as the platform's vectors. The functions below
/// serve all of them; for types of other namespaces they need `using namespace ZORFoundation`.
template <class Vector>
concept IsVector3 = requires(const Vector& inVector) {
  Vector{inVector.x, inVector.y, inVector.z};
};

template <IsVector3 Vector>
constexpr Vector operator+(const Vector& inA, const Vector& inB) {
  return {inA.x + inB.x, inA.y + inB.y, inA.z + inB.z};
}
template <IsVector3 Vector>
constexpr Vector operator-(const Vector& inA, const Vector& inB) {
  return {inA.x - inB.x, inA.y - inB.y, inA.z - inB.z};
}
template <IsVector3 Vector>
constexpr Vector operator*(decltype(Vector::x) inFactor, const Vector& inA) {
  return {inFactor * inA.x, inFactor * inA.y, inFactor * inA.z};
}
template <IsVector3 Vector>
constexpr auto Dot(const Vector& inA, const Vector& inB) {
  return inA.x * inB.x + inA.y * inB.y + inA.z * inB.z;
}
template <IsVector3 Vector>
constexpr Vector Cross(const Vector& inA, const Vector& inB) {
  return {inA.y * inB.z - inA.z * inB.y, inA.z * inB.x - inA.x * inB.z,
          inA.x * inB.y - inA.y * inB.x};
}
/// Without overflow or underflow on the way.
template <IsVector3 Vector>
auto Length(const Vector& inA) {
  return std::hypot(inA.x, inA.y, inA.z);
}
/// The direction at length 1; the zero vector stays as it is.
template <IsVector3 Vector>
Vector Normalised(const Vector& inA) {
  const auto square = Dot(inA, inA);
  return square > 0 ? (1 / std::sqrt(square)) * inA : inA;
}
template <IsVector3 Vector>
constexpr Vector Lerp(const Vector& inA, const Vector& inB, decltype(Vector::x) inShareOfB) {
  return inA + inShareOfB * (inB - inA);
}
template <IsVector3 Vector>
bool IsFinite(const Vector& inA) {
  return std::isfinite(inA.x) && std::isfinite(inA.y) && std::isfinite(inA.z);
}
template <class Number>
constexpr Vector3<Number> ToVector3(const std::array<Number, 3>& inArray) {
  return {inArray[0], inArray[1], inArray[2]};
}

/// A linear map, by the images of the three axes.
template <class Number>
struct Matrix3 {
  Vector3<Number> columns[3];

  friend constexpr Vector3<Number> operator*(const Matrix3& inMap,
                                             const Vector3<Number>& inVector) {
    return inVector.x * inMap.columns[0] + inVector.y * inMap.columns[1] +
           inVector.z * inMap.columns[2];
  }
  friend constexpr Matrix3 operator*(const Matrix3& inA, const Matrix3& inB) {
    return {{inA * inB.columns[0], inA * inB.columns[1], inA * inB.columns[2]}};
  }
};

/// Whether a map only turns, or turns and mirrors: its columns have length 1 and stand at right
/// angles. False where a number is none.
template <class Number>
bool IsOrthonormal(const Matrix3<Number>& inMap, Number inTolerance) {
  for (int i = 0; i < 3; ++i)
    for (int j = 0; j <= i; ++j)
      if (!(std::abs(Dot(inMap.columns[i], inMap.columns[j]) - (i == j ? 1 : 0)) <= inTolerance))
        return false;
  return true;
}

/// A linear map, then a translation. Named by what it leads to and from: cameraFromModel *
/// modelFromPart is cameraFromPart.
template <class Number>
struct Transform {
  Matrix3<Number> linear;
  Vector3<Number> translation;

  friend constexpr Vector3<Number> operator*(const Transform& inMap,
                                             const Vector3<Number>& inPoint) {
    return inMap.linear * inPoint + inMap.translation;
  }
  friend constexpr Transform operator*(const Transform& inA, const Transform& inB) {
    return {inA.linear * inB.linear, inA * inB.translation};
  }
};

}  // namespace ZORFoundation

#endif
