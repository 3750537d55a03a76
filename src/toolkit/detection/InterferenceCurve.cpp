// Where the boundaries of two bodies cross, and the border of a patch of contact.
#include <set>

#include "toolkit/detection/BodyPair.h"

namespace ZORDetection {
namespace {

constexpr int kMaxSteps = 12;
constexpr std::size_t kMaxCurvePoints = 200;
constexpr int kPieces = 4;     // of a chord of a border
constexpr int kHalvings = 20;  // of a piece at the end of a border

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

/// The parts of one body's edges that lie on the other body.
void BodyPair::AddBorderOnOther(std::size_t inSide, Verdict& ioVerdict) {
  Side &self = sides_[inSide], &other = sides_[1 - inSide];
  const Body& body = self.body();
  std::set<std::uint32_t> faces;
  for (const NearTriangles& near : near_)
    if (near.lower <= gap_) faces.insert(body.triangles[near.triangles[inSide]].face);
  const double gap = std::max(gap_, 1e-6);
  std::set<std::array<std::int64_t, 3>> counted;
  const auto isOn = [&](const gp_XYZ& local) {
    const gp_XYZ there = Moved(other.thisFromCommon, Moved(self.commonFromThis, local));
    if (other.body().box.SquareDistance(there) > gap * gap) return false;
    const BodyFoot foot = other.probe.Nearest(there, 2 * gap);
    if (foot.distance > gap) return false;
    // A border on a border is counted with the first body's.
    return inSide == 0 || other.probe.Tool(foot.face).BorderDistance(there) > gap;
  };
  for (const std::uint32_t face : faces) {
    for (std::size_t e = 0; e < body.faces[face].edges.size(); ++e) {
      const BorderEdge& edge = body.faces[face].edges[e];
      if (edge.isSeam) continue;
      const BRepAdaptor_Curve& curve = self.probe.Tool(face).Curve(static_cast<int>(e));
      const gp_XYZ middle =
          curve.Value((curve.FirstParameter() + curve.LastParameter()) / 2).XYZ() * 1e4;
      // Two faces share an edge.
      if (!counted
               .insert(
                   {std::llround(middle.X()), std::llround(middle.Y()), std::llround(middle.Z())})
               .second)
        continue;
      const std::size_t chords = edge.parameters.size() - 1;
      const std::size_t pieces = chords * static_cast<std::size_t>(kPieces);
      const auto parameterAt = [&](std::size_t piece) {
        const std::size_t chord = std::min(piece / kPieces, chords - 1);
        const double share = static_cast<double>(piece - chord * kPieces) / kPieces;
        return edge.parameters[chord] +
               share * (edge.parameters[chord + 1] - edge.parameters[chord]);
      };
      double from = parameterAt(0);
      bool isFromOn = isOn(curve.Value(from).XYZ());
      for (std::size_t piece = 1; piece <= pieces; ++piece) {
        const double to = parameterAt(piece);
        const bool isToOn = isOn(curve.Value(to).XYZ());
        double start = from, end = to;
        if (isFromOn != isToOn) {
          double on = isFromOn ? from : to, off = isFromOn ? to : from;
          for (int i = 0; i < kHalvings; ++i) {
            const double half = (on + off) / 2;
            (isOn(curve.Value(half).XYZ()) ? on : off) = half;
          }
          (isFromOn ? end : start) = on;
        }
        const bool isCounted = (isFromOn || isToOn) && isOn(curve.Value((start + end) / 2).XYZ());
        if (isCounted) {
          const gp_XYZ a = curve.Value(start).XYZ(), b = curve.Value(end).XYZ();
          const gp_XYZ m = curve.Value((start + end) / 2).XYZ();
          ioVerdict.curveLength += (a - m).Modulus() + (m - b).Modulus();
          ioVerdict.curve.push_back(Moved(self.commonFromThis, m));
        }
        from = to;
        isFromOn = isToOn;
      }
    }
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
