#include "default_platform/visualisation/ray_caster/EdgeLines.h"

#include <algorithm>
#include <cmath>
#include <cstddef>

#include "default_platform/visualisation/ray_caster/Parallel.h"

namespace ZORRayCaster {
namespace {

constexpr float kHalfWidth = 0.6F;
constexpr float kReach = kHalfWidth + 0.5F;

/// A line's end on the picture.
struct LineEnd {
  PicturePoint point;
  float nearness;
};

/// Draws lines of one share of a picture into a coverage of its own.
class LinePainter {
 public:
  LinePainter(const View& inView, const Sample* inPixels, LineCoverage& ioCoverage)
      : view_(inView), pixels_(inPixels), coverage_(ioCoverage) {}

  void SetStrength(float inStrength) { strength_ = inStrength; }
  void DrawLine(LineEnd inFrom, LineEnd inTo);
  void DrawDot(LineEnd inAt, float inStrength);

 private:
  bool Clip(LineEnd& ioFrom, LineEnd& ioTo) const;
  void CoverPixel(int inX, int inY, const LineEnd& inFrom, const LineEnd& inTo);
  bool IsHidden(const Sample& inPixel, float inDx, float inDy, float inNearness) const;
  void Cover(int inX, int inY, PicturePoint inNearest, float inNearness, float inCoverage);

  const View& view_;
  const Sample* pixels_;
  LineCoverage& coverage_;
  float strength_ = 1;
};

/// The part of 0 to 1 for which from + t * step stays between two limits.
void Limit(float inFrom, float inStep, float inLow, float inHigh, float& ioStart, float& ioEnd) {
  if (inStep == 0) {
    if (inFrom < inLow || inFrom > inHigh) ioEnd = -1;
    return;
  }
  const float a = (inLow - inFrom) / inStep;
  const float b = (inHigh - inFrom) / inStep;
  ioStart = std::max(ioStart, std::min(a, b));
  ioEnd = std::min(ioEnd, std::max(a, b));
}

LineEnd Between(const LineEnd& inA, const LineEnd& inB, float inShare) {
  return {{inA.point.x + inShare * (inB.point.x - inA.point.x),
           inA.point.y + inShare * (inB.point.y - inA.point.y)},
          inA.nearness + inShare * (inB.nearness - inA.nearness)};
}

/// Cuts a line to the picture and a margin (Liang and Barsky).
bool LinePainter::Clip(LineEnd& ioFrom, LineEnd& ioTo) const {
  constexpr float kMargin = 2;
  float start = 0, end = 1;
  Limit(ioFrom.point.x, ioTo.point.x - ioFrom.point.x, -kMargin,
        static_cast<float>(view_.width) + kMargin, start, end);
  Limit(ioFrom.point.y, ioTo.point.y - ioFrom.point.y, -kMargin,
        static_cast<float>(view_.height) + kMargin, start, end);
  if (!(start <= end)) return false;
  const LineEnd from = ioFrom;
  if (start > 0) ioFrom = Between(from, ioTo, start);
  if (end < 1) ioTo = Between(from, ioTo, end);
  return true;
}

void LinePainter::DrawLine(LineEnd inFrom, LineEnd inTo) {
  if (!Clip(inFrom, inTo)) return;
  const float dx = inTo.point.x - inFrom.point.x;
  const float dy = inTo.point.y - inFrom.point.y;
  const bool isFlat = std::fabs(dx) >= std::fabs(dy);
  // Along the longer side pixel by pixel; across it the few pixels that the width reaches.
  const float fromAlong = isFlat ? inFrom.point.x : inFrom.point.y;
  const float toAlong = isFlat ? inTo.point.x : inTo.point.y;
  const float fromAcross = isFlat ? inFrom.point.y : inFrom.point.x;
  const float toAcross = isFlat ? inTo.point.y : inTo.point.x;
  const float slope = toAlong == fromAlong ? 0 : (toAcross - fromAcross) / (toAlong - fromAlong);
  const float reach = kReach * std::sqrt(1 + slope * slope);
  const auto [low, high] = std::minmax(fromAlong, toAlong);
  const int last = static_cast<int>(std::floor(high + kReach));
  for (int along = static_cast<int>(std::floor(low - kReach)); along <= last; ++along) {
    const float middle = std::clamp(static_cast<float>(along) + 0.5F, low, high);
    const float across = fromAcross + slope * (middle - fromAlong);
    const int lastAcross = static_cast<int>(std::floor(across + reach));
    for (int i = static_cast<int>(std::floor(across - reach)); i <= lastAcross; ++i)
      isFlat ? CoverPixel(along, i, inFrom, inTo) : CoverPixel(i, along, inFrom, inTo);
  }
}

void LinePainter::CoverPixel(int inX, int inY, const LineEnd& inFrom, const LineEnd& inTo) {
  if (inX < 0 || inY < 0 || inX >= view_.width || inY >= view_.height) return;
  const float dx = inTo.point.x - inFrom.point.x;
  const float dy = inTo.point.y - inFrom.point.y;
  const float x = static_cast<float>(inX) + 0.5F;
  const float y = static_cast<float>(inY) + 0.5F;
  const float square = dx * dx + dy * dy;
  const float along = (x - inFrom.point.x) * dx + (y - inFrom.point.y) * dy;
  const float share = square > 0 ? std::clamp(along / square, 0.F, 1.F) : 0;
  const LineEnd nearest = Between(inFrom, inTo, share);
  const float distanceX = x - nearest.point.x, distanceY = y - nearest.point.y;
  const float squareDistance = distanceX * distanceX + distanceY * distanceY;
  if (squareDistance >= kReach * kReach) return;
  const float coverage = std::min(kReach - std::sqrt(squareDistance), 1.F);
  Cover(inX, inY, nearest.point, nearest.nearness, coverage * strength_);
}

void LinePainter::DrawDot(LineEnd inAt, float inStrength) {
  const float x = std::floor(inAt.point.x), y = std::floor(inAt.point.y);
  if (!(x >= 0 && y >= 0 && x < static_cast<float>(view_.width) &&
        y < static_cast<float>(view_.height)))
    return;
  Cover(static_cast<int>(x), static_cast<int>(y), inAt.point, inAt.nearness, inStrength);
}

/// Whether a pixel's surface, continued to a point beside the pixel's middle, lies in front.
bool LinePainter::IsHidden(const Sample& inPixel, float inDx, float inDy, float inNearness) const {
  if (inPixel.nearness == Sample::kBackground) return false;
  // Half a pixel of depth and of slope: lines lie on the surfaces that they bound, and triangles
  // only come close to curved ones.
  constexpr float kDepthTolerance = 0.6F, kSlopeTolerance = 0.5F;
  const float surface = inPixel.nearness + inPixel.slopeX * inDx + inPixel.slopeY * inDy;
  const float tolerance = kDepthTolerance * view_.NearnessOfPixel(inPixel.nearness) +
                          kSlopeTolerance * (std::fabs(inPixel.slopeX) + std::fabs(inPixel.slopeY));
  return inNearness < surface - tolerance;
}

void LinePainter::Cover(int inX, int inY, PicturePoint inNearest, float inNearness,
                        float inCoverage) {
  const std::size_t place = static_cast<std::size_t>(inY) * static_cast<std::size_t>(view_.width) +
                            static_cast<std::size_t>(inX);
  const float dx = inNearest.x - (static_cast<float>(inX) + 0.5F);
  const float dy = inNearest.y - (static_cast<float>(inY) + 0.5F);
  const bool isHidden = IsHidden(pixels_[place], dx, dy, inNearness);
  if (isHidden && coverage_.hidden.empty()) return;
  std::uint8_t& covered = (isHidden ? coverage_.hidden : coverage_.visible)[place];
  covered = std::max(covered, static_cast<std::uint8_t>(inCoverage * 255));
}

/// Draws the lines of all meshes, or one share of each.
class ScenePainter {
 public:
  ScenePainter(const DrawnScene& inScene, LinePainter& ioPainter)
      : scene_(inScene), view_(inScene.GetView()), painter_(ioPainter) {}
  void Draw(int inShare, int inShareCount);

 private:
  float Strength(const DrawnItem& inItem) const;
  void DrawSpeck(const DrawnItem& inItem);
  void DrawPolyline(const DrawnItem& inItem, std::size_t inStart, std::size_t inEnd);
  void DrawSegment(Vec3 inFrom, Vec3 inTo);
  LineEnd Project(Vec3 inPlace) const {
    return {view_.PointOf(inPlace), view_.Nearness(inPlace.z)};
  }

  const DrawnScene& scene_;
  const View& view_;
  LinePainter& painter_;
  float nearest_ = 0;  // lines are cut there
};

void ScenePainter::Draw(int inShare, int inShareCount) {
  for (const DrawnItem& item : scene_.GetItems()) {
    if (scene_.BoxOf(item).IsEmpty()) continue;
    nearest_ = std::max(view_.nearest, 1e-5F * (item.centre.z + item.radius));
    if (inShare == 0) DrawSpeck(item);
    painter_.SetStrength(Strength(item));
    const std::vector<std::uint32_t>& starts = item.mesh->lineStarts;
    if (starts.size() < 2) continue;
    const std::size_t count = starts.size() - 1;
    const auto bound = [&](int inNumber) {
      return count * static_cast<std::size_t>(inNumber) / static_cast<std::size_t>(inShareCount);
    };
    for (std::size_t line = bound(inShare); line < bound(inShare + 1); ++line)
      DrawPolyline(item, starts[line],
                   std::min<std::size_t>(starts[line + 1], item.mesh->edgePoints.size()));
  }
}

/// Lines that would fill the mesh's place on the picture with ink are drawn lighter.
float ScenePainter::Strength(const DrawnItem& inItem) const {
  constexpr float kWidth = 2 * kHalfWidth, kFullInk = 0.5F, kPi = 3.14159265F, kFaintest = 0.2F;
  const float depth = std::max(inItem.centre.z, inItem.radius);
  const float radius = view_.PixelsOf(inItem.radius, depth);
  const float stretch = inItem.mesh->sphere.radius > 0
                            ? inItem.radius / static_cast<float>(inItem.mesh->sphere.radius)
                            : 1;
  // About half of a part's lines are on its far side.
  const float ink = 0.5F * kWidth * view_.PixelsOf(inItem.structure->LineLength() * stretch, depth);
  const float area = kPi * (radius + 1) * (radius + 1);
  return ink > kFullInk * area ? std::max(kFullInk * area / ink, kFaintest) : 1;
}

/// Leaves a trace of what is smaller than a pixel, so that no part is lost between the rays.
void ScenePainter::DrawSpeck(const DrawnItem& inItem) {
  constexpr float kSpeckSize = 1, kStrength = 0.45F;
  const float depth = inItem.centre.z - inItem.radius;
  if (inItem.mesh->triangles.empty() || !(depth > nearest_)) return;
  if (view_.PixelsOf(inItem.radius, inItem.centre.z) < 0.5F * kSpeckSize)
    painter_.DrawDot({view_.PointOf(inItem.centre), view_.Nearness(depth)}, kStrength);
}

void ScenePainter::DrawPolyline(const DrawnItem& inItem, std::size_t inStart, std::size_t inEnd) {
  const auto& points = inItem.mesh->edgePoints;
  if (inStart >= inEnd) return;
  Vec3 from = inItem.cameraFromMesh * ToVec3(points[inStart]);
  for (std::size_t i = inStart + 1; i < inEnd; ++i) {
    const Vec3 to = inItem.cameraFromMesh * ToVec3(points[i]);
    DrawSegment(from, to);
    from = to;
  }
}

void ScenePainter::DrawSegment(Vec3 inFrom, Vec3 inTo) {
  if (!(inFrom.z >= nearest_ && inTo.z >= nearest_ && inFrom.z <= view_.farthest &&
        inTo.z <= view_.farthest)) {
    float start = 0, end = 1;
    Limit(inFrom.z, inTo.z - inFrom.z, nearest_, view_.farthest, start, end);
    if (!(start <= end)) return;
    const Vec3 from = Mix(inFrom, inTo, start), to = Mix(inFrom, inTo, end);
    inFrom = from;
    inTo = to;
  }
  const LineEnd from = Project(inFrom), to = Project(inTo);
  if (std::isfinite(from.point.x + from.point.y + to.point.x + to.point.y))
    painter_.DrawLine(from, to);
}

void TakeStronger(std::vector<std::uint8_t>& ioCoverage, const std::vector<std::uint8_t>& inOther) {
  for (std::size_t i = 0; i < ioCoverage.size(); ++i)
    ioCoverage[i] = std::max(ioCoverage[i], inOther[i]);
}

}  // namespace

LineCoverage DrawEdgeLines(const DrawnScene& inScene, const Sample* inPixels, bool inDrawHidden,
                           int inThreadCount) {
  const View& view = inScene.GetView();
  const std::size_t size =
      static_cast<std::size_t>(view.width) * static_cast<std::size_t>(view.height);
  std::vector<LineCoverage> shares(static_cast<std::size_t>(inThreadCount));
  ForEach(inThreadCount, inThreadCount, [&](int inShare) {
    LineCoverage& coverage = shares[static_cast<std::size_t>(inShare)];
    coverage.visible.assign(size, 0);
    if (inDrawHidden) coverage.hidden.assign(size, 0);
    LinePainter painter(view, inPixels, coverage);
    ScenePainter(inScene, painter).Draw(inShare, inThreadCount);
  });
  // The strongest of all, so that the number of shares does not show.
  for (std::size_t i = 1; i < shares.size(); ++i) {
    TakeStronger(shares[0].visible, shares[i].visible);
    TakeStronger(shares[0].hidden, shares[i].hidden);
  }
  return std::move(shares[0]);
}

}  // namespace ZORRayCaster
