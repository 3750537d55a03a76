#include "toolkit/detection/kernel/BodyProbe.h"

namespace ZORDetection {
namespace {

constexpr double kSamePoint = 1e-7;
constexpr double kClearlyBelow = 0.5;  // cosine

}  // namespace

FaceTool& BodyProbe::Tool(std::uint32_t inFace) {
  auto& tool = tools_[inFace];
  if (!tool) tool = std::make_unique<FaceTool>(body_, inFace);
  return *tool;
}

gp_XYZ BodyProbe::NormalOf(std::uint32_t inTriangle) const {
  const auto [a, b, c] = body_.CornersOf(inTriangle);
  const gp_XYZ normal = (b - a) ^ (c - a);
  const double size = normal.Modulus();
  return size > 0 ? normal / size : gp_XYZ(0, 0, 0);
}

gp_XY BodyProbe::GuessAt(const Candidate& inCandidate) const {
  const auto weights = BarycentricOf(inCandidate.point, body_.CornersOf(inCandidate.triangle));
  gp_XY guess(0, 0);
  for (std::size_t i = 0; i < 3; ++i)
    guess += body_.parameters[body_.triangles[inCandidate.triangle].nodes[i]] * weights[i];
  return guess;
}

/// The face's where it has one, else the triangle's.
gp_XYZ BodyProbe::NormalAt(const Candidate& inCandidate, const FaceFoot& inFoot) {
  if (body_.isExact)
    if (const auto exact = Tool(inCandidate.face).NormalAt(inFoot.parameters)) return *exact;
  return NormalOf(inCandidate.triangle);
}

/// All faces that may hold the nearest point, each with its nearest triangle.
void BodyProbe::CollectFaces(const gp_XYZ& inPoint, double inBound,
                             std::vector<Candidate>& outFaces) const {
  outFaces.clear();
  if (body_.tree.IsEmpty()) return;
  double bound = inBound;  // the nearest point is at most this far away
  struct Entry {
    std::uint32_t node;
    double square;
  };
  std::array<Entry, 128> stack{};
  std::size_t size = 0;
  const auto& nodes = body_.tree.Nodes();
  stack[size++] = {0, nodes[0].box.SquareDistance(inPoint)};
  while (size != 0) {
    const Entry entry = stack[--size];
    if (entry.square > bound * bound) continue;
    const TriangleTree::Node& node = nodes[entry.node];
    if (!node.IsLeaf()) {
      Entry first{entry.node + 1, nodes[entry.node + 1].box.SquareDistance(inPoint)};
      Entry second{node.first, nodes[node.first].box.SquareDistance(inPoint)};
      if (first.square < second.square) std::swap(first, second);
      stack[size++] = first;
      stack[size++] = second;
      continue;
    }
    for (const std::uint32_t triangle : body_.tree.Items(node)) {
      const gp_XYZ foot = ClosestOnTriangle(inPoint, body_.CornersOf(triangle));
      const double distance = (foot - inPoint).Modulus();
      const std::uint32_t face = body_.triangles[triangle].face;
      const double deflection = body_.faces[face].deflection;
      if (distance - deflection > bound) continue;
      bound = std::min(bound, distance + deflection + kSamePoint);
      const auto known = std::ranges::find(outFaces, face, &Candidate::face);
      if (known == outFaces.end())
        outFaces.push_back({face, triangle, distance, foot});
      else if (distance < known->distance)
        *known = {face, triangle, distance, foot};
    }
  }
  std::erase_if(outFaces, [&](const Candidate& face) {
    return face.distance - body_.faces[face.face].deflection > bound;
  });
  std::ranges::sort(outFaces, [](const Candidate& a, const Candidate& b) {
    return a.distance != b.distance ? a.distance < b.distance : a.face < b.face;
  });
}

BodyFoot BodyProbe::Nearest(const gp_XYZ& inPoint, double inBound) {
  CollectFaces(inPoint, inBound, candidates_);
  BodyFoot best;
  for (const Candidate& candidate : candidates_) {
    const double deflection = body_.faces[candidate.face].deflection;
    if (candidate.distance - deflection > best.distance + kSamePoint) continue;
    FaceFoot foot;
    if (body_.isExact) {
      foot = Tool(candidate.face).Foot(inPoint, GuessAt(candidate));
    } else {
      foot.point = candidate.point;
      foot.distance = candidate.distance;
    }
    if (foot.distance > inBound) continue;
    const bool isSame =
        best.IsFound() && (foot.point - best.foot.point).SquareModulus() < kSamePoint * kSamePoint;
    if (!isSame && foot.distance >= best.distance) continue;
    const gp_XYZ normal = NormalAt(candidate, foot);
    if (isSame) best.normal += normal;
    if (foot.distance >= best.distance) continue;
    best.foot = foot;
    best.face = candidate.face;
    best.triangle = candidate.triangle;
    best.distance = foot.distance;
    if (!isSame) best.normal = normal;
  }
  for (const Candidate& candidate : candidates_) {
    const double deflection = body_.faces[candidate.face].deflection;
    if (candidate.distance - deflection <= best.distance)
      best.meshError = std::max(best.meshError, deflection);
  }
  return best;
}

bool BodyProbe::IsInside(const gp_XYZ& inPoint, const BodyFoot& inFoot) const {
  if (!body_.isSolid) return false;
  if (!body_.isExact) return body_.Encloses(inPoint);
  // Beyond their deflection the triangles know.
  if (inFoot.distance > 2 * inFoot.meshError + 1e-6) return body_.Encloses(inPoint);
  const gp_XYZ away = inPoint - inFoot.foot.point;
  const double scale = away.Modulus() * inFoot.normal.Modulus();
  // Baerentzen, Aanaes: Signed distance computation using the angle weighted pseudonormal, 2005.
  // Where edges have an error one of their faces may be missing from the normal.
  return scale > 0 && away * inFoot.normal < -kClearlyBelow * scale;
}

Depth BodyProbe::DepthOf(const gp_XYZ& inPoint) {
  Depth depth;
  depth.foot = Nearest(inPoint);
  depth.value = IsInside(inPoint, depth.foot) ? depth.foot.distance : -depth.foot.distance;
  return depth;
}

double BodyProbe::MeshDepthOf(const gp_XYZ& inPoint, double inBound) const {
  if (body_.tree.IsEmpty()) return -inBound;
  const auto& nodes = body_.tree.Nodes();
  struct Entry {
    std::uint32_t node;
    double square;
  };
  std::array<Entry, 128> stack{};
  std::size_t size = 0;
  double best = inBound * inBound;
  stack[size++] = {0, nodes[0].box.SquareDistance(inPoint)};
  while (size != 0) {
    const Entry entry = stack[--size];
    if (entry.square >= best) continue;
    const TriangleTree::Node& node = nodes[entry.node];
    if (node.IsLeaf()) {
      for (const std::uint32_t triangle : body_.tree.Items(node))
        best = std::min(
            best,
            (ClosestOnTriangle(inPoint, body_.CornersOf(triangle)) - inPoint).SquareModulus());
      continue;
    }
    Entry first{entry.node + 1, nodes[entry.node + 1].box.SquareDistance(inPoint)};
    Entry second{node.first, nodes[node.first].box.SquareDistance(inPoint)};
    if (first.square < second.square) std::swap(first, second);
    stack[size++] = first;
    stack[size++] = second;
  }
  const double distance = std::sqrt(best);
  return body_.Encloses(inPoint) ? distance : -distance;
}

}  // namespace ZORDetection
