// Placements as frames of reference; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_REVIEW_FRAMES_H
#define ZOR_TOOLKIT_REVIEW_FRAMES_H

#include <algorithm>
#include <cmath>
#include <optional>

#include "foundation/Vector3.h"
#include "toolkit/review/ReviewRecords.h"

namespace ZORToolkit {

typedef ZORFoundation::Transform<double> Frame;
typedef ZORFoundation::Vector3d Point3;

inline Point3 ToPoint(const Position& inPosition) { return ZORFoundation::ToVector3(inPosition); }

inline Frame FrameOf(const Placement& inPlacement) {
  const auto column = [&](std::size_t inFirst) {
    return Point3{inPlacement[inFirst], inPlacement[inFirst + 1], inPlacement[inFirst + 2]};
  };
  return {{{column(0), column(3), column(6)}}, column(9)};
}

/// @return nothing for a frame that is flat.
inline std::optional<Frame> Inverse(const Frame& inFrame) {
  using namespace ZORFoundation;
  const auto& [a, b, c] = inFrame.linear.columns;
  const Point3 rows[] = {Cross(b, c), Cross(c, a), Cross(a, b)};
  const double volume = Dot(a, rows[0]);
  if (!std::isfinite(volume) || std::abs(volume) < 1e-9) return std::nullopt;
  Frame inverse;
  inverse.linear = {{{rows[0].x, rows[1].x, rows[2].x},
                     {rows[0].y, rows[1].y, rows[2].y},
                     {rows[0].z, rows[1].z, rows[2].z}}};
  for (Point3& column : inverse.linear.columns) column = (1 / volume) * column;
  inverse.translation = -1.0 * (inverse.linear * inFrame.translation);
  return inverse;
}

/// How far apart two frames are, as seen a metre from their origins. Millimetres; turns below what
/// six digits can say do not count.
inline double FrameDistance(const Frame& inA, const Frame& inB) {
  using namespace ZORFoundation;
  constexpr double kMetre = 1000, kRounding = 1e-5;
  double turn = 0;
  for (int i = 0; i < 3; ++i)
    turn = std::max(turn, Length(inA.linear.columns[i] - inB.linear.columns[i]));
  return Length(inA.translation - inB.translation) + (turn > kRounding ? kMetre * turn : 0);
}

/// Which cubic millimetre a coordinate is in. Designed coordinates are round, so cells do not begin
/// at round ones.
inline std::int64_t Cell(double inCoordinate) {
  constexpr double kOffset = 0.2928932188;
  return static_cast<std::int64_t>(std::floor(std::clamp(inCoordinate, -1e15, 1e15) + kOffset));
}

/// A place in the frame of a product; nothing when the product's placement is unknown or flat.
inline std::optional<Point3> PlaceInFrame(const std::optional<Placement>& inPlacement,
                                          const Position& inPlace) {
  if (!inPlacement) return std::nullopt;
  const std::optional<Frame> productFromWorld = Inverse(FrameOf(*inPlacement));
  if (!productFromWorld) return std::nullopt;
  return *productFromWorld * ToPoint(inPlace);
}

}  // namespace ZORToolkit

#endif
