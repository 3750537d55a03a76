#include "default_platform/space_analysis/InterferenceRep.h"

#include <algorithm>
#include <array>
#include <set>

#include "default_platform/space_analysis/MarkerMesh.h"
#include "default_platform/space_analysis/Vectors.h"
#include "default_platform/visualisation/Rendering.h"

namespace ZORDefault {
namespace {

// Shares of MarkerStyle::viewRadius.
constexpr double kBall = 0.035;
constexpr double kLine = 0.008;
constexpr double kArrow = 0.025;
constexpr double kArrowLength = 0.06;
constexpr double kPinHead = 0.04;
/// With more points than this they show the place by themselves.
constexpr std::size_t kMostPins = 3;
/// What a picture can show apart.
constexpr std::size_t kMostBalls = 1000;
/// With more balls than this nobody looks at one.
constexpr std::size_t kMostFineBalls = 100;

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
void AddDimension(const ZORMathVector& inFrom, const ZORMathVector& inTo, double inSize,
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
  while (centres.size() > kMostBalls) centres = OneACell(centres, cell *= 2);
  const bool areFine = centres.size() <= kMostFineBalls;
  for (const ZORMathVector& centre : centres)
    areFine ? ioMesh.AddBall(centre, inRadius) : ioMesh.AddCoarseBall(centre, inRadius);
}

std::shared_ptr<const PartMesh> MakeMarkers(const std::vector<ZORMathVector>& inPoints,
                                            const MarkerStyle& inStyle) {
  MarkerMesh mesh(inPoints.front());
  const bool isDimension = inStyle.isDimension && inPoints.size() == 2;
  if (isDimension)
    AddDimension(inPoints[0], inPoints[1], inStyle.viewRadius, mesh);
  else
    AddBalls(inPoints, kBall * inStyle.viewRadius, mesh);
  if (inStyle.pinLength <= 0) return mesh.Take();
  if (isDimension)
    AddPin(0.5 * (inPoints[0] + inPoints[1]), inStyle, mesh);
  else if (inPoints.size() <= kMostPins)
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
