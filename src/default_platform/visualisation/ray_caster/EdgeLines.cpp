#include "default_platform/visualisation/ray_caster/EdgeLines.h"

#include <algorithm>
#include <cmath>
#include <cstddef>

#include "foundation/ParallelFor.h"

namespace ZORRayCaster {
namespace {

constexpr float kHalfWidth = 0.6F;
constexpr float kReach = kHalfWidth + 0.5F;

struct RasterVertex {
  RasterPoint point;
  float inverseDepth;
};

/// Rasterizes lines into a coverage buffer, with a depth test against the surface samples.
class LineRasterizer {
 public:
  LineRasterizer(const View& inView, const Sample* inPixels, LineCoverage& ioCoverage)
      : view_(inView), pixels_(inPixels), coverage_(ioCoverage) {}

  void SetStrength(float inStrength) { strength_ = inStrength; }
  void DrawLine(RasterVertex inFrom, RasterVertex inTo);
  void DrawDot(RasterVertex inAt, float inStrength);

 private:
  bool Clip(RasterVertex& ioFrom, RasterVertex& ioTo) const;
  void CoverPixel(int inX, int inY, const RasterVertex& inFrom, const RasterVertex& inTo);
  bool IsHidden(const Sample& inPixel, float inDx, float inDy, float inInverseDepth) const;
  void Cover(int inX, int inY, RasterPoint inNearest, float inInverseDepth, float inCoverage);

  const View& view_;
  const Sample* pixels_;
  LineCoverage& coverage_;
  float strength_ = 1;
};

/// Narrows an interval of t to that where inFrom + t * inStep lies between two limits.
void ClipInterval(float inFrom, float inStep, float inLow, float inHigh, float& ioStart,
                  float& ioEnd) {
  if (inStep == 0) {
    if (inFrom < inLow || inFrom > inHigh) ioEnd = -1;
    return;
  }
  const float a = (inLow - inFrom) / inStep;
  const float b = (inHigh - inFrom) / inStep;
  ioStart = std::max(ioStart, std::min(a, b));
  ioEnd = std::min(ioEnd, std::max(a, b));
}

RasterVertex Lerp(const RasterVertex& inA, const RasterVertex& inB, float inShare) {
  return {{inA.point.x + inShare * (inB.point.x - inA.point.x),
           inA.point.y + inShare * (inB.point.y - inA.point.y)},
          inA.inverseDepth + inShare * (inB.inverseDepth - inA.inverseDepth)};
}

/// Clips to the picture and a margin (Liang and Barsky, "A new concept and method for line
/// clipping", 1984).
bool LineRasterizer::Clip(RasterVertex& ioFrom, RasterVertex& ioTo) const {
  constexpr float kMargin = 2;
  float start = 0, end = 1;
  ClipInterval(ioFrom.point.x, ioTo.point.x - ioFrom.point.x, -kMargin,
               static_cast<float>(view_.width) + kMargin, start, end);
  ClipInterval(ioFrom.point.y, ioTo.point.y - ioFrom.point.y, -kMargin,
               static_cast<float>(view_.height) + kMargin, start, end);
  if (!(start <= end)) return false;
  const RasterVertex from = ioFrom;
  if (start > 0) ioFrom = Lerp(from, ioTo, start);
  if (end < 1) ioTo = Lerp(from, ioTo, end);
  return true;
}

void LineRasterizer::DrawLine(RasterVertex inFrom, RasterVertex inTo) {
  if (!Clip(inFrom, inTo)) return;
  const float dx = inTo.point.x - inFrom.point.x;
  const float dy = inTo.point.y - inFrom.point.y;
  const bool isFlat = std::fabs(dx) >= std::fabs(dy);
  // Steps along the major axis, and over the line's width along the minor one.
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

void LineRasterizer::CoverPixel(int inX, int inY, const RasterVertex& inFrom,
                                const RasterVertex& inTo) {
  if (inX < 0 || inY < 0 || inX >= view_.width || inY >= view_.height) return;
  const float dx = inTo.point.x - inFrom.point.x;
  const float dy = inTo.point.y - inFrom.point.y;
  const float x = static_cast<float>(inX) + 0.5F;
  const float y = static_cast<float>(inY) + 0.5F;
  const float square = dx * dx + dy * dy;
  const float along = (x - inFrom.point.x) * dx + (y - inFrom.point.y) * dy;
  const float share = square > 0 ? std::clamp(along / square, 0.F, 1.F) : 0;
  const RasterVertex nearest = Lerp(inFrom, inTo, share);
  const float distanceX = x - nearest.point.x, distanceY = y - nearest.point.y;
  const float squareDistance = distanceX * distanceX + distanceY * distanceY;
  if (squareDistance >= kReach * kReach) return;
  const float coverage = std::min(kReach - std::sqrt(squareDistance), 1.F);
  Cover(inX, inY, nearest.point, nearest.inverseDepth, coverage * strength_);
}

void LineRasterizer::DrawDot(RasterVertex inAt, float inStrength) {
  const float x = std::floor(inAt.point.x), y = std::floor(inAt.point.y);
  if (!(x >= 0 && y >= 0 && x < static_cast<float>(view_.width) &&
        y < static_cast<float>(view_.height)))
    return;
  Cover(static_cast<int>(x), static_cast<int>(y), inAt.point, inAt.inverseDepth, inStrength);
}

/// Depth test against the pixel's surface, extrapolated to a point beside the pixel's centre.
bool LineRasterizer::IsHidden(const Sample& inPixel, float inDx, float inDy,
                              float inInverseDepth) const {
  if (inPixel.inverseDepth == Sample::kBackground) return false;
  // Lines lie on the surfaces that they bound, which triangles only approximate: half a pixel of
  // depth and of slope is tolerated.
  constexpr float kDepthTolerance = 0.6F, kSlopeTolerance = 0.5F;
  const float surface = inPixel.inverseDepth + inPixel.slopeX * inDx + inPixel.slopeY * inDy;
  const float tolerance = kDepthTolerance * view_.InverseDepthPerPixel(inPixel.inverseDepth) +
                          kSlopeTolerance * (std::fabs(inPixel.slopeX) + std::fabs(inPixel.slopeY));
  return inInverseDepth < surface - tolerance;
}

void LineRasterizer::Cover(int inX, int inY, RasterPoint inNearest, float inInverseDepth,
                           float inCoverage) {
  const std::size_t place = static_cast<std::size_t>(inY) * static_cast<std::size_t>(view_.width) +
                            static_cast<std::size_t>(inX);
  const float dx = inNearest.x - (static_cast<float>(inX) + 0.5F);
  const float dy = inNearest.y - (static_cast<float>(inY) + 0.5F);
  const bool isHidden = IsHidden(pixels_[place], dx, dy, inInverseDepth);
  if (isHidden && coverage_.hidden.empty()) return;
  std::uint8_t& covered = (isHidden ? coverage_.hidden : coverage_.visible)[place];
  covered = std::max(covered, static_cast<std::uint8_t>(inCoverage * 255));
}

/// Draws the edges of all instances, or one share of each.
class EdgeRenderer {
 public:
  EdgeRenderer(const RenderScene& inScene, LineRasterizer& ioRasterizer)
      : scene_(inScene), view_(inScene.GetView()), rasterizer_(ioRasterizer) {}
  void Draw(int inShare, int inShareCount);

 private:
  float Strength(const SceneInstance& inInstance) const;
  void DrawSubpixelDot(const SceneInstance& inInstance);
  void DrawPolyline(const SceneInstance& inInstance, std::size_t inStart, std::size_t inEnd);
  void DrawSegment(Vector3f inFrom, Vector3f inTo);
  RasterVertex Project(Vector3f inPlace) const {
    return {view_.Project(inPlace), view_.InverseDepth(inPlace.z)};
  }

  const RenderScene& scene_;
  const View& view_;
  LineRasterizer& rasterizer_;
  float nearClip_ = 0;
};

void EdgeRenderer::Draw(int inShare, int inShareCount) {
  for (const SceneInstance& instance : scene_.GetInstances()) {
    if (scene_.BoundsOf(instance).IsEmpty()) continue;
    nearClip_ = std::max(view_.nearClip, 1e-5F * (instance.centre.z + instance.radius));
    if (inShare == 0) DrawSubpixelDot(instance);
    rasterizer_.SetStrength(Strength(instance));
    const std::vector<std::uint32_t>& starts = instance.mesh->lineStarts;
    if (starts.size() < 2) continue;
    const std::size_t count = starts.size() - 1;
    const auto bound = [&](int inNumber) {
      return count * static_cast<std::size_t>(inNumber) / static_cast<std::size_t>(inShareCount);
    };
    for (std::size_t line = bound(inShare); line < bound(inShare + 1); ++line)
      DrawPolyline(instance, starts[line],
                   std::min<std::size_t>(starts[line + 1], instance.mesh->edgePoints.size()));
  }
}

/// Dense lines, which would fill the instance's disc with ink, are drawn lighter.
float EdgeRenderer::Strength(const SceneInstance& inInstance) const {
  constexpr float kWidth = 2 * kHalfWidth, kFullInk = 0.5F, kPi = 3.14159265F, kMinStrength = 0.2F;
  const float depth = std::max(inInstance.centre.z, inInstance.radius);
  const float radius = view_.PixelLength(inInstance.radius, depth);
  const float stretch = inInstance.mesh->sphere.radius > 0
                            ? inInstance.radius / static_cast<float>(inInstance.mesh->sphere.radius)
                            : 1;
  // About half of the lines are on the far side.
  const float ink =
      0.5F * kWidth * view_.PixelLength(inInstance.bvh->LineLength() * stretch, depth);
  const float area = kPi * (radius + 1) * (radius + 1);
  return ink > kFullInk * area ? std::max(kFullInk * area / ink, kMinStrength) : 1;
}

/// Marks an instance smaller than a pixel, which rays may miss.
void EdgeRenderer::DrawSubpixelDot(const SceneInstance& inInstance) {
  constexpr float kDotSize = 1, kStrength = 0.45F;
  const float depth = inInstance.centre.z - inInstance.radius;
  if (inInstance.mesh->triangles.empty() || !(depth > nearClip_)) return;
  if (view_.PixelLength(inInstance.radius, inInstance.centre.z) < 0.5F * kDotSize)
    rasterizer_.DrawDot({view_.Project(inInstance.centre), view_.InverseDepth(depth)}, kStrength);
}

void EdgeRenderer::DrawPolyline(const SceneInstance& inInstance, std::size_t inStart,
                                std::size_t inEnd) {
  const auto& points = inInstance.mesh->edgePoints;
  if (inStart >= inEnd) return;
  Vector3f from = inInstance.cameraFromMesh * ToVector3(points[inStart]);
  for (std::size_t i = inStart + 1; i < inEnd; ++i) {
    const Vector3f to = inInstance.cameraFromMesh * ToVector3(points[i]);
    DrawSegment(from, to);
    from = to;
  }
}

void EdgeRenderer::DrawSegment(Vector3f inFrom, Vector3f inTo) {
  if (!(inFrom.z >= nearClip_ && inTo.z >= nearClip_ && inFrom.z <= view_.farClip &&
        inTo.z <= view_.farClip)) {
    float start = 0, end = 1;
    ClipInterval(inFrom.z, inTo.z - inFrom.z, nearClip_, view_.farClip, start, end);
    if (!(start <= end)) return;
    const Vector3f from = Lerp(inFrom, inTo, start), to = Lerp(inFrom, inTo, end);
    inFrom = from;
    inTo = to;
  }
  const RasterVertex from = Project(inFrom), to = Project(inTo);
  if (std::isfinite(from.point.x + from.point.y + to.point.x + to.point.y))
    rasterizer_.DrawLine(from, to);
}

void TakeMaximum(std::vector<std::uint8_t>& ioCoverage, const std::vector<std::uint8_t>& inOther) {
  for (std::size_t i = 0; i < ioCoverage.size(); ++i)
    ioCoverage[i] = std::max(ioCoverage[i], inOther[i]);
}

}  // namespace

LineCoverage DrawEdgeLines(const RenderScene& inScene, const Sample* inPixels, bool inDrawHidden,
                           int inThreadCount) {
  const View& view = inScene.GetView();
  const std::size_t size =
      static_cast<std::size_t>(view.width) * static_cast<std::size_t>(view.height);
  std::vector<LineCoverage> shares(static_cast<std::size_t>(inThreadCount));
  ZORFoundation::ParallelFor(inThreadCount, inThreadCount, [&](int inShare) {
    LineCoverage& coverage = shares[static_cast<std::size_t>(inShare)];
    coverage.visible.assign(size, 0);
    if (inDrawHidden) coverage.hidden.assign(size, 0);
    LineRasterizer painter(view, inPixels, coverage);
    EdgeRenderer(inScene, painter).Draw(inShare, inThreadCount);
  });
  // The maximum does not depend on the number of shares.
  for (std::size_t i = 1; i < shares.size(); ++i) {
    TakeMaximum(shares[0].visible, shares[i].visible);
    TakeMaximum(shares[0].hidden, shares[i].hidden);
  }
  return std::move(shares[0]);
}

}  // namespace ZORRayCaster
