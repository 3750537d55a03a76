// Large faces of OBJ files.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_OBJFACES_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_OBJFACES_H

#include <array>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace ZORDefault {

/// The kernel's reader writes the corners of a face into a block of fixed size.
/// @return the text with triangles in place of each face of more than 1,024 corners; nothing for a
/// text without one. Raises Refusal for a corner of such a face that refers to no vertex.
std::optional<std::string> ObjWithoutLargeFaces(std::string_view inText);

using Point = std::array<double, 3>;

/// Cuts a polygon that lies near a plane and does not cross itself into triangles, two fewer than
/// it has corners. @return positions of corners.
std::vector<std::array<std::size_t, 3>> TrianglesOf(const std::vector<Point>& inPolygon);

}  // namespace ZORDefault

#endif
