// Meshes without surfaces: their normals and edges come from their triangles.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_CREASEDMESH_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_CREASEDMESH_H

#include <vector>

#include "default_platform/product_structure/model_reader/MeshBuilder.h"

namespace ZORDefault {

/// Triangles as a file has them.
struct BareMesh {
  std::vector<gp_XYZ> points;
  std::vector<gp_XYZ> normals;  ///< of the file, one a point; a zero vector: it has none
  std::vector<Triangle> triangles;
  std::vector<std::uint16_t> triangleColours;
};

/// Adds a mesh: points that lie in the same place are one; a point without a normal gets the mean
/// of the triangles around it, weighted by their angles there, of those that bend away by less than
/// the crease angle. Edges are those that are sharper, and those with other than two triangles.
void AddCreasedMesh(const BareMesh& inMesh, MeshBuilder& ioBuilder);

}  // namespace ZORDefault

#endif
