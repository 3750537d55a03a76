// The distance of two bodies that do not penetrate each other.
#include <map>

#include "toolkit/detection/kernel/BodyPair.h"

namespace ZORDetection {
namespace {

constexpr int kMaxAlternations = 12;
constexpr int kPlainAlternations = 4;
constexpr int kMaxNewtonSteps = 25;
constexpr std::size_t kMaxStarts = 40, kMaxStartsOfFaces = 3;
constexpr double kStartsApart = 20;  // in errors of the triangles

/// A surface, a curve or a point that moves with up to two parameters; the part of a boundary on
/// which a foot lies.
class Feature {
 public:
  Feature(FaceTool& ioTool, const FaceFoot& inFoot, const gp_Trsf& inCommonFromThis)
      : tool_(ioTool), foot_(inFoot), commonFromThis_(inCommonFromThis) {
    if (inFoot.edge < 0) {
      size_ = 2;
      at_ = {inFoot.parameters.X(), inFoot.parameters.Y()};
    } else if (!inFoot.isVertex) {
      size_ = 1;
      at_ = {inFoot.parameter, 0};
    }
  }

  int Size() const { return size_; }
  std::array<double, 2>& At() { return at_; }

  /// Point and first derivatives in the common frame.
  gp_XYZ Evaluate(std::array<gp_XYZ, 2>& outDerivatives) const {
    gp_Pnt point(foot_.point);
    gp_Vec du, dv;
    if (size_ == 2) tool_.Surface().D1(at_[0], at_[1], point, du, dv);
    if (size_ == 1) tool_.Curve(foot_.edge).D1(at_[0], point, du);
    outDerivatives = {Turned(commonFromThis_, du.XYZ()), Turned(commonFromThis_, dv.XYZ())};
    return Moved(commonFromThis_, point.XYZ());
  }

  gp_XYZ Point() const {
    std::array<gp_XYZ, 2> derivatives;
    return Evaluate(derivatives);
  }

 private:
  FaceTool& tool_;
  const FaceFoot& foot_;
  gp_Trsf commonFromThis_;
  int size_ = 0;
  std::array<double, 2> at_{};
};

/// Solves a small system by elimination with pivots.
/// @return false when it is singular.
bool Solve(int inSize, std::array<std::array<double, 5>, 4>& ioRows, std::array<double, 4>& outX) {
  for (int column = 0; column < inSize; ++column) {
    const auto at = static_cast<std::size_t>(column);
    std::size_t pivot = at;
    for (std::size_t row = at + 1; row < static_cast<std::size_t>(inSize); ++row)
      if (std::abs(ioRows[row][at]) > std::abs(ioRows[pivot][at])) pivot = row;
    std::swap(ioRows[at], ioRows[pivot]);
    if (!(std::abs(ioRows[at][at]) > 1e-30)) return false;
    for (std::size_t row = 0; row < static_cast<std::size_t>(inSize); ++row) {
      if (row == at) continue;
      const double factor = ioRows[row][at] / ioRows[at][at];
      for (std::size_t k = at; k < 5; ++k) ioRows[row][k] -= factor * ioRows[at][k];
    }
  }
  for (std::size_t i = 0; i < static_cast<std::size_t>(inSize); ++i)
    outX[i] = ioRows[i][4] / ioRows[i][i];
  return true;
}

/// The least-squares solution of minimum norm: between parallel lines and planes there are many
/// solutions.
bool SolveLeastSquares(int inSize, const std::array<std::array<double, 5>, 4>& inRows,
                       std::array<double, 4>& outX) {
  constexpr double kDamping = 1e-12;
  const auto size = static_cast<std::size_t>(inSize);
  std::array<std::array<double, 5>, 4> normal{};
  double trace = 0;
  for (std::size_t i = 0; i < size; ++i)
    for (std::size_t k = 0; k < size; ++k) {
      for (std::size_t j = 0; j < size; ++j) normal[i][j] += inRows[k][i] * inRows[k][j];
      normal[i][4] += inRows[k][i] * inRows[k][4];
      trace += inRows[k][i] * inRows[k][i];
    }
  for (std::size_t i = 0; i < size; ++i) normal[i][i] += kDamping * trace;
  return trace > 0 && Solve(inSize, normal, outX);
}

/// The residual that vanishes at the closest points of two features: the gap between them,
/// projected onto the tangents of both. A surface's normal takes the place of the gap, which itself
/// vanishes where they touch, so that Newton's method stays quadratic.
class Tangency {
 public:
  Tangency(Feature& ioFirst, Feature& ioSecond) : features_{&ioFirst, &ioSecond} {}

  int Size() const { return features_[0]->Size() + features_[1]->Size(); }

  std::array<double, 4> Residual() const {
    std::array<std::array<gp_XYZ, 2>, 2> d;
    const gp_XYZ p = features_[0]->Evaluate(d[0]), q = features_[1]->Evaluate(d[1]);
    const gp_XYZ gap = p - q;
    const int first = features_[0]->Size(), second = features_[1]->Size();
    std::array<double, 4> residual{};
    std::size_t at = 0;
    // One surface's normal for the other feature; the gap itself for the foot on that surface.
    const gp_XYZ normal = second == 2  ? UnitOf(d[1][0] ^ d[1][1])
                          : first == 2 ? UnitOf(d[0][0] ^ d[0][1])
                                       : gap;
    for (int i = 0; i < first; ++i)
      residual[at++] = UnitOf(d[0][static_cast<std::size_t>(i)]) * (second == 2 ? normal : gap);
    for (int i = 0; i < second; ++i)
      residual[at++] =
          UnitOf(d[1][static_cast<std::size_t>(i)]) * (second != 2 && first == 2 ? normal : gap);
    return residual;
  }

  /// @return false when no step helps.
  bool Step() {
    const int size = Size();
    const std::array<double, 4> here = Residual();
    std::array<std::array<double, 5>, 4> rows{};
    std::size_t column = 0;
    for (Feature* feature : features_) {
      std::array<gp_XYZ, 2> d;
      feature->Evaluate(d);
      for (int i = 0; i < feature->Size(); ++i, ++column) {
        const double speed = d[static_cast<std::size_t>(i)].Modulus();
        if (!(speed > 0)) return false;
        const double step = 1e-6 / speed;
        double& parameter = feature->At()[static_cast<std::size_t>(i)];
        const double old = parameter;
        parameter = old + step;
        const std::array<double, 4> up = Residual();
        parameter = old - step;
        const std::array<double, 4> down = Residual();
        parameter = old;
        for (std::size_t row = 0; row < static_cast<std::size_t>(size); ++row)
          rows[row][column] = (up[row] - down[row]) / 2e-6;  // by millimetres, for the pivots
        scale_[column] = speed;
      }
    }
    for (std::size_t row = 0; row < static_cast<std::size_t>(size); ++row)
      rows[row][4] = -here[row];
    std::array<double, 4> x{};
    if (!SolveLeastSquares(size, rows, x)) return false;
    column = 0;
    double length = 0;
    for (Feature* feature : features_)
      for (int i = 0; i < feature->Size(); ++i, ++column) {
        feature->At()[static_cast<std::size_t>(i)] += x[column] / scale_[column];
        length = std::max(length, std::abs(x[column]));
      }
    last_ = length;
    return std::isfinite(length) && length < 1e3;
  }

  double LastStep() const { return last_; }

 private:
  std::array<Feature*, 2> features_;
  std::array<double, 4> scale_{};
  double last_ = 0;
};

}  // namespace

void BodyPair::KeepDistance(const gp_XYZ& inFirst, const gp_XYZ& inSecond) {
  const double distance = (inFirst - inSecond).Modulus();
  if (distance >= distance_) return;
  distance_ = distance;
  closest_ = {inFirst, inSecond};
}

/// Newton's method on the features that hold the closest points.
/// @return false when they are not nearer than before.
bool BodyPair::Polish(gp_XYZ& ioFirst) {
  Side &a = sides_[0], &b = sides_[1];
  if (!a.body().isExact || !b.body().isExact) return false;
  const BodyFoot onB = b.probe.Nearest(Moved(b.thisFromCommon, ioFirst));
  const BodyFoot onA = a.probe.Nearest(ioFirst);
  if (!onA.IsFound() || !onB.IsFound()) return false;
  Feature first(a.probe.Tool(onA.face), onA.foot, a.commonFromThis);
  Feature second(b.probe.Tool(onB.face), onB.foot, b.commonFromThis);
  Tangency tangency(first, second);
  if (tangency.Size() == 0) return false;
  for (int step = 0; step < kMaxNewtonSteps; ++step) {
    if (!tangency.Step()) return false;
    if (tangency.LastStep() < 1e-10) break;
  }
  // Only points within the trims count.
  const gp_XYZ onFirst = a.probe.Nearest(first.Point()).foot.point;
  const BodyFoot foot = b.probe.Nearest(Moved(b.thisFromCommon, onFirst));
  if (!foot.IsFound() || !(foot.distance < onB.distance)) return false;
  ioFirst = onFirst;
  KeepDistance(onFirst, Moved(b.commonFromThis, foot.foot.point));
  return true;
}

/// Goes to where the normals of two smooth faces agree: the local extreme of their signed distance.
/// @return false when there is none within the trims.
bool BodyPair::StepToTangency(const Sample& inStart, Sample& outSample) {
  Side &own = sides_[inStart.side], &other = sides_[1 - inStart.side];
  if (!own.body().isExact || !other.body().isExact) return false;
  FaceFoot ownFoot, otherFoot = inStart.depth.foot.foot;
  ownFoot.parameters = inStart.parameters;
  otherFoot.edge = -1;
  Feature first(own.probe.Tool(inStart.face), ownFoot, own.commonFromThis);
  Feature second(other.probe.Tool(inStart.depth.foot.face), otherFoot, other.commonFromThis);
  Tangency tangency(first, second);
  for (int step = 0; step < kMaxNewtonSteps; ++step) {
    if (!tangency.Step()) return false;
    if (tangency.LastStep() < 1e-9) break;
  }
  if (tangency.LastStep() > 1e-6) return false;
  outSample = SampleAt(inStart.side, first.Point());
  return (outSample.point - first.Point()).Modulus() < 1e-6 && outSample.depth.foot.IsFound() &&
         outSample.depth.value >= inStart.depth.value;
}

/// Alternating projection: feet on one body and the other in turn come closer with each step, but
/// slowly where the bodies are nearly parallel, so that steps are extrapolated there.
void BodyPair::Alternate(gp_XYZ inFirst) {
  Side &a = sides_[0], &b = sides_[1];
  double last = kInfinity;
  const auto go = [&](int steps) {
    for (int step = 0; step < steps; ++step) {
      const gp_XYZ before = inFirst;
      const BodyFoot onB = b.probe.Nearest(Moved(b.thisFromCommon, inFirst));
      if (!onB.IsFound()) return true;
      const gp_XYZ second = Moved(b.commonFromThis, onB.foot.point);
      const BodyFoot onA = a.probe.Nearest(second);
      if (!onA.IsFound()) return true;
      inFirst = onA.foot.point;
      KeepDistance(inFirst, second);
      if (onA.distance >= last - 1e-12 * (1 + onA.distance)) return true;
      last = onA.distance;
      if (distance_ < 1e-12) return true;
      if (step % kPlainAlternations == kPlainAlternations - 1) Leap(inFirst, inFirst - before);
    }
    return false;
  };
  go(kMaxAlternations);
  for (int round = 0; round < 3; ++round) {
    if (!Polish(inFirst)) break;
    if (go(3)) break;
  }
  go(200);
}

/// Extrapolates a step, twice as far each time, as long as that comes closer.
void BodyPair::Leap(gp_XYZ& ioFirst, const gp_XYZ& inStep) {
  Side &a = sides_[0], &b = sides_[1];
  const gp_XYZ start = ioFirst;
  double nearest = b.probe.Nearest(Moved(b.thisFromCommon, start)).distance;
  for (double times = 2; times < 1e6; times *= 2) {
    const BodyFoot onA = a.probe.Nearest(start + inStep * times);
    if (!onA.IsFound()) return;
    const BodyFoot onB = b.probe.Nearest(Moved(b.thisFromCommon, onA.foot.point));
    if (!(onB.distance < nearest)) return;
    nearest = onB.distance;
    ioFirst = onA.foot.point;
    KeepDistance(ioFirst, Moved(b.commonFromThis, onB.foot.point));
  }
}

void BodyPair::FindDistance() {
  Side &a = sides_[0], &b = sides_[1];
  if (!a.body().isExact && !b.body().isExact) {
    for (const NearTriangles& near : near_) KeepDistance(near.closest[0], near.closest[1]);
    return;
  }
  // Two faces may come near each other in several places.
  std::map<std::array<std::uint32_t, 2>, std::vector<gp_XYZ>> starts;
  std::size_t count = 0;
  for (const NearTriangles& near : near_) {
    if (near.lower >= distance_ || count >= kMaxStarts) break;
    std::vector<gp_XYZ>& known = starts[{a.body().triangles[near.triangles[0]].face,
                                         b.body().triangles[near.triangles[1]].face}];
    const double apart = kStartsApart * (near.distance - near.lower);
    const auto isClose = [&](const gp_XYZ& start) {
      return (start - near.closest[0]).Modulus() <= apart;
    };
    if (known.size() >= kMaxStartsOfFaces || std::ranges::any_of(known, isClose)) continue;
    known.push_back(near.closest[0]);
    ++count;
    const BodyFoot start = a.probe.Nearest(near.closest[0]);
    if (start.IsFound()) Alternate(start.foot.point);
  }
  if (std::isfinite(distance_) && distance_ > gap_) ApproachAlongEdges();
}

std::optional<Verdict> BodyPair::DistanceVerdict() {
  Verdict verdict;
  verdict.distance = distance_;
  verdict.points = closest_;
  AddPrecision(verdict);
  if (distance_ <= gap_) {
    verdict.kind = Kind::kContact;
    verdict.distance = 0;
    if (options_.withCurves) AddPatch(verdict);
    return verdict;
  }
  if (distance_ > options_.clearance + kRounding) return std::nullopt;
  verdict.kind = Kind::kClearance;
  verdict.distance = std::min(distance_, options_.clearance);
  return verdict;
}

}  // namespace ZORDetection
