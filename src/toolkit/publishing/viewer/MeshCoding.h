// Compact encoding of a part's mesh, for a page.
#ifndef ZOR_TOOLKIT_PUBLISHING_VIEWER_MESH_CODING_H
#define ZOR_TOOLKIT_PUBLISHING_VIEWER_MESH_CODING_H

#include <array>
#include <cstdint>
#include <string>
#include <vector>

#include "default_platform/PartMesh.h"

namespace ZORToolkit {

/// "#rrggbb", without the opacity.
std::string ColourText(const std::array<std::uint8_t, 4>& inColour);

/// Triangles of one colour, one after the other.
struct ColourRange {
  std::string colour;  ///< "#rrggbb"; empty: that of the product
  std::size_t triangles = 0;
};

/// What a page's script needs to read the bytes.
struct CodedMesh {
  std::string bytes;
  std::size_t points = 0, triangles = 0, lines = 0, linePoints = 0;
  std::array<double, 3> low{}, size{};  ///< of the box in the part's space
  std::vector<ColourRange> ranges;
  double error = 0;  ///< how far a point may be off, as a share of the box's largest side
};

/// Positions have 16 bits an axis, as differences from the point before, low bytes and high bytes
/// apart. Normals are octahedral (Q. Meyer and others, "On floating-point normal vectors", 2010), a
/// byte an axis. Corners count back from the highest one so far. The bytes are meant to be
/// compressed.
/// @param inShare of the triangles to keep; 1: all.
CodedMesh CodeMesh(const PartMesh& inMesh, double inShare);

}  // namespace ZORToolkit

#endif
