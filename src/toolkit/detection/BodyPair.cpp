#include "toolkit/detection/BodyPair.h"

#include <map>
#include <queue>
#include <set>

namespace ZORDetection {
namespace {

constexpr double kInfinity = std::numeric_limits<double>::infinity();
constexpr std::size_t kMaxTriangles = 60;  // sampled of each side
constexpr std::size_t kMaxCrossings = 24;  // stepped off
constexpr std::size_t kMaxClimbs = 8;
constexpr int kShortClimb = 60;     // tries, to tell clash from contact
constexpr int kLevel = 3;           // samples of depth 0 that make a patch
constexpr double kRounding = 1e-7;  // of what was computed, millimetres
constexpr double kFinestStep = 1e-4;

/// Two directions across a third.
std::array<gp_XYZ, 2> Across(const gp_XYZ& inNormal) {
  const gp_XYZ helper = std::abs(inNormal.X()) < 0.7 ? gp_XYZ(1, 0, 0) : gp_XYZ(0, 1, 0);
  const gp_XYZ first = UnitOf(inNormal ^ helper);
  return {first, inNormal ^ first};
}

/// Evenly spread members of a list, all of a short one.
template <typename Item>
std::vector<Item> Thinned(const std::vector<Item>& inItems, std::size_t inMax) {
  if (inItems.size() <= inMax) return inItems;
  std::vector<Item> thinned;
  for (std::size_t i = 0; i < inMax; ++i) thinned.push_back(inItems[i * inItems.size() / inMax]);
  return thinned;
}

}  // namespace

BodyPair::BodyPair(BodyProbe& ioFirst, BodyProbe& ioSecond, const gp_Trsf& inFirstFromSecond,
                   double inPointPrecision, const Options& inOptions)
    : sides_{Side{ioFirst, gp_Trsf(), gp_Trsf()},
             Side{ioSecond, inFirstFromSecond, inFirstFromSecond.Inverted()}},
      options_(inOptions),
      gap_(inOptions.contactGap + inPointPrecision),
      reach_(std::max(gap_, inOptions.clearance)),
      upper_(kInfinity),
      distance_(kInfinity) {}

Corners BodyPair::CommonCorners(std::size_t inSide, std::uint32_t inTriangle) const {
  Corners corners = sides_[inSide].body().CornersOf(inTriangle);
  if (inSide != 0)
    for (gp_XYZ& corner : corners) sides_[inSide].commonFromThis.Transforms(corner);
  return corners;
}

void BodyPair::MeetLeaves(const TriangleTree::Node& inFirst, const TriangleTree::Node& inSecond) {
  const Body &first = sides_[0].body(), &second = sides_[1].body();
  for (const std::uint32_t b : second.tree.Items(inSecond)) {
    const Corners cornersOfB = CommonCorners(1, b);
    for (const std::uint32_t a : first.tree.Items(inFirst)) {
      const double slack = first.DeflectionOf(a) + second.DeflectionOf(b);
      const double cutOff = CutOff() + slack;
      const ClosestPoints closest =
          ClosestOfTriangles(first.CornersOf(a), cornersOfB, cutOff * cutOff);
      if (closest.squareDistance > cutOff * cutOff) continue;
      const double distance = std::sqrt(closest.squareDistance);
      upper_ = std::min(upper_, distance + slack);
      near_.push_back({{a, b}, distance, distance - slack, {closest.first, closest.second}});
    }
  }
}

void BodyPair::CollectNear() {
  const auto &firstNodes = sides_[0].body().tree.Nodes(),
             &secondNodes = sides_[1].body().tree.Nodes();
  if (firstNodes.empty() || secondNodes.empty()) return;
  const gp_Trsf& motion = sides_[1].commonFromThis;
  struct Entry {
    std::uint32_t first, second;
    double square;
    Box secondBox;
  };
  std::vector<Entry> stack;
  const auto push = [&](std::uint32_t first, std::uint32_t second, const Box& secondBox) {
    stack.push_back({first, second, firstNodes[first].box.SquareDistance(secondBox), secondBox});
  };
  push(0, 0, secondNodes[0].box.Moved(motion));
  while (!stack.empty()) {
    const Entry entry = stack.back();
    stack.pop_back();
    if (entry.square > CutOff() * CutOff()) continue;
    const TriangleTree::Node &a = firstNodes[entry.first], &b = secondNodes[entry.second];
    if (a.IsLeaf() && b.IsLeaf()) {
      MeetLeaves(a, b);
      continue;
    }
    const bool splitsFirst = b.IsLeaf() || (!a.IsLeaf() && a.box.Diagonal() > b.box.Diagonal());
    const std::size_t before = stack.size();
    if (splitsFirst) {
      push(entry.first + 1, entry.second, entry.secondBox);
      push(a.first, entry.second, entry.secondBox);
    } else {
      push(entry.first, entry.second + 1, secondNodes[entry.second + 1].box.Moved(motion));
      push(entry.first, b.first, secondNodes[b.first].box.Moved(motion));
    }
    // The nearer pair first, so that the cut-off shrinks early.
    if (stack[before].square < stack[before + 1].square)
      std::swap(stack[before], stack[before + 1]);
  }
  const double cutOff = CutOff();
  std::erase_if(near_, [cutOff](const NearTriangles& near) { return near.lower > cutOff; });
  std::ranges::sort(near_, [](const NearTriangles& x, const NearTriangles& y) {
    return x.lower != y.lower ? x.lower < y.lower : x.triangles < y.triangles;
  });
}

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

/// Compass search over the boundary. The compass turns, so that it also finds its way along ridges.
Sample BodyPair::Climb(Sample inStart, double inStep, int inMaxTries) {
  constexpr int kDirections = 8;
  constexpr double kTurn = 0.35, kStretch = 1.6;
  Sample best = inStart;
  double step = inStep, offset = 0;
  while (step > kFinestStep && inMaxTries > 0) {
    const gp_XYZ normal = best.normal.Modulus() > 0 ? best.normal : gp_XYZ(0, 0, 1);
    const auto [x, y] = Across(normal);
    bool isBetter = false;
    for (int k = 0; k < kDirections && !isBetter; ++k, --inMaxTries) {
      const double angle = offset + k * 2 * M_PI / kDirections;
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
    // Between planes the corners, which were sampled, are deepest; where faces lie upon each other all
    // of them are level.
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

/// A file that allows its edges an error does not mean what is within it.
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

/// Where boundaries coincide with equal outward normals both bodies lie on one side of them: a step
/// inwards shows how much they share.
bool BodyPair::SharesInside() {
  if (!sides_[0].body().isSolid || !sides_[1].body().isSolid) return false;
  std::vector<const Sample*> same;
  for (const Sample& sample : samples_) {
    if (sample.isOnEdge || std::abs(sample.depth.value) > options_.tolerance) continue;
    if (sample.depth.foot.foot.edge >= 0) continue;
    const gp_XYZ other =
        UnitOf(Turned(sides_[1 - sample.side].commonFromThis, sample.depth.foot.normal));
    if (other * sample.normal > 0.9) same.push_back(&sample);
  }
  for (const Sample* sample : Thinned(same, 12)) {
    const gp_XYZ probe = sample->point - sample->normal * (3 * options_.tolerance);
    double depth = kInfinity;
    for (Side& side : sides_)
      depth = std::min(depth, side.probe.DepthOf(Moved(side.thisFromCommon, probe)).value);
    if (depth > options_.tolerance) {
      best_ = *sample;
      return true;
    }
  }
  return false;
}

std::optional<Verdict> BodyPair::JudgeTouching() {
  SampleNear();
  const auto deeper = [](const Sample& a, const Sample& b) {
    return a.depth.value < b.depth.value;
  };
  const auto hasClash = [this] {
    return std::ranges::any_of(samples_, [this](const Sample& sample) { return IsClash(sample); });
  };
  bool isClash = hasClash();
  if (!isClash) {
    ClimbFromBestOfFaces();
    isClash = hasClash();
  }
  if (isClash) {
    best_ = *std::ranges::max_element(samples_, deeper);
    FindDeepest(0);
    FindDeepest(1);
    return ClashVerdict();
  }
  if (SharesInside()) {
    if (!samples_.empty()) {
      const Sample& deepest = *std::ranges::max_element(samples_, deeper);
      if (deepest.depth.value > 0) best_ = deepest;
    }
    best_.depth.value = std::max(best_.depth.value, 0.0);
    Verdict verdict = ClashVerdict();
    verdict.isDuplicate = IsDuplicate();
    return verdict;
  }
  for (const Sample& sample : samples_) {
    if (!sample.depth.foot.IsFound()) continue;
    const gp_XYZ foot = Moved(sides_[1 - sample.side].commonFromThis, sample.depth.foot.foot.point);
    if (sample.side == 0)
      KeepDistance(sample.point, foot);
    else
      KeepDistance(foot, sample.point);
  }
  const auto deepest = std::ranges::max_element(samples_, deeper);
  if (deepest != samples_.end() && deepest->depth.value > 0) {
    distance_ = 0;
    closest_ = {deepest->point, deepest->point};
  }
  for (const NearTriangles& near : near_) {
    if (distance_ <= gap_ || near.distance > 0) break;
    gp_XYZ point = near.closest[0];
    if (MoveOntoBoth(near, point) && IsOnBoth(point, gap_)) KeepDistance(point, point);
  }
  if (distance_ > gap_) FindDistance();
  return DistanceVerdict();
}

bool BodyPair::IsContained(std::size_t inSide) const {
  const Side &self = sides_[inSide], &other = sides_[1 - inSide];
  if (!other.body().isSolid || self.body().nodes.empty()) return false;
  const gp_XYZ point = Moved(self.commonFromThis, self.body().nodes.front());
  return other.body().Encloses(Moved(other.thisFromCommon, point));
}

std::optional<Verdict> BodyPair::Judge() {
  CollectNear();
  const bool mayTouch =
      std::ranges::any_of(near_, [this](const NearTriangles& near) { return near.lower <= gap_; });
  if (mayTouch) return JudgeTouching();
  for (std::size_t side = 0; side < 2; ++side) {
    if (!IsContained(side)) continue;
    best_ = SampleAt(side, Moved(sides_[side].commonFromThis, sides_[side].body().nodes.front()));
    FindDeepest(side);
    return ClashVerdict();
  }
  if (near_.empty()) return std::nullopt;
  FindDistance();
  return DistanceVerdict();
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
      // Across the longest edge, so that thin triangles soon are none.
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
    const Sample top = Climb(start, 0.5 * scale, 150);
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

void BodyPair::AddPrecision(Verdict& ioVerdict) const {
  for (std::size_t side = 0; side < 2; ++side) {
    const Body& body = sides_[side].body();
    if (body.isExact) continue;
    ioVerdict.hasMeshPrecision = true;
    double largest = 0;
    for (const NearTriangles& near : near_)
      largest = std::max(largest, body.deviations[near.triangles[side]]);
    ioVerdict.precision += largest;
  }
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
