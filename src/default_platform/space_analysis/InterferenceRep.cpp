#include "default_platform/space_analysis/InterferenceRep.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdint>
#include <numbers>
#include <set>

#include "default_platform/visualisation/Rendering.h"
#include "foundation/Vector3.h"

namespace ZORDefault {
namespace {

using namespace ZORFoundation;

std::array<float, 3> Rounded(const ZORMathVector& inVector) {
  return {static_cast<float>(inVector.x), static_cast<float>(inVector.y),
          static_cast<float>(inVector.z)};
}

/// Collects balls, rods and cones in one mesh. Lengths above zero.
class MarkerMesh {
 public:
  /// @param inMiddle near all that is to be added.
  explicit MarkerMesh(const ZORMathVector& inMiddle);
  void AddBall(const ZORMathVector& inCentre, double inRadius) {
    AddSphere(inCentre, inRadius, kSides, kSides / 2);
  }
  /// With a quarter of the triangles.
  void AddCoarseBall(const ZORMathVector& inCentre, double inRadius) {
    AddSphere(inCentre, inRadius, kSides / 2, kSides / 4);
  }
  /// From one end to the other, with different radii; open at its ends.
  void AddCone(const ZORMathVector& inFrom, double inFromRadius, const ZORMathVector& inTo,
               double inToRadius);
  std::shared_ptr<const PartMesh> Take();

 private:
  static constexpr std::uint32_t kSides = 16;

  struct Ring {
    ZORMathVector centre;
    double radius;
    double normalAlong;  // share of the normal that points along the axis
  };
  void AddSphere(const ZORMathVector& inCentre, double inRadius, std::uint32_t inSides,
                 std::uint32_t inSlices);
  void AddRings(const ZORMathVector& inAxis, const std::vector<Ring>& inRings,
                std::uint32_t inSides);

  std::shared_ptr<PartMesh> mesh_;
};

MarkerMesh::MarkerMesh(const ZORMathVector& inMiddle) : mesh_(std::make_shared<PartMesh>()) {
  mesh_->origin = inMiddle;
}

void MarkerMesh::AddSphere(const ZORMathVector& inCentre, double inRadius, std::uint32_t inSides,
                           std::uint32_t inSlices) {
  const ZORMathVector axis(0, 0, 1);
  std::vector<Ring> rings;
  for (std::uint32_t i = 0; i <= inSlices; ++i) {
    const double angle = std::numbers::pi * i / inSlices;
    const double along = -std::cos(angle);
    rings.push_back({inCentre + (along * inRadius) * axis, inRadius * std::sin(angle), along});
  }
  AddRings(axis, rings, inSides);
}

void MarkerMesh::AddCone(const ZORMathVector& inFrom, double inFromRadius,
                         const ZORMathVector& inTo, double inToRadius) {
  const ZORMathVector way = inTo - inFrom;
  const double length = Length(way);
  const double fall = inFromRadius - inToRadius;
  const double along = fall / std::hypot(fall, length);
  AddRings(NormalizeOr(way, {0, 0, 1}), {{inFrom, inFromRadius, along}, {inTo, inToRadius, along}},
           kSides);
}

void MarkerMesh::AddRings(const ZORMathVector& inAxis, const std::vector<Ring>& inRings,
                          std::uint32_t inSides) {
  const ZORMathVector aside =
      std::fabs(inAxis.z) < 0.9 ? ZORMathVector(0, 0, 1) : ZORMathVector(1, 0, 0);
  const ZORMathVector u = NormalizeOr(Cross(aside, inAxis), {1, 0, 0});
  const ZORMathVector v = Cross(inAxis, u);
  const auto first = static_cast<std::uint32_t>(mesh_->points.size());
  for (const Ring& ring : inRings) {
    const double outwards = std::sqrt(std::max(0.0, 1 - ring.normalAlong * ring.normalAlong));
    for (std::uint32_t side = 0; side < inSides; ++side) {
      const double angle = 2 * std::numbers::pi * side / inSides;
      const ZORMathVector out = std::cos(angle) * u + std::sin(angle) * v;
      mesh_->points.push_back(Rounded(ring.centre + ring.radius * out - mesh_->origin));
      mesh_->normals.push_back(Rounded(outwards * out + ring.normalAlong * inAxis));
    }
  }
  for (std::uint32_t ring = 0; ring + 1 < inRings.size(); ++ring)
    for (std::uint32_t side = 0; side < inSides; ++side) {
      const std::uint32_t a = first + ring * inSides + side;
      const std::uint32_t b = first + ring * inSides + (side + 1) % inSides;
      mesh_->triangles.push_back({a, b, b + inSides});
      mesh_->triangles.push_back({a, b + inSides, a + inSides});
    }
}

std::shared_ptr<const PartMesh> MarkerMesh::Take() {
  double radius = 0;
  for (const auto& point : mesh_->points)
    radius = std::max(radius, static_cast<double>(std::hypot(point[0], point[1], point[2])));
  mesh_->sphere = {mesh_->origin, radius};
  return std::move(mesh_);
}

// Shares of MarkerStyle::viewRadius.
constexpr double kBall = 0.035;
constexpr double kLine = 0.008;
constexpr double kArrow = 0.025;
constexpr double kArrowLength = 0.06;
constexpr double kPinHead = 0.04;
/// With more points than this they show the place by themselves.
constexpr std::size_t kMaxPins = 3;
/// A picture cannot resolve more balls than this.
constexpr std::size_t kMaxBalls = 1000;
/// With more balls than this none is seen by itself.
constexpr std::size_t kMaxFineBalls = 100;

/// A needle from the point upwards and towards the eye, whose head stands out of the surfaces that
/// hide the point.
void AddPin(const ZORMathVector& inPoint, const MarkerStyle& inStyle, MarkerMesh& ioMesh) {
  const double size = inStyle.viewRadius;
  const ZORMathVector aside = Cross(inStyle.sight, inStyle.up);
  const ZORMathVector way =
      NormalizeOr(inStyle.up + 0.45 * aside - 0.9 * inStyle.sight, inStyle.up);
  const ZORMathVector head = inPoint + (inStyle.pinLength * size) * way;
  ioMesh.AddCone(inPoint, 0.3 * kLine * size, head, kLine * size);
  ioMesh.AddBall(head, kPinHead * size);
}

/// Arrow heads inside the line where there is room, else outside of it.
void AddDimensionLine(const ZORMathVector& inFrom, const ZORMathVector& inTo, double inSize,
                      MarkerMesh& ioMesh) {
  const ZORMathVector way = NormalizeOr(inTo - inFrom, {0, 0, 1});
  const bool hasRoom = Length(inTo - inFrom) > 3 * kArrowLength * inSize;
  const ZORMathVector arrow = (hasRoom ? kArrowLength : -kArrowLength) * inSize * way;
  const ZORMathVector tail = hasRoom ? ZORMathVector() : 2.5 * arrow;
  ioMesh.AddCone(inFrom + tail, kLine * inSize, inTo - tail, kLine * inSize);
  ioMesh.AddCone(inFrom + arrow, kArrow * inSize, inFrom, 0);
  ioMesh.AddCone(inTo - arrow, kArrow * inSize, inTo, 0);
}

/// The first point of each cell of a grid, in order.
std::vector<ZORMathVector> OneACell(const std::vector<ZORMathVector>& inPoints, double inCell) {
  const auto step = [&](double inDistance) {
    const double steps = std::floor(inDistance / inCell);
    return std::isfinite(steps) ? steps : 0;
  };
  std::set<std::array<double, 3>> cells;
  std::vector<ZORMathVector> firsts;
  for (const ZORMathVector& point : inPoints) {
    const ZORMathVector way = point - inPoints.front();
    if (cells.insert({step(way.x), step(way.y), step(way.z)}).second) firsts.push_back(point);
  }
  return firsts;
}

/// Of balls that nearly coincide one is enough, and of very many a sample.
void AddBalls(const std::vector<ZORMathVector>& inPoints, double inRadius, MarkerMesh& ioMesh) {
  double cell = inRadius / 4;
  std::vector<ZORMathVector> centres = OneACell(inPoints, cell);
  while (centres.size() > kMaxBalls) centres = OneACell(centres, cell *= 2);
  const bool areFine = centres.size() <= kMaxFineBalls;
  for (const ZORMathVector& centre : centres)
    areFine ? ioMesh.AddBall(centre, inRadius) : ioMesh.AddCoarseBall(centre, inRadius);
}

std::shared_ptr<const PartMesh> MakeMarkers(const std::vector<ZORMathVector>& inPoints,
                                            const MarkerStyle& inStyle) {
  MarkerMesh mesh(inPoints.front());
  const bool isDimension = inStyle.isDimension && inPoints.size() == 2;
  if (isDimension)
    AddDimensionLine(inPoints[0], inPoints[1], inStyle.viewRadius, mesh);
  else
    AddBalls(inPoints, kBall * inStyle.viewRadius, mesh);
  if (inStyle.pinLength <= 0) return mesh.Take();
  if (isDimension)
    AddPin(0.5 * (inPoints[0] + inPoints[1]), inStyle, mesh);
  else if (inPoints.size() <= kMaxPins)
    for (const ZORMathVector& point : inPoints) AddPin(point, inStyle, mesh);
  return mesh.Take();
}

}  // namespace

InterferenceRep::InterferenceRep(const std::vector<ZORMathVector>& inPoints,
                                 const MarkerStyle& inStyle, const ZOR3DBoundingSphere& inFramed)
    : markers_(new PlacedMeshRep(MakeMarkers(inPoints, inStyle), ZORMathTransformation(),
                                 &inStyle.colour)),
      framed_(inFramed) {
  markers_->SetInheritanceMode(kOwnColour | kImposeColour);
  markers_->SetOverlay(true);
}

}  // namespace ZORDefault
