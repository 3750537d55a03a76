// Distances and crossings of triangles.
#ifndef ZOR_TOOLKIT_DETECTION_KERNEL_TRIANGLES_H
#define ZOR_TOOLKIT_DETECTION_KERNEL_TRIANGLES_H

#include <array>
#include <gp_XYZ.hxx>
#include <optional>

namespace ZORDetection {

using Corners = std::array<gp_XYZ, 3>;

/// Points of least distance.
struct ClosestPoints {
  double squareDistance = 0;
  gp_XYZ first, second;
};

gp_XYZ ClosestOnSegment(const gp_XYZ& inPoint, const gp_XYZ& inStart, const gp_XYZ& inEnd);
gp_XYZ ClosestOnTriangle(const gp_XYZ& inPoint, const Corners& inTriangle);

/// Weights of the corners for a point in the triangle's plane.
std::array<double, 3> BarycentricOf(const gp_XYZ& inPoint, const Corners& inTriangle);

/// @param inCutOff square distance: beyond it the answer may be any pair of points farther apart.
ClosestPoints ClosestOfTriangles(const Corners& inFirst, const Corners& inSecond, double inCutOff);

/// The segment in which two triangles cross; none when they only touch in a plane.
std::optional<std::array<gp_XYZ, 2>> CrossingOf(const Corners& inFirst, const Corners& inSecond);

}  // namespace ZORDetection

#endif
