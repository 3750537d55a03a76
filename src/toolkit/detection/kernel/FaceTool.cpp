#include "toolkit/detection/kernel/FaceTool.h"

#include <ElSLib.hxx>

namespace ZORDetection {
namespace {

constexpr int kMaxSteps = 30;
constexpr double kLastStep = 1e-8;  // of Newton's method, whose next would be about its square
constexpr double kTrimTolerance = 1e-9;
constexpr double kSameEdge = 1e-7;  // millimetres
constexpr double kBand = 1e100;

double Clamped(double inValue, double inLow, double inHigh) {
  return std::min(std::max(inValue, inLow), inHigh);
}

}  // namespace

FaceTool::FaceTool(const Body& inBody, std::uint32_t inFace)
    : body_(inBody), face_(inBody.faces[inFace]), surface_(face_.face, false) {
  curves_.resize(face_.edges.size());
}

const BRepAdaptor_Curve& FaceTool::Curve(int inEdge) {
  auto& curve = curves_[static_cast<std::size_t>(inEdge)];
  if (!curve)
    curve = std::make_unique<BRepAdaptor_Curve>(face_.edges[static_cast<std::size_t>(inEdge)].edge);
  return *curve;
}

/// The kernel's classifier, which is exact, and slow near borders.
bool FaceTool::IsInByKernel(const gp_XY& inParameters) {
  if (!classifier_)
    classifier_ = std::make_unique<BRepTopAdaptor_FClass2d>(face_.face, kTrimTolerance);
  const TopAbs_State state = classifier_->Perform(gp_Pnt2d(inParameters), true);
  return state == TopAbs_IN || state == TopAbs_ON;
}

/// Whether a line of constant u leaves the outline an odd number of times.
bool FaceTool::IsInOutline(gp_XY inParameters) const {
  const auto shift = [](double value, double low, double period) {
    return value - std::floor((value - low) / period) * period;
  };
  if (surface_.IsUPeriodic())
    inParameters.SetX(shift(inParameters.X(), face_.outlineLow.X(), surface_.UPeriod()));
  if (surface_.IsVPeriodic())
    inParameters.SetY(shift(inParameters.Y(), face_.outlineLow.Y(), surface_.VPeriod()));
  bool isIn = false;
  for (const auto& [start, end] : face_.outline) {
    if ((start.X() <= inParameters.X()) == (end.X() <= inParameters.X())) continue;
    const double share = (inParameters.X() - start.X()) / (end.X() - start.X());
    if (start.Y() + share * (end.Y() - start.Y()) > inParameters.Y()) isIn = !isIn;
  }
  return isIn;
}

/// Away from the border its chords decide; between a chord and its curve the side of the curve.
bool FaceTool::IsInTrims(const gp_XYZ& inPoint, const gp_XY& inParameters) {
  if (face_.outline.empty()) return IsInByKernel(inParameters);
  double nearest = kBand;
  int nearestEdge = -1;
  double parameter = 0;
  for (std::size_t i = 0; i < face_.edges.size(); ++i) {
    const BorderEdge& edge = face_.edges[i];
    if (edge.isSeam) continue;
    const double band = edge.outlineError + kSameEdge;
    if (edge.box.SquareDistance(inPoint) > band * band) continue;
    for (std::size_t k = 0; k + 1 < edge.nodes.size(); ++k) {
      const gp_XYZ &start = body_.nodes[edge.nodes[k]], &end = body_.nodes[edge.nodes[k + 1]];
      const gp_XYZ foot = ClosestOnSegment(inPoint, start, end);
      if ((foot - inPoint).SquareModulus() > band * band) continue;
      const double chord = (end - start).Modulus();
      const double share = chord > 0 ? (foot - start).Modulus() / chord : 0;
      const double t =
          CurveFoot(static_cast<int>(i), inPoint,
                    edge.parameters[k] + share * (edge.parameters[k + 1] - edge.parameters[k]));
      const double distance = (Curve(static_cast<int>(i)).Value(t).XYZ() - inPoint).Modulus();
      if (distance <= kSameEdge) return true;
      if (distance >= nearest) continue;
      nearest = distance;
      nearestEdge = static_cast<int>(i);
      parameter = t;
    }
  }
  if (nearestEdge < 0) return IsInOutline(inParameters);
  const BRepAdaptor_Curve& curve = Curve(nearestEdge);
  if (parameter <= curve.FirstParameter() || parameter >= curve.LastParameter())
    return IsInByKernel(inParameters);
  gp_Pnt foot, point;
  gp_Vec along, du, dv;
  curve.D1(parameter, foot, along);
  surface_.D1(inParameters.X(), inParameters.Y(), point, du, dv);
  const double side = (du.XYZ() ^ dv.XYZ()) * (along.XYZ() ^ (inPoint - foot.XYZ()));
  return face_.edges[static_cast<std::size_t>(nearestEdge)].isForward ? side >= 0 : side <= 0;
}

std::optional<gp_XYZ> FaceTool::NormalAt(const gp_XY& inParameters) const {
  gp_Pnt point;
  gp_Vec du, dv;
  surface_.D1(inParameters.X(), inParameters.Y(), point, du, dv);
  const gp_XYZ normal = du.XYZ() ^ dv.XYZ();
  const double size = normal.Modulus();
  if (!(size > 1e-9 * du.Magnitude() * dv.Magnitude()) || !(size > 0)) return std::nullopt;
  return normal * (face_.normalSign / size);
}

gp_XY FaceTool::SurfaceFoot(const gp_XYZ& inPoint, const gp_XY& inGuess) const {
  double u = inGuess.X(), v = inGuess.Y();
  switch (surface_.GetType()) {
    case GeomAbs_Plane:
      ElSLib::Parameters(surface_.Plane(), gp_Pnt(inPoint), u, v);
      break;
    case GeomAbs_Cylinder:
      ElSLib::Parameters(surface_.Cylinder(), gp_Pnt(inPoint), u, v);
      break;
    case GeomAbs_Cone:
      ElSLib::Parameters(surface_.Cone(), gp_Pnt(inPoint), u, v);
      break;
    case GeomAbs_Sphere:
      ElSLib::Parameters(surface_.Sphere(), gp_Pnt(inPoint), u, v);
      break;
    case GeomAbs_Torus:
      ElSLib::Parameters(surface_.Torus(), gp_Pnt(inPoint), u, v);
      break;
    default:
      return NewtonFoot(inPoint, inGuess);
  }
  return {u, v};
}

/// Levenberg's damped Newton steps, which never go farther away.
gp_XY FaceTool::NewtonFoot(const gp_XYZ& inPoint, gp_XY inGuess) const {
  const double uLow = surface_.FirstUParameter(), uHigh = surface_.LastUParameter();
  const double vLow = surface_.FirstVParameter(), vHigh = surface_.LastVParameter();
  const bool isUPeriodic = surface_.IsUPeriodic(), isVPeriodic = surface_.IsVPeriodic();
  double damping = 0;
  gp_XY at = inGuess;
  double best = (ValueAt(at) - inPoint).SquareModulus();
  for (int step = 0; step < kMaxSteps; ++step) {
    gp_Pnt point;
    gp_Vec du, dv, duu, dvv, duv;
    surface_.D2(at.X(), at.Y(), point, du, dv, duu, dvv, duv);
    const gp_Vec r(point.XYZ() - inPoint);
    const double gu = r * du, gv = r * dv;
    double a = du * du + r * duu, b = du * dv + r * duv, c = dv * dv + r * dvv;
    const bool isNewton = damping == 0 && a > 0 && a * c - b * b > 0;
    if (!(a > 0 && a * c - b * b > 0)) {
      a = du * du;
      b = du * dv;
      c = dv * dv;
    }
    a *= 1 + damping;
    c *= 1 + damping;
    const double determinant = a * c - b * b;
    if (!(determinant > 0)) break;
    gp_XY next = at - gp_XY((c * gu - b * gv) / determinant, (a * gv - b * gu) / determinant);
    if (!isUPeriodic) next.SetX(Clamped(next.X(), uLow, uHigh));
    if (!isVPeriodic) next.SetY(Clamped(next.Y(), vLow, vHigh));
    const gp_XYZ moved = ValueAt(next);
    const double square = (moved - inPoint).SquareModulus();
    const double length = (moved - point.XYZ()).Modulus();
    if (square <= best) {
      at = next;
      best = square;
      damping /= 10;
      if (damping < 1e-3) damping = 0;
      if (length < (isNewton ? kLastStep : 1e-11) * (1 + inPoint.Modulus())) break;
    } else {
      if (length < 1e-10 * (1 + inPoint.Modulus()) || damping > 1e8) break;
      damping = std::max(damping * 10, 1e-2);
    }
  }
  return at;
}

double FaceTool::CurveFoot(int inEdge, const gp_XYZ& inPoint, double inGuess) {
  const BRepAdaptor_Curve& curve = Curve(inEdge);
  const double low = curve.FirstParameter(), high = curve.LastParameter();
  double t = Clamped(inGuess, low, high), damping = 0;
  double best = (curve.Value(t).XYZ() - inPoint).SquareModulus();
  for (int step = 0; step < kMaxSteps; ++step) {
    gp_Pnt point;
    gp_Vec d1, d2;
    curve.D2(t, point, d1, d2);
    const gp_Vec r(point.XYZ() - inPoint);
    double slope = d1 * d1 + r * d2;
    const bool isNewton = damping == 0 && slope > 0;
    if (!(slope > 0)) slope = d1 * d1;
    slope *= 1 + damping;
    if (!(slope > 0)) break;
    const double next = Clamped(t - (r * d1) / slope, low, high);
    const gp_XYZ moved = curve.Value(next).XYZ();
    const double square = (moved - inPoint).SquareModulus();
    const double length = (moved - point.XYZ()).Modulus();
    if (square <= best) {
      t = next;
      best = square;
      damping = damping < 1e-3 ? 0 : damping / 10;
      if (length < (isNewton ? kLastStep : 1e-11) * (1 + inPoint.Modulus())) break;
    } else {
      if (length < 1e-10 * (1 + inPoint.Modulus()) || damping > 1e8) break;
      damping = std::max(damping * 10, 1e-2);
    }
  }
  return t;
}

void FaceTool::TryEdges(const gp_XYZ& inPoint, bool inWithSeams, FaceFoot& ioFoot) {
  ioFoot.distance = std::numeric_limits<double>::infinity();
  struct Near {
    int edge;
    std::size_t chord;
    double distance, parameter;
  };
  std::vector<Near> near;
  double bound = std::numeric_limits<double>::infinity();  // some edge is at most this far away
  for (std::size_t i = 0; i < face_.edges.size(); ++i) {
    const BorderEdge& edge = face_.edges[i];
    if (edge.isSeam && !inWithSeams) continue;
    if (std::sqrt(edge.box.SquareDistance(inPoint)) - edge.deflection > bound) continue;
    Near nearest{static_cast<int>(i), 0, std::numeric_limits<double>::infinity(), 0};
    for (std::size_t k = 0; k + 1 < edge.nodes.size(); ++k) {
      const gp_XYZ &start = body_.nodes[edge.nodes[k]], &end = body_.nodes[edge.nodes[k + 1]];
      const gp_XYZ foot = ClosestOnSegment(inPoint, start, end);
      const double distance = (foot - inPoint).Modulus();
      if (distance >= nearest.distance) continue;
      const double chord = (end - start).Modulus();
      const double share = chord > 0 ? (foot - start).Modulus() / chord : 0;
      nearest.chord = k;
      nearest.distance = distance;
      nearest.parameter =
          edge.parameters[k] + share * (edge.parameters[k + 1] - edge.parameters[k]);
    }
    if (!std::isfinite(nearest.distance)) continue;
    near.push_back(nearest);
    bound = std::min(bound, nearest.distance + edge.deflection);
  }
  std::ranges::sort(near, {}, &Near::distance);
  for (const Near& candidate : near) {
    const BorderEdge& edge = face_.edges[static_cast<std::size_t>(candidate.edge)];
    if (candidate.distance - edge.deflection > ioFoot.distance) continue;
    const double t = CurveFoot(candidate.edge, inPoint, candidate.parameter);
    const BRepAdaptor_Curve& curve = Curve(candidate.edge);
    const gp_XYZ point = curve.Value(t).XYZ();
    const double distance = (point - inPoint).Modulus();
    if (distance >= ioFoot.distance) continue;
    ioFoot.distance = distance;
    ioFoot.point = point;
    ioFoot.edge = candidate.edge;
    ioFoot.parameter = t;
    ioFoot.isVertex = t <= curve.FirstParameter() || t >= curve.LastParameter();
    const gp_XY guess = body_.parameters[edge.nodes[candidate.chord]];
    ioFoot.parameters = SurfaceFoot(point, guess);
  }
}

FaceFoot FaceTool::Foot(const gp_XYZ& inPoint, const gp_XY& inGuess) {
  FaceFoot foot;
  foot.parameters = SurfaceFoot(inPoint, inGuess);
  foot.point = ValueAt(foot.parameters);
  foot.distance = (foot.point - inPoint).Modulus();
  if (IsInTrims(foot.point, foot.parameters)) return foot;
  const FaceFoot outside = foot;
  TryEdges(inPoint, true, foot);
  // A face without a usable border keeps the foot on its surface.
  return std::isfinite(foot.distance) ? foot : outside;
}

}  // namespace ZORDetection
