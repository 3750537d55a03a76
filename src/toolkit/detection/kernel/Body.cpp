#include "toolkit/detection/kernel/Body.h"

#include <algorithm>
#include <map>
#include <unordered_map>

namespace ZORDetection {
namespace {

constexpr double kWeldShare = 1e-7;  // of a body's size

/// Directions that no edge of a drawing is likely to have.
const std::array<gp_XYZ, 7> kDirections{
    gp_XYZ(0.5139, 0.3127, 0.7988),  gp_XYZ(-0.2713, 0.8817, 0.3861),
    gp_XYZ(0.6317, -0.7111, 0.3087), gp_XYZ(-0.5711, -0.3373, -0.7484),
    gp_XYZ(0.1327, 0.2719, -0.9531), gp_XYZ(-0.8831, 0.4217, -0.2057),
    gp_XYZ(0.3391, -0.6173, -0.7099)};

/// Whether each edge is used as often in one direction as in the other.
bool IsClosedMesh(const Body& inBody, double inWeldTolerance) {
  const std::vector<std::uint32_t> welded = WeldPoints(inBody.nodes, inWeldTolerance);
  std::unordered_map<std::uint64_t, int> balance;
  for (const BodyTriangle& triangle : inBody.triangles)
    for (std::size_t i = 0; i < 3; ++i) {
      const std::uint32_t from = welded[triangle.nodes[i]],
                          to = welded[triangle.nodes[(i + 1) % 3]];
      if (from == to) continue;
      const std::uint64_t key =
          (static_cast<std::uint64_t>(std::min(from, to)) << 32U) | std::max(from, to);
      balance[key] += from < to ? 1 : -1;
    }
  return std::ranges::all_of(balance, [](const auto& entry) { return entry.second == 0; });
}

double VolumeOf(const Body& inBody) {
  if (inBody.nodes.empty()) return 0;
  const gp_XYZ origin = inBody.nodes.front();
  double sum = 0;
  for (std::uint32_t i = 0; i < inBody.triangles.size(); ++i) {
    const auto [a, b, c] = inBody.CornersOf(i);
    sum += (a - origin) * ((b - origin) ^ (c - origin)) / 6;
  }
  return sum;
}

/// How a ray meets a triangle, by the signs of volumes: neighbours compute the one of their common
/// edge from the same numbers, so that no ray slips through. Woop, Benthin, Wald: Watertight
/// Ray/Triangle Intersection, 2013.
enum class Hit { kNone, kFront, kUnclear };

Hit MeetRay(const gp_XYZ& inOrigin, const gp_XYZ& inDirection, const Corners& inTriangle) {
  const std::array<gp_XYZ, 3> to{inTriangle[0] - inOrigin, inTriangle[1] - inOrigin,
                                 inTriangle[2] - inOrigin};
  const auto side = [&](std::size_t i, std::size_t j) { return inDirection * (to[i] ^ to[j]); };
  const double u = side(0, 1), v = side(1, 2), w = side(2, 0);
  const bool isIn = (u >= 0 && v >= 0 && w >= 0) || (u <= 0 && v <= 0 && w <= 0);
  if (!isIn) return Hit::kNone;
  const double sum = u + v + w;
  const double along = to[2] * (to[0] ^ to[1]) / (sum == 0 ? 1 : sum);
  if (u == 0 || v == 0 || w == 0) {
    // Behind the origin it does not matter what is hit.
    return sum != 0 && along < 0 ? Hit::kNone : Hit::kUnclear;
  }
  return along > 0 ? Hit::kFront : Hit::kNone;
}

bool MeetsBox(const gp_XYZ& inOrigin, const gp_XYZ& inDirection, const Box& inBox) {
  double from = 0, to = std::numeric_limits<double>::infinity();
  for (int i = 1; i <= 3; ++i) {
    const double inverse = 1 / inDirection.Coord(i);
    double a = (inBox.low.Coord(i) - inOrigin.Coord(i)) * inverse;
    double b = (inBox.high.Coord(i) - inOrigin.Coord(i)) * inverse;
    if (a > b) std::swap(a, b);
    from = std::max(from, a - 1e-9 * std::abs(a));
    to = std::min(to, b + 1e-9 * std::abs(b));
  }
  return from <= to;
}

}  // namespace

std::vector<std::uint32_t> WeldPoints(const std::vector<gp_XYZ>& inPoints, double inTolerance) {
  std::vector<std::uint32_t> welded(inPoints.size());
  std::vector<std::uint32_t> order(inPoints.size());
  for (std::uint32_t i = 0; i < order.size(); ++i) order[i] = i;
  std::ranges::sort(order, [&](std::uint32_t a, std::uint32_t b) {
    return inPoints[a].X() != inPoints[b].X() ? inPoints[a].X() < inPoints[b].X() : a < b;
  });
  constexpr std::uint32_t kNone = ~0U;
  std::ranges::fill(welded, kNone);
  for (std::size_t i = 0; i < order.size(); ++i) {
    if (welded[order[i]] != kNone) continue;
    const gp_XYZ& point = inPoints[order[i]];
    welded[order[i]] = order[i];
    for (std::size_t j = i + 1; j < order.size(); ++j) {
      const gp_XYZ& other = inPoints[order[j]];
      if (other.X() - point.X() > inTolerance) break;
      if (welded[order[j]] == kNone && (other - point).SquareModulus() <= inTolerance * inTolerance)
        welded[order[j]] = order[i];
    }
  }
  return welded;
}

double Body::DeviationAt(std::uint32_t inTriangle, const gp_XYZ& inPoint) const {
  if (deviations.empty()) return 0;
  double largest = deviations[inTriangle];
  for (const std::uint32_t node : triangles[inTriangle].nodes)
    if ((nodes[node] - inPoint).SquareModulus() <= 1e-12)
      largest = std::max(largest, nodeDeviations[node]);
  return largest;
}

void Body::Finish() {
  Box nodesBox;
  if (!deviations.empty()) {
    nodeDeviations.assign(nodes.size(), 0);
    for (std::size_t i = 0; i < triangles.size(); ++i)
      for (const std::uint32_t node : triangles[i].nodes)
        nodeDeviations[node] = std::max(nodeDeviations[node], deviations[i]);
  }
  for (const gp_XYZ& node : nodes) nodesBox.Add(node);
  for (const BodyFace& face : faces) maxDeflection = std::max(maxDeflection, face.deflection);
  box = nodesBox.Grown(maxDeflection);
  isWatertight = IsClosedMesh(*this, kWeldShare * nodesBox.Diagonal());
  volume = isSolid ? VolumeOf(*this) : 0;
  if (volume < 0) {
    volume = -volume;
    for (BodyTriangle& triangle : triangles) std::swap(triangle.nodes[1], triangle.nodes[2]);
    for (BodyFace& face : faces) face.normalSign = -face.normalSign;
  }
  std::vector<Box> boxes(triangles.size());
  for (std::uint32_t i = 0; i < triangles.size(); ++i) {
    for (const gp_XYZ& corner : CornersOf(i)) boxes[i].Add(corner);
    boxes[i] = boxes[i].Grown(DeflectionOf(i));
  }
  tree.Build(boxes);
}

int Body::CrossingsAlong(const gp_XYZ& inPoint, const gp_XYZ& inDirection, bool& outIsClear) const {
  outIsClear = true;
  if (tree.IsEmpty()) return 0;
  int crossings = 0;
  std::array<std::uint32_t, 128> stack{};
  std::size_t size = 0;
  stack[size++] = 0;
  while (size != 0) {
    const std::uint32_t position = stack[--size];
    const TriangleTree::Node& node = tree.Nodes()[position];
    if (!MeetsBox(inPoint, inDirection, node.box)) continue;
    if (!node.IsLeaf()) {
      stack[size++] = node.first;
      stack[size++] = position + 1;
      continue;
    }
    for (const std::uint32_t triangle : tree.Items(node)) {
      const Hit hit = MeetRay(inPoint, inDirection, CornersOf(triangle));
      if (hit == Hit::kFront) ++crossings;
      if (hit == Hit::kUnclear) outIsClear = false;
    }
  }
  return crossings;
}

bool Body::Encloses(const gp_XYZ& inPoint) const {
  if (!isSolid || box.SquareDistance(inPoint) > 0) return false;
  // A ray may slip through a cracked mesh: several vote.
  const int wanted = isWatertight ? 1 : 5;
  int votes = 0, inside = 0;
  for (const gp_XYZ& direction : kDirections) {
    bool isClear = true;
    const int crossings = CrossingsAlong(inPoint, direction, isClear);
    if (!isClear) continue;
    ++votes;
    if (crossings % 2 != 0) ++inside;
    if (votes == wanted) break;
  }
  return 2 * inside > votes;
}

}  // namespace ZORDetection
