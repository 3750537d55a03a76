#include "default_platform/space_analysis/ViewChoice.h"

#include <algorithm>
#include <cstdint>
#include <functional>
#include <memory>
#include <utility>

#include "default_platform/space_analysis/InterferenceRep.h"
#include "default_platform/visualisation/Rendering.h"
#include "foundation/Vector3.h"
#include "platform/visualisation/ZOR3DBagRep.h"

namespace ZORDefault {
namespace {

using namespace ZORFoundation;

/// The pictures that directions are tried on: a twelfth of those in reports.
constexpr int kWidth = 63;
constexpr int kHeight = 42;
/// Of each product, in those pixels: enough to take a direction without trying others, and too few
/// to be content with the part that is framed.
constexpr int kPlenty = 125;
constexpr int kTooFew = 20;
/// Markers are small: in the pixels of pictures of twice the width and height.
constexpr int kPlentyOfMarkers = 3;

struct Destroyer {
  void operator()(ZORRep* inRep) const { inRep->Destroy(); }
};
typedef std::unique_ptr<ZOR3DBagRep, Destroyer> OwnBag;

/// The middle of the points' box, and the farthest point from there.
ZOR3DBoundingSphere SphereOf(const std::vector<ZORMathVector>& inPoints) {
  ZORMathVector low = inPoints.front(), high = low;
  for (const ZORMathVector& point : inPoints) {
    low = {std::min(low.x, point.x), std::min(low.y, point.y), std::min(low.z, point.z)};
    high = {std::max(high.x, point.x), std::max(high.y, point.y), std::max(high.z, point.z)};
  }
  ZOR3DBoundingSphere sphere(0.5 * (low + high), 0);
  for (const ZORMathVector& point : inPoints)
    sphere.radius = std::max(sphere.radius, Length(point - sphere.centre));
  return sphere;
}

/// The default direction, the other corners from above, the sides, the corners from below, and
/// along the axes.
const std::vector<ZORMathVector>& Directions() {
  static const std::vector<ZORMathVector> directions = [] {
    std::vector<ZORMathVector> all;
    for (const ZORMathVector& way : std::initializer_list<ZORMathVector>{
             {-1, -1, -1}, {1, -1, -1}, {-1, 1, -1}, {1, 1, -1},  {-2, -1, -1}, {-1, -2, -1},
             {2, -1, -1},  {1, -2, -1}, {-2, 1, -1}, {-1, 2, -1}, {2, 1, -1},   {1, 2, -1},
             {-1, -1, -3}, {1, 1, -3},  {-1, -1, 1}, {1, -1, 1},  {-1, 1, 1},   {1, 1, 1},
             {-1, -1, 3},  {1, 1, 3},   {-1, 0, 0},  {1, 0, 0},   {0, -1, 0},   {0, 1, 0},
             {0, 0, -1},   {0, 0, 1}})
      all.push_back(NormalizeOr(way, DefaultSightDirection()));
    return all;
  }();
  return directions;
}

/// All around, evenly: on a spiral from pole to pole by the golden angle.
std::vector<ZORMathVector> ManyDirections() {
  constexpr int kCount = 100;
  constexpr double kGoldenAngle = 2.39996322972865332;
  std::vector<ZORMathVector> all;
  for (int i = 0; i < kCount; ++i) {
    const double z = 1 - (2 * i + 1.0) / kCount, r = std::sqrt(1 - z * z);
    all.push_back({r * std::cos(kGoldenAngle * i), r * std::sin(kGoldenAngle * i), z});
  }
  return all;
}

/// How many pixels show each product and all else.
struct SeenThings {
  int products[2] = {0, 0};
  int markers = 0;
};

ChosenView ViewFrom(const ZORMathVector& inSight, const ZORMathVector& inCentre, double inRadius,
                    bool inIsDimension) {
  return {{inRadius, inSight, UpFor(inSight), inIsDimension}, {inCentre, inRadius}};
}

ZOR3DViewpoint Framing(const MarkerStyle& inStyle, const ZOR3DBoundingSphere& inFramed) {
  ZOR3DViewpoint viewpoint;
  viewpoint.sight = inStyle.sight;
  viewpoint.up = inStyle.up;
  viewpoint.Reframe(kWidth, kHeight, 1, 1, inFramed);
  return viewpoint;
}

/// Small pictures of the products.
class ViewTrial {
 public:
  ViewTrial(const ShownProducts& inProducts, int inWidth, int inHeight)
      : scene_(new ZOR3DBagRep), width_(inWidth), height_(inHeight) {
    for (std::size_t i = 0; i < 2; ++i) {
      if (!inProducts[i]) continue;
      meshCounts_[i] = CollectMeshInstances(*inProducts[i]).size();
      // The scene does not change what it shows.
      scene_->AddChild(const_cast<ZOR3DRep*>(inProducts[i]));
    }
  }

  /// Pixels of the product that is seen less. Markers do not count: they are drawn over all else.
  int ScoreOf(const ChosenView& inView) const {
    const SeenThings seen = See(Framing(inView.markers, inView.framed));
    return std::min(seen.products[0], seen.products[1]);
  }
  SeenThings See(const ZOR3DViewpoint& inViewpoint) const {
    return Count(RenderIdBuffer(*scene_, inViewpoint, width_, height_));
  }
  SeenThings SeeWith(InterferenceRep& inMarkers, const ZOR3DViewpoint& inViewpoint) const {
    scene_->AddChild(&inMarkers);
    const SeenThings seen = See(inViewpoint);
    scene_->RemoveChild(&inMarkers);
    return seen;
  }

 private:
  SeenThings Count(const std::optional<std::vector<IdBufferPixel>>& inPixels) const {
    SeenThings seen;
    if (!inPixels) return seen;
    for (const IdBufferPixel& pixel : *inPixels) {
      if (pixel.mesh == IdBufferPixel::kNone) continue;
      if (pixel.mesh < meshCounts_[0])
        ++seen.products[0];
      else if (pixel.mesh < meshCounts_[0] + meshCounts_[1])
        ++seen.products[1];
      else
        ++seen.markers;
    }
    return seen;
  }

  OwnBag scene_;
  int width_, height_;
  std::array<std::size_t, 2> meshCounts_{};
};

/// Radii to frame around the points, the preferred one first, the last one around all.
std::vector<double> RadiiAround(const ZOR3DBoundingSphere& inPoints,
                                const ShownProducts& inProducts) {
  double smallest = 0, all = 0;
  for (const ZOR3DRep* const product : inProducts) {
    if (!product) continue;
    const ZOR3DBoundingSphere sphere = product->GetShowBoundingElement();
    if (sphere.IsEmpty()) continue;
    smallest = smallest > 0 ? std::min(smallest, sphere.radius) : sphere.radius;
    all = std::max(all, Length(sphere.centre - inPoints.centre) + sphere.radius);
  }
  constexpr double kAnything = 10;  // millimetres, where there is no product
  const double preferred =
      std::max({1.3 * inPoints.radius, 1.1 * smallest, 0.02 * all, all > 0 ? 0 : kAnything});
  std::vector<double> radii = {preferred};
  for (double radius = 2.5 * preferred; radius < all; radius *= 2.5) radii.push_back(radius);
  if (all > preferred) radii.push_back(all);
  return radii;
}

/// Where a product is hidden nearly everywhere: more directions in larger pictures, and closer from
/// where it is seen most.
ChosenView LookClosely(const ShownProducts& inProducts, const ChosenView& inBest, double inRadius) {
  const ViewTrial trial(inProducts, 2 * kWidth, 2 * kHeight);
  ChosenView best = inBest;
  int bestScore = trial.ScoreOf(best);
  const auto look = [&](const ZORMathVector& inSight, double inShare) {
    const ChosenView tried =
        ViewFrom(inSight, inBest.framed.centre, inShare * inRadius, inBest.markers.isDimension);
    const int score = trial.ScoreOf(tried);
    if (score > bestScore) best = tried;
    bestScore = std::max(bestScore, score);
    return score;
  };
  std::vector<std::pair<int, ZORMathVector>> sights;
  for (const ZORMathVector& sight : ManyDirections()) sights.emplace_back(look(sight, 1), sight);
  constexpr std::size_t kMaxCandidates = 8;
  std::ranges::partial_sort(sights, sights.begin() + kMaxCandidates, std::ranges::greater(),
                            &std::pair<int, ZORMathVector>::first);
  for (std::size_t i = 0; i < kMaxCandidates; ++i)
    for (const double share : {0.5, 0.25, 0.125}) look(sights[i].second, share);
  return best;
}

}  // namespace

ZORMathVector UpFor(const ZORMathVector& inSight) {
  const ZORMathVector axis =
      std::fabs(inSight.z) < 0.999 ? ZORMathVector(0, 0, 1) : ZORMathVector(0, 1, 0);
  return NormalizeOr(axis - Dot(axis, inSight) * inSight, axis);
}

ChosenView ChooseView(const ShownProducts& inProducts, const std::vector<ZORMathVector>& inPoints,
                      bool inIsDimension) {
  const ZOR3DBoundingSphere points = SphereOf(inPoints);
  const std::vector<double> radii = RadiiAround(points, inProducts);
  ChosenView best = ViewFrom(DefaultSightDirection(), points.centre, radii.front(), inIsDimension);
  if (!inProducts[0] || !inProducts[1]) return best;
  const ViewTrial trial(inProducts, kWidth, kHeight);
  int bestScore = 0;
  for (const double radius : radii) {
    for (const ZORMathVector& sight : Directions()) {
      const ChosenView tried = ViewFrom(sight, points.centre, radius, inIsDimension);
      const int score = trial.ScoreOf(tried);
      if (score <= bestScore) continue;
      bestScore = score;
      best = tried;
      if (score >= kPlenty) return best;
    }
    if (bestScore >= kTooFew) return best;
  }
  return LookClosely(inProducts, best, radii.front());
}

void LengthenPins(const ShownProducts& inProducts, const std::vector<ZORMathVector>& inPoints,
                  const ZOR3DViewpoint& inViewpoint, MarkerStyle& ioStyle) {
  if (inViewpoint.nearPlane <= 0) return;
  const ViewTrial trial(inProducts, 2 * kWidth, 2 * kHeight);
  int mostSeen = -1;
  MarkerStyle tried = ioStyle;
  for (const double length : {0.0, 0.4, 0.7, 1.0}) {
    tried.pinLength = length;
    const std::unique_ptr<InterferenceRep, Destroyer> markers(
        new InterferenceRep(inPoints, tried, {}));
    const int seen = trial.SeeWith(*markers, inViewpoint).markers;
    if (seen <= mostSeen) continue;
    mostSeen = seen;
    ioStyle = tried;
    if (seen >= kPlentyOfMarkers) return;
  }
}

}  // namespace ZORDefault
