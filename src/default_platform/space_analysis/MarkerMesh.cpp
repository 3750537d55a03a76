#include "default_platform/space_analysis/MarkerMesh.h"

#include <algorithm>

#include "default_platform/space_analysis/Vectors.h"
#include "default_platform/visualisation/Rendering.h"

namespace ZORDefault {
namespace {

constexpr double kPi = 3.14159265358979323846;

std::array<float, 3> Rounded(const ZORMathVector& inVector) {
  return {static_cast<float>(inVector.x), static_cast<float>(inVector.y),
          static_cast<float>(inVector.z)};
}

}  // namespace

MarkerMesh::MarkerMesh(const ZORMathVector& inMiddle) : mesh_(std::make_shared<PartMesh>()) {
  mesh_->origin = inMiddle;
}

void MarkerMesh::AddSphere(const ZORMathVector& inCentre, double inRadius, std::uint32_t inSides,
                           std::uint32_t inSlices) {
  const ZORMathVector axis(0, 0, 1);
  std::vector<Ring> rings;
  for (std::uint32_t i = 0; i <= inSlices; ++i) {
    const double angle = kPi * i / inSlices;
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
      const double angle = 2 * kPi * side / inSides;
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

}  // namespace ZORDefault
