// A mesh while it is put together, in double precision.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_MESHBUILDER_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_MESHBUILDER_H

#include <array>
#include <cstdint>
#include <gp_XYZ.hxx>
#include <vector>

namespace ZORDefault {

typedef std::array<std::uint32_t, 3> Triangle;
typedef std::vector<gp_XYZ> Polyline;

struct MeshBuilder {
  std::vector<gp_XYZ> points;
  std::vector<gp_XYZ> normals;  ///< one a point, unit
  std::vector<Triangle> triangles;
  std::vector<std::uint16_t> triangleColours;  ///< one a triangle
  std::vector<Polyline> edges;
};

/// The normal of a triangle with twice its area as length.
inline gp_XYZ AreaNormal(const gp_XYZ& inA, const gp_XYZ& inB, const gp_XYZ& inC) {
  return (inB - inA).Crossed(inC - inA);
}

/// The unit vector in a direction; the z axis for none.
inline gp_XYZ UnitOf(const gp_XYZ& inDirection) {
  const double length = inDirection.Modulus();
  return length > 0 ? inDirection / length : gp_XYZ(0, 0, 1);
}

}  // namespace ZORDefault

#endif
