// The drawn form of a part: triangles and edges.
#ifndef ZOR_DEFAULT_PLATFORM_PARTMESH_H
#define ZOR_DEFAULT_PLATFORM_PARTMESH_H

#include <array>
#include <cstdint>
#include <memory>
#include <optional>
#include <vector>

#include "platform/mathematics/ZORMathTransformation.h"
#include "platform/visualisation/ZOR3DBoundingSphere.h"
#include "platform/visualisation/ZOR3DRep.h"

/// 8-bit red, green, blue, alpha.
typedef std::array<std::uint8_t, 4> PartColour;

/// An axis-aligned bounding box of a mesh's points, relative to its origin.
struct Aabb {
  std::array<float, 3> low;
  std::array<float, 3> high;
};

/// What the renderer derives from a mesh when it first needs it; freed with the mesh. A copy of the
/// mesh starts without, since the copy may be changed.
struct RenderCache {
  RenderCache() = default;
  RenderCache(const RenderCache&) {}
  // NOLINTNEXTLINE(bugprone-unhandled-self-assignment): takes nothing over
  RenderCache& operator=(const RenderCache&) {
    bvh.reset();
    bounds.reset();
    return *this;
  }
  std::shared_ptr<const void> bvh;
  std::optional<Aabb> bounds;
};

/// Triangles and edge polylines of one part, shared by all its instances. Positions are single
/// precision relative to `origin`, which lies in the middle of the part, so that a part far from
/// the origin of its space loses nothing.
struct PartMesh {
  ZORMathVector origin;                       ///< in the part's space, millimetres
  std::vector<std::array<float, 3>> points;   ///< relative to origin
  std::vector<std::array<float, 3>> normals;  ///< unit, of the surface; one a point
  std::vector<std::array<std::uint32_t, 3>> triangles;
  /// A triangle with this colour has none of its own, and is shown in the colour of its product.
  static constexpr std::uint16_t kNoColour = 0xFFFF;
  /// Colour of each triangle as a position in `colours`, or kNoColour; empty: all have none of
  /// their own.
  std::vector<std::uint16_t> triangleColours;
  std::vector<PartColour> colours;  ///< colours of faces and bodies below the part
  /// Face boundaries as polylines: positions in edgePoints, each line from lineStarts[i] to
  /// lineStarts[i + 1].
  std::vector<std::array<float, 3>> edgePoints;
  std::vector<std::uint32_t> lineStarts;
  ZOR3DBoundingSphere sphere;       ///< in the part's space
  mutable RenderCache renderCache;  ///< owned by the renderer; nobody else touches it
};

#endif
