// Samples of one body's boundary, and their depths in the other body.
#include <map>
#include <set>

#include "toolkit/detection/kernel/BodyPair.h"

namespace ZORDetection {
namespace {

constexpr std::size_t kMaxTriangles = 60;  // sampled of each side
constexpr std::size_t kMaxCrossings = 24;  // stepped off
constexpr std::size_t kMaxClimbs = 8;
constexpr int kShortClimb = 60;  // tries, to tell clash from contact
constexpr int kLevel = 3;        // samples of depth 0 that make a patch
constexpr double kFinestStep = 1e-4;

/// Two directions across a third.
std::array<gp_XYZ, 2> Across(const gp_XYZ& inNormal) {
  const gp_XYZ helper = std::abs(inNormal.X()) < 0.7 ? gp_XYZ(1, 0, 0) : gp_XYZ(0, 1, 0);
  const gp_XYZ first = UnitOf(inNormal ^ helper);
  return {first, inNormal ^ first};
}

}  // namespace

std::optional<gp_XYZ> BodyPair::BoundaryPoint(std::size_t inSide, std::uint32_t inTriangle,
                                              const std::array<double, 3>& inWeights, bool inIsNode,
                                              gp_XY& outParameters) {
  const Body& body = sides_[inSide].body();
  const BodyTriangle& triangle = body.triangles[inTriangle];
  gp_XYZ point(0, 0, 0);
  outParameters = gp_XY(0, 0);
  for (std::size_t i = 0; i < 3; ++i) {
    point += body.nodes[triangle.nodes[i]] * inWeights[i];
    if (body.isExact) outParameters += body.parameters[triangle.nodes[i]] * inWeights[i];
  }
  if (!body.isExact || inIsNode) return point;
  FaceTool& tool = sides_[inSide].probe.Tool(triangle.face);
  point = tool.ValueAt(outParameters);
  if (!tool.IsInTrims(point, outParameters)) return std::nullopt;
  return point;
}

void BodyPair::AddSample(std::size_t inSide, std::uint32_t inTriangle,
                         const std::array<double, 3>& inWeights, bool inIsNode) {
  Sample sample;
  const auto point = BoundaryPoint(inSide, inTriangle, inWeights, inIsNode, sample.parameters);
  if (!point) return;
  const Body& body = sides_[inSide].body();
  sample.side = inSide;
  sample.point = Moved(sides_[inSide].commonFromThis, *point);
  sample.triangle = inTriangle;
  sample.face = body.triangles[inTriangle].face;
  sample.isOnEdge = inIsNode;
  const auto [a, b, c] = CommonCorners(inSide, inTriangle);
  sample.normal = UnitOf((b - a) ^ (c - a));
  const Side& other = sides_[1 - inSide];
  sample.depth = other.probe.DepthOf(Moved(other.thisFromCommon, sample.point));
  samples_.push_back(sample);
}

void BodyPair::SampleTriangle(std::size_t inSide, std::uint32_t inTriangle) {
  AddSample(inSide, inTriangle, {1. / 3, 1. / 3, 1. / 3}, false);
}

/// Steps to both sides of a crossing, on either triangle: one of them leads inside.
void BodyPair::SampleCrossing(const NearTriangles& inNear) {
  const std::array<Corners, 2> corners{CommonCorners(0, inNear.triangles[0]),
                                       CommonCorners(1, inNear.triangles[1])};
  const auto crossing = CrossingOf(corners[0], corners[1]);
  if (!crossing) return;
  const gp_XYZ middle = ((*crossing)[0] + (*crossing)[1]) * 0.5;
  const gp_XYZ along = UnitOf((*crossing)[1] - (*crossing)[0]);
  for (std::size_t side = 0; side < 2; ++side) {
    const auto& [a, b, c] = corners[side];
    const gp_XYZ normal = UnitOf((b - a) ^ (c - a));
    const gp_XYZ across = normal ^ along;
    const double size = std::max({(b - a).Modulus(), (c - b).Modulus(), (a - c).Modulus()});
    for (const double step :
         {3 * options_.tolerance, 0.1 * size, -3 * options_.tolerance, -0.1 * size}) {
      const auto weights = BarycentricOf(middle + across * step, corners[side]);
      if (std::ranges::any_of(weights, [](double weight) { return weight < 0; })) continue;
      AddSample(side, inNear.triangles[side], weights, false);
    }
  }
}

void BodyPair::SampleNear() {
  using FacePair = std::pair<std::uint32_t, std::uint32_t>;
  std::array<std::map<std::uint32_t, std::set<std::uint32_t>>, 2> byFace;
  std::map<FacePair, std::vector<const NearTriangles*>> crossings;
  std::size_t crossingCount = 0;
  for (const NearTriangles& near : near_) {
    if (near.lower > gap_) continue;
    FacePair faces;
    for (std::size_t side = 0; side < 2; ++side) {
      const std::uint32_t face = sides_[side].body().triangles[near.triangles[side]].face;
      byFace[side][face].insert(near.triangles[side]);
      (side == 0 ? faces.first : faces.second) = face;
    }
    if (near.distance == 0) {
      crossings[faces].push_back(&near);
      ++crossingCount;
    }
  }
  for (std::size_t side = 0; side < 2; ++side) {
    const std::size_t share = std::max<std::size_t>(4, kMaxTriangles / (byFace[side].size() + 1));
    for (const auto& [face, triangles] : byFace[side]) {
      const std::vector<std::uint32_t> all(triangles.begin(), triangles.end());
      std::set<std::uint32_t> nodes;
      for (const std::uint32_t triangle : Thinned(all, share)) {
        SampleTriangle(side, triangle);
        for (std::size_t k = 0; k < 3; ++k) {
          if (!nodes.insert(sides_[side].body().triangles[triangle].nodes[k]).second) continue;
          std::array<double, 3> weights{};
          weights[k] = 1;
          AddSample(side, triangle, weights, true);
        }
      }
    }
  }
  const std::size_t share = std::max<std::size_t>(2, kMaxCrossings / (crossings.size() + 1));
  for (const auto& [faces, list] : crossings)
    for (const NearTriangles* near : Thinned(list, share)) SampleCrossing(*near);
}

Sample BodyPair::SampleAt(std::size_t inSide, const gp_XYZ& inCommonPoint) {
  Side& self = sides_[inSide];
  Side& other = sides_[1 - inSide];
  const BodyFoot own = self.probe.Nearest(Moved(self.thisFromCommon, inCommonPoint));
  Sample sample;
  sample.side = inSide;
  sample.point = Moved(self.commonFromThis, own.foot.point);
  sample.face = own.face;
  sample.parameters = own.foot.parameters;
  sample.triangle = own.triangle;
  sample.isOnEdge = own.foot.edge >= 0;
  sample.normal = UnitOf(Turned(self.commonFromThis, own.normal));
  sample.depth = other.probe.DepthOf(Moved(other.thisFromCommon, sample.point));
  return sample;
}

/// Compass search over the boundary. The compass turns, so that it also finds its way along ridges;
/// where it stops at a finer step it has come along one, and goes on in that direction (Hooke,
/// Jeeves: Direct search, 1961).
Sample BodyPair::Climb(Sample inStart, double inStep, int inMaxTries) {
  constexpr int kTurns = 8;
  constexpr double kTurn = 0.35, kStretch = 1.6;
  Sample best = inStart;
  gp_XYZ lastStop = best.point;
  double step = inStep, offset = 0;
  while (step > kFinestStep && inMaxTries > 0) {
    const gp_XYZ normal = best.normal.Modulus() > 0 ? best.normal : gp_XYZ(0, 0, 1);
    const auto [x, y] = Across(normal);
    bool isBetter = false;
    for (int k = 0; k < kTurns && !isBetter; ++k, --inMaxTries) {
      const double angle = offset + k * 2 * M_PI / kTurns;
      const Sample next =
          SampleAt(best.side, best.point + (x * std::cos(angle) + y * std::sin(angle)) * step);
      if (!next.depth.foot.IsFound() || next.depth.value <= best.depth.value + 1e-9) continue;
      isBetter = true;
      best = next;
      offset = angle;
    }
    if (isBetter) {
      step *= kStretch;
      continue;
    }
    const gp_XYZ start = best.point, way = start - lastStop;
    lastStop = start;
    for (double times = 1; way.Modulus() > 0 && inMaxTries > 0; times *= 2, --inMaxTries) {
      const Sample next = SampleAt(best.side, start + way * times);
      if (!next.depth.foot.IsFound() || next.depth.value <= best.depth.value + 1e-9) break;
      best = next;
    }
    step *= 0.5;
    offset += kTurn;
  }
  return best;
}

/// The deepest sample of each pair of faces leads on to the deepest point around it.
void BodyPair::ClimbFromBestOfFaces() {
  std::map<std::array<std::uint32_t, 3>, std::size_t> bestOf;
  std::map<std::array<std::uint32_t, 3>, int> levels;
  for (std::size_t i = 0; i < samples_.size(); ++i) {
    const Sample& sample = samples_[i];
    if (!sample.depth.foot.IsFound()) continue;
    const std::array<std::uint32_t, 3> faces{static_cast<std::uint32_t>(sample.side), sample.face,
                                             sample.depth.foot.face};
    if (std::abs(sample.depth.value) < kRounding) ++levels[faces];
    const auto [place, isNew] = bestOf.try_emplace(faces, i);
    if (!isNew && sample.depth.value > samples_[place->second].depth.value) place->second = i;
  }
  std::vector<std::size_t> starts;
  std::map<std::size_t, int> levelCounts;
  for (const auto& [faces, sample] : bestOf) {
    starts.push_back(sample);
    levelCounts[sample] = levels[faces];
  }
  std::ranges::sort(starts, [this](std::size_t a, std::size_t b) {
    const double x = samples_[a].depth.value, y = samples_[b].depth.value;
    return x != y ? x > y : a < b;
  });
  std::size_t climbs = 0;
  for (const std::size_t start : starts) {
    const Sample sample = samples_[start];
    const Body &own = sides_[sample.side].body(), &other = sides_[1 - sample.side].body();
    const bool isFlat = (!own.isExact || own.faces[sample.face].isPlane) &&
                        (!other.isExact || other.faces[sample.depth.foot.face].isPlane);
    // Between planes the corners, which were sampled, are deepest; where faces lie upon each other
    // all of them are level.
    if ((isFlat || levelCounts[start] >= kLevel) && !IsClash(sample)) continue;
    if (++climbs > kMaxClimbs) break;
    Sample top;
    if (StepToTangency(sample, top)) {
      samples_.push_back(top);
    } else {
      const auto [a, b, c] = CommonCorners(sample.side, sample.triangle);
      const double size = std::sqrt(((b - a) ^ (c - a)).Modulus());
      samples_.push_back(Climb(sample, std::max(0.1 * size, 10 * kFinestStep), kShortClimb));
    }
    if (IsClash(samples_.back())) return;
  }
}

}  // namespace ZORDetection
