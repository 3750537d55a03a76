// How deep one body lies in the other.
#include <queue>

#include "toolkit/detection/kernel/BodyPair.h"

namespace ZORDetection {

/// A depth within the tolerances that the file gives its faces and edges is none.
double BodyPair::AllowedDepth(const Sample& inSample) const {
  double allowed = options_.tolerance;
  const Body &own = sides_[inSample.side].body(), &other = sides_[1 - inSample.side].body();
  const auto addFace = [&](const Body& body, std::uint32_t face, const gp_XYZ& point) {
    const BodyFace& of = body.faces[face];
    allowed = std::max(allowed, of.tolerance);
    for (const BorderEdge& edge : of.edges) {
      if (edge.tolerance <= allowed) continue;
      for (std::size_t i = 0; i + 1 < edge.nodes.size(); ++i) {
        const gp_XYZ foot =
            ClosestOnSegment(point, body.nodes[edge.nodes[i]], body.nodes[edge.nodes[i + 1]]);
        if ((foot - point).Modulus() <= edge.tolerance + edge.deflection) {
          allowed = edge.tolerance;
          break;
        }
      }
    }
  };
  const gp_XYZ point = Moved(sides_[inSample.side].thisFromCommon, inSample.point);
  const BodyFoot& foot = inSample.depth.foot;
  addFace(own, inSample.face, point);
  addFace(other, foot.face, foot.foot.point);
  return std::max(allowed, own.DeviationAt(inSample.triangle, point) +
                               other.DeviationAt(foot.triangle, foot.foot.point));
}

bool BodyPair::IsClash(const Sample& inSample) const {
  return inSample.depth.value > options_.tolerance + kRounding &&
         inSample.depth.value > AllowedDepth(inSample) + kRounding;
}

/// Best-first search with the triangles' depths, which change no faster than the point moves. Gives
/// points from which to climb exactly.
void BodyPair::CollectDeep(std::size_t inSide, std::vector<gp_XYZ>& outStarts) {
  constexpr int kMaxTries = 200;
  constexpr double kShare = 0.05;
  const Side &self = sides_[inSide], &other = sides_[1 - inSide];
  const Body& body = self.body();
  if (body.tree.IsEmpty()) return;
  struct Region {
    double bound;
    std::int64_t node;  // or -1: the triangle below
    Corners corners;    // in this side's frame
    bool operator<(const Region& inOther) const { return bound < inOther.bound; }
  };
  const auto depthAt = [&](const gp_XYZ& point) {
    return other.probe.MeshDepthOf(Moved(other.thisFromCommon, Moved(self.commonFromThis, point)),
                                   kInfinity);
  };
  std::priority_queue<Region> regions;
  double best = std::max(best_.depth.value, 0.0);
  const auto limit = [&best, this] {
    return best + std::max(kShare * best, options_.tolerance / 10);
  };
  std::vector<std::pair<double, gp_XYZ>> found;
  int tries = 0;
  const auto addNode = [&](std::uint32_t node) {
    const Box& box = body.tree.Nodes()[node].box;
    const double bound = depthAt(box.Centre()) + box.Diagonal() / 2;
    ++tries;
    if (bound > limit()) regions.push({bound, node, {}});
  };
  const auto addTriangle = [&](const Corners& corners) {
    const gp_XYZ centre = (corners[0] + corners[1] + corners[2]) / 3;
    double radius = 0;
    for (const gp_XYZ& corner : corners) radius = std::max(radius, (corner - centre).Modulus());
    const double depth = depthAt(centre);
    ++tries;
    if (depth > 0.7 * best && depth > 0) found.emplace_back(depth, centre);
    best = std::max(best, depth);
    if (depth + radius > limit()) regions.push({depth + radius, -1, corners});
  };
  addNode(0);
  while (!regions.empty() && tries < kMaxTries) {
    const Region region = regions.top();
    regions.pop();
    if (region.bound <= limit()) break;
    if (region.node < 0) {
      // Across the longest edge, so that slivers do not stay slivers.
      std::size_t longest = 0;
      double square = -1;
      for (std::size_t i = 0; i < 3; ++i) {
        const double length = (region.corners[(i + 1) % 3] - region.corners[i]).SquareModulus();
        if (length > square) longest = i;
        square = std::max(square, length);
      }
      const gp_XYZ &a = region.corners[longest], &b = region.corners[(longest + 1) % 3];
      const gp_XYZ& c = region.corners[(longest + 2) % 3];
      addTriangle({a, (a + b) / 2, c});
      addTriangle({(a + b) / 2, b, c});
      continue;
    }
    const auto position = static_cast<std::uint32_t>(region.node);
    const TriangleTree::Node& node = body.tree.Nodes()[position];
    if (!node.IsLeaf()) {
      addNode(position + 1);
      addNode(node.first);
      continue;
    }
    for (const std::uint32_t triangle : body.tree.Items(node))
      addTriangle(body.CornersOf(triangle));
  }
  std::ranges::stable_sort(found, [](const auto& a, const auto& b) { return a.first > b.first; });
  for (const auto& [depth, point] : found) {
    if (outStarts.size() >= 2 || depth < 0.8 * found.front().first) break;
    const gp_XYZ common = Moved(self.commonFromThis, point);
    const double apart = 0.5 * depth;
    const bool isNew = std::ranges::all_of(
        outStarts, [&](const gp_XYZ& start) { return (start - common).Modulus() > apart; });
    if (isNew) outStarts.push_back(common);
  }
}

void BodyPair::FindDeepest(std::size_t inSide) {
  if (!sides_[1 - inSide].body().isSolid) return;
  std::vector<Sample> starts;
  std::vector<gp_XYZ> deep;
  CollectDeep(inSide, deep);
  for (const gp_XYZ& point : deep) starts.push_back(SampleAt(inSide, point));
  const Sample* best = nullptr;
  for (const Sample& sample : samples_)
    if (sample.side == inSide && sample.depth.foot.IsFound() &&
        (best == nullptr || sample.depth.value > best->depth.value))
      best = &sample;
  if (best != nullptr) starts.push_back(*best);
  for (const Sample& start : starts) {
    if (!start.depth.foot.IsFound()) continue;
    const double scale = std::max(start.depth.value, options_.tolerance);
    Sample top = Climb(start, 0.5 * scale, 150);
    DeepenAlongEdge(top);
    if (top.depth.value > best_.depth.value) best_ = top;
  }
}

Verdict BodyPair::ClashVerdict() {
  Verdict verdict;
  verdict.kind = Kind::kClash;
  verdict.depth = best_.depth.value;
  verdict.points = {best_.point,
                    Moved(sides_[1 - best_.side].commonFromThis, best_.depth.foot.foot.point)};
  verdict.isSheetInSolid = !sides_[0].body().isSolid || !sides_[1].body().isSolid;
  AddPrecision(verdict);
  if (options_.withCurves) AddCrossingCurve(verdict);
  return verdict;
}

bool BodyPair::IsDuplicate() const {
  const Body &first = sides_[0].body(), &second = sides_[1].body();
  Box a, b;
  for (const gp_XYZ& node : first.nodes) a.Add(node);
  for (const gp_XYZ& node : second.nodes) b.Add(Moved(sides_[1].commonFromThis, node));
  const double slack = options_.tolerance + first.maxDeflection + second.maxDeflection;
  return (a.low - b.low).Modulus() <= 2 * slack && (a.high - b.high).Modulus() <= 2 * slack &&
         std::abs(first.volume - second.volume) <= 0.02 * std::max(first.volume, second.volume);
}

}  // namespace ZORDetection
