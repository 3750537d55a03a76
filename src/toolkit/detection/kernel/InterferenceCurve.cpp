// Where the boundaries of two bodies cross, and the border of a patch of contact.
#include <set>

#include "toolkit/detection/kernel/BodyPair.h"

namespace ZORDetection {
namespace {

constexpr int kMaxSteps = 12;
constexpr std::size_t kMaxCurvePoints = 200;
constexpr std::size_t kMinPieces = 24;  // of a border that are tried
constexpr std::size_t kMaxPieces = 4;   // of one chord
constexpr int kLengthPieces = 4;        // of such a piece, for its length
constexpr int kHalvings = 20;           // of a piece at the end of a border

}  // namespace

/// Newton's method with the two tangent planes: the nearest point in both is the next.
bool BodyPair::MoveOntoBoth(const NearTriangles& inNear, gp_XYZ& ioPoint) {
  if (!sides_[0].body().isExact || !sides_[1].body().isExact) return true;
  gp_XYZ point = ioPoint;
  std::array<gp_XY, 2> guesses;
  std::array<FaceTool*, 2> tools{};
  double size = 0;
  for (std::size_t side = 0; side < 2; ++side) {
    const Body& body = sides_[side].body();
    const BodyTriangle& triangle = body.triangles[inNear.triangles[side]];
    tools[side] = &sides_[side].probe.Tool(triangle.face);
    const Corners corners = body.CornersOf(inNear.triangles[side]);
    const auto weights = BarycentricOf(Moved(sides_[side].thisFromCommon, point), corners);
    for (std::size_t i = 0; i < 3; ++i)
      guesses[side] += body.parameters[triangle.nodes[i]] * weights[i];
    size =
        std::max(size, (corners[1] - corners[0]).Modulus() + (corners[2] - corners[0]).Modulus());
  }
  for (int step = 0; step < kMaxSteps; ++step) {
    std::array<gp_XYZ, 2> normals;
    std::array<double, 2> heights{};
    for (std::size_t side = 0; side < 2; ++side) {
      const gp_XYZ local = Moved(sides_[side].thisFromCommon, point);
      guesses[side] = tools[side]->SurfaceFoot(local, guesses[side]);
      const auto normal = tools[side]->NormalAt(guesses[side]);
      if (!normal) return false;
      normals[side] = Turned(sides_[side].commonFromThis, *normal);
      heights[side] = (local - tools[side]->ValueAt(guesses[side])) * *normal;
    }
    if (std::abs(heights[0]) + std::abs(heights[1]) < 1e-9) {
      ioPoint = point;
      return true;
    }
    const double cosine = normals[0] * normals[1], determinant = 1 - cosine * cosine;
    if (determinant < 1e-8) return false;
    const double x = (heights[0] - cosine * heights[1]) / determinant;
    const double y = (heights[1] - cosine * heights[0]) / determinant;
    point -= normals[0] * x + normals[1] * y;
    if ((point - ioPoint).Modulus() > size) return false;
  }
  return false;
}

bool BodyPair::IsOnBoth(const gp_XYZ& inPoint, double inGap) {
  return std::ranges::all_of(sides_, [&](Side& side) {
    return side.probe.Nearest(Moved(side.thisFromCommon, inPoint), 2 * inGap).distance <= inGap;
  });
}

void BodyPair::AddCrossingCurve(Verdict& ioVerdict) {
  for (const NearTriangles& near : near_) {
    if (near.distance > 0) continue;
    auto ends =
        CrossingOf(CommonCorners(0, near.triangles[0]), CommonCorners(1, near.triangles[1]));
    if (!ends) continue;
    // Where faces lie upon each other their triangles cross at random.
    if (!MoveOntoBoth(near, (*ends)[0]) || !MoveOntoBoth(near, (*ends)[1])) continue;
    const double length = ((*ends)[0] - (*ends)[1]).Modulus();
    if (!(length > 0)) continue;
    ioVerdict.curveLength += length;
    ioVerdict.curve.push_back(((*ends)[0] + (*ends)[1]) * 0.5);
  }
  ioVerdict.curve = Thinned(ioVerdict.curve, kMaxCurvePoints);
}

/// The parts of one body's edges that lie on the other body. Only chords of triangles that come
/// near it can.
void BodyPair::AddBorderOnOther(std::size_t inSide, Verdict& ioVerdict) {
  const Body& body = sides_[inSide].body();
  std::set<std::uint32_t> faces;
  std::vector<bool> isNear(body.nodes.size());
  for (const NearTriangles& near : near_) {
    if (near.lower > gap_) continue;
    const BodyTriangle& triangle = body.triangles[near.triangles[inSide]];
    faces.insert(triangle.face);
    for (const std::uint32_t node : triangle.nodes) isNear[node] = true;
  }
  std::set<std::array<std::int64_t, 3>> counted;
  for (const std::uint32_t face : faces)
    for (std::size_t e = 0; e < body.faces[face].edges.size(); ++e) {
      const BorderEdge& edge = body.faces[face].edges[e];
      if (edge.isSeam) continue;
      const BRepAdaptor_Curve& curve = sides_[inSide].probe.Tool(face).Curve(static_cast<int>(e));
      const gp_XYZ middle =
          curve.Value((curve.FirstParameter() + curve.LastParameter()) / 2).XYZ() * 1e4;
      // Two faces share an edge.
      if (!counted
               .insert(
                   {std::llround(middle.X()), std::llround(middle.Y()), std::llround(middle.Z())})
               .second)
        continue;
      const std::size_t chords = edge.nodes.size() - 1;
      const std::size_t pieces = std::min((kMinPieces + chords - 1) / chords, kMaxPieces);
      for (std::size_t i = 0; i < chords; ++i)
        if (isNear[edge.nodes[i]] && isNear[edge.nodes[i + 1]])
          AddChordOnOther(inSide, curve, {edge.parameters[i], edge.parameters[i + 1]}, pieces,
                          ioVerdict);
    }
}

bool BodyPair::IsBorderOnOther(std::size_t inSide, const gp_XYZ& inLocal) {
  const Side &self = sides_[inSide], &other = sides_[1 - inSide];
  const double gap = std::max(gap_, 1e-6);
  const gp_XYZ there = Moved(other.thisFromCommon, Moved(self.commonFromThis, inLocal));
  if (other.body().box.SquareDistance(there) > gap * gap) return false;
  const BodyFoot foot = other.probe.Nearest(there, 2 * gap);
  if (foot.distance > gap) return false;
  // A border on a border is counted with the first body's.
  return inSide == 0 || other.probe.Tool(foot.face).BorderFoot(there).distance > gap;
}

void BodyPair::AddChordOnOther(std::size_t inSide, const BRepAdaptor_Curve& inCurve,
                               const std::array<double, 2>& inEnds, std::size_t inPieces,
                               Verdict& ioVerdict) {
  const auto pointAt = [&](double at) { return inCurve.Value(at).XYZ(); };
  const auto isOn = [&](double at) { return IsBorderOnOther(inSide, pointAt(at)); };
  double from = inEnds[0];
  bool isFromOn = isOn(from);
  for (std::size_t piece = 1; piece <= inPieces; ++piece) {
    const double to = inEnds[0] + (inEnds[1] - inEnds[0]) * static_cast<double>(piece) /
                                      static_cast<double>(inPieces);
    const bool isToOn = isOn(to);
    double start = from, end = to;
    if (isFromOn != isToOn) {
      double on = isFromOn ? from : to, off = isFromOn ? to : from;
      for (int i = 0; i < kHalvings; ++i) {
        const double half = (on + off) / 2;
        (isOn(half) ? on : off) = half;
      }
      (isFromOn ? end : start) = on;
    }
    if ((isFromOn || isToOn) && isOn((start + end) / 2)) {
      gp_XYZ last = pointAt(start);
      for (int i = 1; i <= kLengthPieces; ++i) {
        const gp_XYZ next = pointAt(start + (end - start) * i / kLengthPieces);
        ioVerdict.curveLength += (next - last).Modulus();
        last = next;
      }
      ioVerdict.curve.push_back(Moved(sides_[inSide].commonFromThis, pointAt((start + end) / 2)));
    }
    from = to;
    isFromOn = isToOn;
  }
}

/// The border of the patch of contact, and a point in its middle.
void BodyPair::AddPatch(Verdict& ioVerdict) {
  if (sides_[0].body().isExact && sides_[1].body().isExact) {
    AddBorderOnOther(0, ioVerdict);
    AddBorderOnOther(1, ioVerdict);
  }
  gp_XYZ sum(0, 0, 0);
  std::size_t count = 0;
  const auto add = [&](const gp_XYZ& point) {
    sum += point;
    ++count;
  };
  for (const gp_XYZ& point : ioVerdict.curve) add(point);
  std::vector<gp_XYZ> touching;
  for (const Sample& sample : samples_)
    if (std::abs(sample.depth.value) <= gap_) touching.push_back(sample.point);
  if (count == 0)
    for (const gp_XYZ& point : touching) add(point);
  if (count != 0) {
    const gp_XYZ middle = sum / static_cast<double>(count);
    touching.insert(touching.end(), ioVerdict.curve.begin(), ioVerdict.curve.end());
    gp_XYZ best = ioVerdict.points[0];
    for (const gp_XYZ& point : touching)
      if ((point - middle).SquareModulus() < (best - middle).SquareModulus()) best = point;
    const BodyFoot onFirst = sides_[0].probe.Nearest(middle);
    if (onFirst.IsFound() && IsOnBoth(onFirst.foot.point, gap_)) best = onFirst.foot.point;
    ioVerdict.points = {best, best};
  }
  ioVerdict.curve = Thinned(ioVerdict.curve, kMaxCurvePoints);
}

}  // namespace ZORDetection
