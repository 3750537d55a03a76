// Searches along the borders of faces, where a boundary has ridges that no search across it
// follows.
#include <map>

#include "toolkit/detection/kernel/BodyPair.h"

namespace ZORDetection {
namespace {

constexpr double kGolden = 0.381966011250105;
constexpr double kFinest = 1e-7;  // millimetres along a border; the depth changes by no more
constexpr int kMaxDoublings = 24;
constexpr int kMaxBrentSteps = 60;
constexpr std::size_t kMaxEdgeClimbs = 24, kMaxClimbsOfEdge = 3;
constexpr double kNearBorder = 0.5;  // in depths

struct Maximum {
  double at = 0, value = 0;
};

/// Maximises a function near a parameter: brackets the maximum by doubling steps, then Brent's
/// method (Algorithms for Minimization without Derivatives, 1973).
/// @param inIsWorth asked with the largest value so far and the size of the bracket, whether to go
/// on.
template <typename Function, typename IsWorth>
Maximum MaximumAround(double inAt, double inStep, double inTolerance, const Function& inValueAt,
                      const IsWorth& inIsWorth) {
  double middle = inAt, value = inValueAt(middle);
  const double up = inValueAt(middle + inStep), down = inValueAt(middle - inStep);
  double low = middle - inStep, high = middle + inStep;
  if (up > value || down > value) {
    double step = up > down ? inStep : -inStep, behind = middle;
    middle += step;
    value = std::max(up, down);
    double ahead = middle + step;
    for (int i = 0; i < kMaxDoublings; ++i) {
      step *= 2;
      ahead = middle + step;
      const double next = inValueAt(ahead);
      if (next <= value) break;
      behind = middle;
      middle = ahead;
      value = next;
    }
    low = std::min(behind, ahead);
    high = std::max(behind, ahead);
  }
  if (!inIsWorth(value, high - low)) return {middle, value};
  double second = middle, third = middle, secondValue = value, thirdValue = value;
  double step = 0, stepBefore = 0;
  for (int i = 0; i < kMaxBrentSteps && high - low > 2 * inTolerance; ++i) {
    double offset = 0;
    bool isParabolic = false;
    if (std::abs(stepBefore) > inTolerance) {
      const double r = (middle - second) * (value - thirdValue);
      double q = (middle - third) * (value - secondValue);
      double p = (middle - third) * q - (middle - second) * r;
      q = 2 * (q - r);
      if (q > 0) p = -p;
      q = std::abs(q);
      isParabolic = std::abs(p) < std::abs(0.5 * q * stepBefore) && p > q * (low - middle) &&
                    p < q * (high - middle);
      if (isParabolic) offset = p / q;
    }
    stepBefore = isParabolic ? step : (middle < (low + high) / 2 ? high : low) - middle;
    step = isParabolic ? offset : kGolden * stepBefore;
    if (std::abs(step) < inTolerance) step = std::copysign(inTolerance, step);
    const double at = middle + step, there = inValueAt(at);
    if (there >= value) {
      (at >= middle ? low : high) = middle;
      third = second;
      thirdValue = secondValue;
      second = middle;
      secondValue = value;
      middle = at;
      value = there;
      continue;
    }
    (at < middle ? low : high) = at;
    if (there >= secondValue || second == middle) {
      third = second;
      thirdValue = secondValue;
      second = at;
      secondValue = there;
    } else if (there >= thirdValue || third == middle || third == second) {
      third = at;
      thirdValue = there;
    }
  }
  return {middle, value};
}

}  // namespace

/// The largest depth along a border; outside of the other body the nearest.
/// @param inWanted a depth below which no precision is asked for.
BodyPair::DeepPlace BodyPair::DeepestAlong(const BorderPlace& inPlace, double inStep,
                                           double inWanted) {
  Side &own = sides_[inPlace.side], &other = sides_[1 - inPlace.side];
  const BRepAdaptor_Curve& curve = own.probe.Tool(inPlace.face).Curve(inPlace.edge);
  gp_Pnt start;
  gp_Vec along;
  curve.D1(inPlace.parameter, start, along);
  const double speed = along.Magnitude();
  const double low = curve.FirstParameter(), high = curve.LastParameter();
  const bool isRing = curve.IsPeriodic() && high - low >= curve.Period() * (1 - 1e-9);
  const auto pointAt = [&](double at) {
    return Moved(own.commonFromThis, curve.Value(isRing ? at : std::clamp(at, low, high)).XYZ());
  };
  const auto depthAt = [&](double at) {
    return other.probe.DepthOf(Moved(other.thisFromCommon, pointAt(at))).value;
  };
  if (!(speed > 0)) return {pointAt(inPlace.parameter), depthAt(inPlace.parameter)};
  const Maximum deepest = MaximumAround(
      inPlace.parameter, inStep / speed, kFinest / speed, depthAt,
      [&](double depth, double width) { return depth + width * speed / 2 > inWanted; });
  return {pointAt(deepest.at), deepest.value};
}

/// The border of a near triangle on which a point lies.
std::optional<BodyPair::BorderPlace> BodyPair::BorderAt(std::size_t inSide,
                                                        std::uint32_t inTriangle,
                                                        const gp_XYZ& inCommonPoint) const {
  const Body& body = sides_[inSide].body();
  const BodyTriangle& triangle = body.triangles[inTriangle];
  const gp_XYZ point = Moved(sides_[inSide].thisFromCommon, inCommonPoint);
  const auto& edges = body.faces[triangle.face].edges;
  for (std::size_t i = 0; i < 3; ++i) {
    const std::uint32_t from = triangle.nodes[i], to = triangle.nodes[(i + 1) % 3];
    const gp_XYZ foot = ClosestOnSegment(point, body.nodes[from], body.nodes[to]);
    if ((foot - point).SquareModulus() > kRounding * kRounding) continue;
    for (std::size_t e = 0; e < edges.size(); ++e) {
      if (edges[e].isSeam) continue;
      const auto& nodes = edges[e].nodes;
      for (std::size_t k = 0; k + 1 < nodes.size(); ++k) {
        const bool isChord =
            (nodes[k] == from && nodes[k + 1] == to) || (nodes[k] == to && nodes[k + 1] == from);
        if (!isChord) continue;
        const gp_XYZ chord = body.nodes[nodes[k + 1]] - body.nodes[nodes[k]];
        const double share = (foot - body.nodes[nodes[k]]) * chord / chord.SquareModulus();
        return BorderPlace{
            inSide, triangle.face, static_cast<int>(e),
            edges[e].parameters[k] + share * (edges[e].parameters[k + 1] - edges[e].parameters[k])};
      }
    }
  }
  return std::nullopt;
}

/// Where an edge passes through another the part of it that lies inside may be shorter than any
/// step between samples. It begins where triangles cross or come nearest.
void BodyPair::ClimbAlongEdges() {
  if (!sides_[0].body().isExact || !sides_[1].body().isExact) return;
  std::map<std::array<std::size_t, 3>, std::size_t> climbsOf;
  std::size_t climbs = 0;
  for (const NearTriangles& near : near_) {
    if (near.lower > gap_ || climbs >= kMaxEdgeClimbs) break;
    std::array<gp_XYZ, 2> ends = near.closest;
    if (near.distance == 0) {
      const auto crossing =
          CrossingOf(CommonCorners(0, near.triangles[0]), CommonCorners(1, near.triangles[1]));
      if (!crossing) continue;
      ends = *crossing;
    }
    for (std::size_t side = 0; side < 2; ++side) {
      if (!sides_[1 - side].body().isSolid) continue;
      for (const gp_XYZ& end : ends) {
        const auto place = BorderAt(side, near.triangles[side], end);
        if (!place) continue;
        std::size_t& count = climbsOf[{side, place->face, static_cast<std::size_t>(place->edge)}];
        if (count == kMaxClimbsOfEdge) continue;
        ++count;
        ++climbs;
        const DeepPlace deepest = DeepestAlong(*place, options_.tolerance / 2, options_.tolerance);
        if (deepest.depth <= options_.tolerance) continue;
        samples_.push_back(SampleAt(side, deepest.point));
        if (IsClash(samples_.back())) return;
      }
    }
  }
}

/// From a deep point to the deepest on the border beside it.
void BodyPair::DeepenAlongEdge(Sample& ioSample) {
  Side& own = sides_[ioSample.side];
  if (!own.body().isExact || !sides_[1 - ioSample.side].body().isExact) return;
  const FaceFoot foot =
      own.probe.Tool(ioSample.face).BorderFoot(Moved(own.thisFromCommon, ioSample.point));
  if (foot.edge < 0 || foot.distance > kNearBorder * ioSample.depth.value) return;
  const BorderPlace place{ioSample.side, ioSample.face, foot.edge, foot.parameter};
  const DeepPlace deepest = DeepestAlong(place, 0.1 * ioSample.depth.value, ioSample.depth.value);
  if (deepest.depth <= ioSample.depth.value) return;
  const Sample deeper = SampleAt(ioSample.side, deepest.point);
  if (deeper.depth.foot.IsFound() && deeper.depth.value > ioSample.depth.value) ioSample = deeper;
}

/// From the closest points along the borders on which they lie.
void BodyPair::ApproachAlongEdges() {
  constexpr double kStep = 0.01;
  for (std::size_t side = 0; side < 2; ++side) {
    Side &own = sides_[side], &other = sides_[1 - side];
    if (!own.body().isExact || !other.body().isExact) return;
    const BodyFoot foot = own.probe.Nearest(Moved(own.thisFromCommon, closest_[side]));
    if (!foot.IsFound() || foot.foot.edge < 0) continue;
    const gp_XYZ point =
        DeepestAlong({side, foot.face, foot.foot.edge, foot.foot.parameter}, kStep, -kInfinity)
            .point;
    const BodyFoot there = other.probe.Nearest(Moved(other.thisFromCommon, point));
    if (!there.IsFound()) continue;
    const gp_XYZ opposite = Moved(other.commonFromThis, there.foot.point);
    if (side == 0)
      KeepDistance(point, opposite);
    else
      KeepDistance(opposite, point);
  }
}

}  // namespace ZORDetection
