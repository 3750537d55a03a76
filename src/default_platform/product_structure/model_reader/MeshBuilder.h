// Building a part's mesh, in double precision.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_MESHBUILDER_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_MESHBUILDER_H

#include <TDF_Label.hxx>
#include <TopTools_IndexedMapOfShape.hxx>
#include <array>
#include <cstdint>
#include <gp_XYZ.hxx>
#include <vector>

#include "default_platform/product_structure/ModelData.h"

namespace ZORDefault {

typedef std::array<std::uint32_t, 3> Triangle;
typedef std::vector<gp_XYZ> Polyline;

struct MeshBuilder {
  std::vector<gp_XYZ> points;
  std::vector<gp_XYZ> normals;  ///< one per point, unit
  std::vector<Triangle> triangles;
  std::vector<std::uint16_t> triangleColours;  ///< one per triangle
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

/// Unconnected triangles, as mesh formats have them.
struct TriangleSoup {
  std::vector<gp_XYZ> points;
  std::vector<gp_XYZ> normals;  ///< as given, one per point; zero where there is none
  std::vector<Triangle> triangles;
  std::vector<std::uint16_t> triangleColours;
};

/// Welds coincident points and adds the mesh. Points without a normal get the mean of the incident
/// face normals within the crease angle, weighted by the incident angles (Thuermer and Wuethrich,
/// "Computing vertex normals from polygonal facets", 1998). Feature edges are creases, and edges
/// with other than two triangles.
void AddCreasedMesh(const TriangleSoup& inMesh, MeshBuilder& ioBuilder);

/// Adds the edges of tessellated faces, each once, without seams and without those where two faces
/// are tangent. Of a shape without faces all curves are added.
/// @param inFirstPoints the index in the builder of each face's first point, or kNoPoints.
void AddSurfaceEdges(const TopoDS_Shape& inShape, const TopTools_IndexedMapOfShape& inFaces,
                     const std::vector<std::uint32_t>& inFirstPoints, MeshBuilder& ioBuilder);

inline constexpr std::uint32_t kNoPoints = 0xFFFFFFFF;

/// Fills the part's mesh, its area, and its counts of what has no triangles. On failure the part
/// has no mesh.
/// @param inDeflection as a share of the diagonal of the part's box.
/// @return false when the kernel raised an error. Raises std::bad_alloc.
bool MeshPart(const TDF_Label& inPart, double inDeflection, ModelPart& ioPart);

}  // namespace ZORDefault

#endif
