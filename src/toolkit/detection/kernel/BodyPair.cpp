#include "toolkit/detection/kernel/BodyPair.h"

namespace ZORDetection {

BodyPair::BodyPair(BodyProbe& ioFirst, BodyProbe& ioSecond, const gp_Trsf& inFirstFromSecond,
                   double inPointPrecision, const Options& inOptions)
    : sides_{Side{ioFirst, gp_Trsf(), gp_Trsf()},
             Side{ioSecond, inFirstFromSecond, inFirstFromSecond.Inverted()}},
      options_(inOptions),
      gap_(inOptions.contactGap + inPointPrecision + kRounding),
      reach_(std::max(gap_, inOptions.clearance + kRounding)),
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
  if (!isClash) {
    ClimbAlongEdges();
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

}  // namespace ZORDetection
