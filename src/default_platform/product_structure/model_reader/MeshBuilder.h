// A mesh while it is put together, in double precision.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_MESHBUILDER_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_MESHBUILDER_H

#include <TopTools_IndexedMapOfShape.hxx>
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

/// Triangles as a file has them.
struct TriangleSoup {
  std::vector<gp_XYZ> points;
  std::vector<gp_XYZ> normals;  ///< of the file, one a point; a zero vector: it has none
  std::vector<Triangle> triangles;
  std::vector<std::uint16_t> triangleColours;
};

/// Adds a mesh: points that lie in the same place are one; a point without a normal gets the mean
/// of the triangles around it, weighted by their angles there, of those that bend away by less than
/// the crease angle. Edges are those that are sharper, and those with other than two triangles.
void AddCreasedMesh(const TriangleSoup& inMesh, MeshBuilder& ioBuilder);

/// Adds the boundaries of tessellated faces, each once; those on which a surface meets itself, or
/// two faces pass into each other without a bend, are left out. A shape without faces has all its
/// curves drawn.
/// @param inFirstPoints for each face the position of its first point in the builder, or kNoPoints.
void AddSurfaceEdges(const TopoDS_Shape& inShape, const TopTools_IndexedMapOfShape& inFaces,
                     const std::vector<std::uint32_t>& inFirstPoints, MeshBuilder& ioBuilder);

inline constexpr std::uint32_t kNoPoints = 0xFFFFFFFF;

}  // namespace ZORDefault

#endif
