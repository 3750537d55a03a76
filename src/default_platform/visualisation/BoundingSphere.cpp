#include "default_platform/visualisation/BoundingSphere.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <mutex>

#include "foundation/Vector3.h"

namespace ZORDefault {
namespace {

using ZORFoundation::Length;
using ZORFoundation::Lerp;
using ZORFoundation::operator-;  // NOLINT(misc-unused-using-decls): used, through a concept

bool IsFinite(const ZOR3DBoundingSphere& inSphere) {
  return ZORFoundation::IsFinite(inSphere.centre) && std::isfinite(inSphere.radius);
}

double Distance(const ZORMathVector& inA, const ZORMathVector& inB) { return Length(inA - inB); }

/// The largest factor by which a rotation with a scale of each axis stretches lengths.
double MaxScale(const ZORMathTransformation& inTransformation) {
  double largest = 0;
  for (int i = 0; i < 3; ++i) {
    const ZORMathVector& column = inTransformation.GetMatrix().GetColumn(i);
    largest = std::max(largest, Length(column));
  }
  return largest;
}

Aabb ComputeBounds(const PartMesh& inMesh) {
  constexpr float kFar = std::numeric_limits<float>::max();
  Aabb box{{kFar, kFar, kFar}, {-kFar, -kFar, -kFar}};
  for (const auto* const points : {&inMesh.points, &inMesh.edgePoints}) {
    for (const std::array<float, 3>& point : *points) {
      for (std::size_t i = 0; i < 3; ++i) {
        box.low[i] = std::min(box.low[i], point[i]);
        box.high[i] = std::max(box.high[i], point[i]);
      }
    }
  }
  return box;
}

/// Computed at the first call and cached by the mesh.
Aabb CachedBounds(const PartMesh& inMesh) {
  static std::mutex mutex;
  const std::lock_guard lock(mutex);
  if (!inMesh.renderCache.bounds) inMesh.renderCache.bounds = ComputeBounds(inMesh);
  return *inMesh.renderCache.bounds;
}

}  // namespace

void BoundingSphere::AddSphere(const ZOR3DBoundingSphere& inSphere) {
  if (!inSphere.IsEmpty() && IsFinite(inSphere)) pieces_.push_back({inSphere, false, {}});
}

void BoundingSphere::AddMesh(const PartMesh& inMesh, const ZORMathTransformation& inRootFromPart) {
  if (inMesh.sphere.IsEmpty()) return;
  Piece piece;
  piece.sphere = {inRootFromPart * inMesh.sphere.centre,
                  inMesh.sphere.radius * MaxScale(inRootFromPart)};
  if (!IsFinite(piece.sphere)) return;
  const Aabb box = CachedBounds(inMesh);
  piece.hasCorners = box.low[0] <= box.high[0];
  for (std::size_t i = 0; piece.hasCorners && i < piece.corners.size(); ++i) {
    const auto side = [&](std::size_t inAxis) {
      return static_cast<double>((i >> inAxis & 1) ? box.high[inAxis] : box.low[inAxis]);
    };
    piece.corners[i] =
        inRootFromPart * ZORMathVector(inMesh.origin.x + side(0), inMesh.origin.y + side(1),
                                       inMesh.origin.z + side(2));
  }
  pieces_.push_back(piece);
}

ZORMathVector BoundingSphere::FarthestPoint(const Piece& inPiece, const ZORMathVector& inFrom) {
  const ZOR3DBoundingSphere& sphere = inPiece.sphere;
  const double toCentre = Distance(inFrom, sphere.centre);
  const ZORMathVector ofSphere = toCentre > 0
                                     ? Lerp(inFrom, sphere.centre, 1 + sphere.radius / toCentre)
                                     : ZORMathVector(inFrom.x + sphere.radius, inFrom.y, inFrom.z);
  if (!inPiece.hasCorners) return ofSphere;
  const ZORMathVector ofCorners = *std::ranges::max_element(
      inPiece.corners, {},
      [&](const ZORMathVector& inCorner) { return Distance(inFrom, inCorner); });
  return Distance(inFrom, ofCorners) < Distance(inFrom, ofSphere) ? ofCorners : ofSphere;
}

ZORMathVector BoundingSphere::BoxCentre() const {
  constexpr double kFar = std::numeric_limits<double>::max();
  ZORMathVector low(kFar, kFar, kFar), high(-kFar, -kFar, -kFar);
  for (const Piece& piece : pieces_) {
    const ZORMathVector& centre = piece.sphere.centre;
    const double radius = piece.sphere.radius;
    low = {std::min(low.x, centre.x - radius), std::min(low.y, centre.y - radius),
           std::min(low.z, centre.z - radius)};
    high = {std::max(high.x, centre.x + radius), std::max(high.y, centre.y + radius),
            std::max(high.z, centre.z + radius)};
  }
  return Lerp(low, high, 0.5);
}

/// The centre moves towards the farthest point by ever smaller steps (Badoiu and Clarkson, "Smaller
/// core-sets for balls", 2003); the best of all steps is returned.
ZOR3DBoundingSphere BoundingSphere::Get() const {
  constexpr int kSteps = 48;
  ZOR3DBoundingSphere best;
  if (pieces_.empty()) return best;
  ZORMathVector centre = BoxCentre();
  for (int step = 0; step < kSteps; ++step) {
    ZORMathVector farthest = centre;
    double radius = 0;
    for (const Piece& piece : pieces_) {
      const ZORMathVector place = FarthestPoint(piece, centre);
      const double distance = Distance(centre, place);
      if (distance < radius) continue;
      radius = distance;
      farthest = place;
    }
    if (best.IsEmpty() || radius < best.radius) best = {centre, radius};
    centre = Lerp(centre, farthest, 1.0 / (step + 2));
  }
  return best;
}

}  // namespace ZORDefault
