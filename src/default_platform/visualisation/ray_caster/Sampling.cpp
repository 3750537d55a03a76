#include "default_platform/visualisation/ray_caster/Sampling.h"

#include <algorithm>
#include <cmath>

#include "foundation/ParallelFor.h"

namespace ZORRayCaster {
namespace {

constexpr int kTileSize = 32;
constexpr int kBlockWidth = 4;
constexpr int kBlockHeight = 2;
static_assert(kBlockWidth * kBlockHeight == RenderScene::kPacket);

/// Slopes are clamped to this many pixels of depth per pixel.
constexpr float kMaxSlope = 20;

constexpr int kMaxTransparentLayers = 24;

int TilesAcross(int inPixels) { return (inPixels + kTileSize - 1) / kTileSize; }

/// An invisible difference of radiance.
constexpr float kRadianceStep = 0.035F;

/// A depth discontinuity exceeds this many pixels of depth plus this many times the slope.
constexpr float kDepthBreak = 4;
constexpr float kSlopeBreak = 1.5F;

float MaxDifference(Vector3f inA, Vector3f inB) {
  return std::max({std::fabs(inA.x - inB.x), std::fabs(inA.y - inB.y), std::fabs(inA.z - inB.z)});
}

}  // namespace

std::unique_ptr<Sample[]> SurfacePass::CastPixels(int inThreadCount) const {
  const View& view = scene_.GetView();
  auto pixels = std::make_unique_for_overwrite<Sample[]>(static_cast<std::size_t>(view.width) *
                                                         static_cast<std::size_t>(view.height));
  const int tileCount = TilesAcross(view.width) * TilesAcross(view.height);
  ZORFoundation::ParallelFor(inThreadCount, tileCount,
                             [&](int inTile) { CastTile(inTile, pixels.get()); });
  return pixels;
}

void SurfacePass::CastTile(int inTile, Sample* outPixels) const {
  const View& view = scene_.GetView();
  const int left = inTile % TilesAcross(view.width) * kTileSize;
  const int top = inTile / TilesAcross(view.width) * kTileSize;
  const int right = std::min(left + kTileSize, view.width);
  const int bottom = std::min(top + kTileSize, view.height);
  for (int y = top; y < bottom; y += kBlockHeight)
    for (int x = left; x < right; x += kBlockWidth)
      CastBlock({x, y, std::min(x + kBlockWidth, right), std::min(y + kBlockHeight, bottom)},
                outPixels);
}

void SurfacePass::CastBlock(const PixelBounds& inBlock, Sample* outPixels) const {
  RasterPoint points[RenderScene::kPacket] = {};  // GCC cannot see that blocks are never empty
  Sample* targets[RenderScene::kPacket];
  int count = 0;
  for (int y = inBlock.top; y < inBlock.bottom; ++y) {
    for (int x = inBlock.left; x < inBlock.right; ++x) {
      points[count] = {static_cast<float>(x) + 0.5F, static_cast<float>(y) + 0.5F};
      targets[count++] = outPixels + static_cast<std::ptrdiff_t>(y) * scene_.GetView().width + x;
    }
  }
  const PixelBounds& bounds = scene_.GetBounds();
  const bool isOutside = inBlock.right <= bounds.left || inBlock.left >= bounds.right ||
                         inBlock.bottom <= bounds.top || inBlock.top >= bounds.bottom;
  Sample samples[RenderScene::kPacket];
  if (!isOutside) CastPoints(points, count, samples);
  for (int i = 0; i < count; ++i)
    *targets[i] = isOutside ? BackgroundSample(points[i]) : samples[i];
}

void SurfacePass::CastPoints(const RasterPoint* inPoints, int inCount, Sample* outSamples) const {
  Hit hits[RenderScene::kPacket];
  const bool meetAny = scene_.Cast(inPoints, inCount, hits);
  for (int i = 0; i < inCount; ++i)
    outSamples[i] = meetAny ? SampleOf(inPoints[i], hits[i]) : BackgroundSample(inPoints[i]);
}

Vector3f SurfacePass::BackgroundAt(RasterPoint inPoint) const {
  return background_.rows[static_cast<std::size_t>(inPoint.y)];
}

Sample SurfacePass::SampleOf(RasterPoint inPoint, const Hit& inHit) const {
  if (inHit.instance == Hit::kMiss) return BackgroundSample(inPoint);
  const SceneInstance& instance = scene_.GetInstances()[inHit.instance];
  const SurfaceColour& colour = instance.ColourOf(inHit.triangle);
  if (colour.opacity < 1 && background_.isShaded) return SampleTransparent(inPoint, inHit);
  const Vector3f direction = scene_.GetView().RayDirection(inPoint);
  const Vector3f plane = instance.normalMatrix * inHit.meshNormal;
  Sample sample;
  sample.instance = inHit.instance;
  SetPlane(direction, plane, inHit.depth, sample);
  sample.radiance =
      background_.isShaded ? ShadeHit(direction, plane, inHit, colour) : BackgroundAt(inPoint);
  return sample;
}

/// Composites transparent layers front to back. The sample keeps the front layer's instance and the
/// opaque surface's depth.
Sample SurfacePass::SampleTransparent(RasterPoint inPoint, Hit inHit) const {
  constexpr float kStep = 1e-6F;
  const std::uint32_t front = inHit.instance;
  const Vector3f direction = scene_.GetView().RayDirection(inPoint);
  Vector3f light{0, 0, 0};
  float transmittance = 1;
  for (int layer = 0; inHit.instance != Hit::kMiss && layer < kMaxTransparentLayers; ++layer) {
    const SceneInstance& instance = scene_.GetInstances()[inHit.instance];
    const SurfaceColour& colour = instance.ColourOf(inHit.triangle);
    if (colour.opacity >= 1) break;
    const Vector3f plane = instance.normalMatrix * inHit.meshNormal;
    light = light + transmittance * colour.opacity * ShadeHit(direction, plane, inHit, colour);
    transmittance *= 1 - colour.opacity;
    inHit = scene_.CastBeyond(inPoint, inHit.depth * (1 + kStep));
  }
  const bool isEnded = inHit.instance != Hit::kMiss &&
                       scene_.GetInstances()[inHit.instance].ColourOf(inHit.triangle).opacity < 1;
  Sample sample = isEnded ? BackgroundSample(inPoint) : SampleOf(inPoint, inHit);
  sample.instance = front;
  sample.radiance = light + transmittance * sample.radiance;
  return sample;
}

/// @param inPlane the geometric normal in camera space.
Vector3f SurfacePass::ShadeHit(Vector3f inDirection, Vector3f inPlane, const Hit& inHit,
                               const SurfaceColour& inColour) const {
  const Vector3f toEye = Normalised(-1 * inDirection);
  const Vector3f plane = Dot(inPlane, toEye) < 0 ? -1 * inPlane : inPlane;
  const SceneInstance& instance = scene_.GetInstances()[inHit.instance];
  if (!instance.hasNormals) return Shade(inColour.albedo, Normalised(plane), toEye);
  const auto& corners = instance.mesh->triangles[inHit.triangle];
  const auto& normals = instance.mesh->normals;
  const Vector3f meshNormal = (1 - inHit.u - inHit.v) * ToVector3(normals[corners[0]]) +
                              inHit.u * ToVector3(normals[corners[1]]) +
                              inHit.v * ToVector3(normals[corners[2]]);
  const Vector3f smooth = Normalised(instance.normalMatrix * meshNormal);
  const float side = Dot(smooth, plane);
  // Faces the eye; a degenerate shading normal is replaced by the geometric one.
  if (!(side < 0 || side > 0)) return Shade(inColour.albedo, Normalised(plane), toEye);
  return Shade(inColour.albedo, side < 0 ? -1 * smooth : smooth, toEye);
}

void SurfacePass::SetPlane(Vector3f inDirection, Vector3f inPlane, float inDepth,
                           Sample& outSample) const {
  const View& view = scene_.GetView();
  outSample.inverseDepth = view.InverseDepth(inDepth);
  // On the plane n . p = c the inverse depth is n . direction / c, or (n.x x + n.y y - c) / n.z.
  const float across = view.isPerspective ? inDepth * Dot(inPlane, inDirection) : inPlane.z;
  const float scale = view.pixelSize / across;
  const float steepest = kMaxSlope * view.InverseDepthPerPixel(outSample.inverseDepth);
  const auto slope = [&](float inComponent) {
    const float value = inComponent * scale;
    return std::fabs(value) <= steepest ? value : std::copysign(steepest, value);
  };
  const bool isUsable = std::isfinite(scale);
  outSample.slopeX = isUsable ? slope(inPlane.x) : 0;
  outSample.slopeY = isUsable ? slope(inPlane.y) : 0;
}

AdaptiveSampling::AdaptiveSampling(const SurfacePass& inPass, const View& inView,
                                   const Sample* inPixels, int inThreadCount)
    : view_(inView),
      pixels_(inPixels),
      discontinuities_(static_cast<std::size_t>(inView.width) *
                       static_cast<std::size_t>(inView.height)),
      firstSamples_(static_cast<std::size_t>(inView.width) *
                    static_cast<std::size_t>(inView.height)) {
  ZORFoundation::ParallelFor(inThreadCount, view_.height,
                             [&](int inY) { FindDiscontinuities(inY); });
  std::vector<std::int32_t> rowStarts(static_cast<std::size_t>(view_.height) + 1, 0);
  ZORFoundation::ParallelFor(inThreadCount, view_.height,
                             [&](int inY) { MarkRefinedPixels(inY, rowStarts); });
  for (std::size_t i = 1; i < rowStarts.size(); ++i) rowStarts[i] += rowStarts[i - 1];
  samples_ = std::make_unique_for_overwrite<Sample[]>(static_cast<std::size_t>(rowStarts.back()));
  ZORFoundation::ParallelFor(inThreadCount, view_.height, [&](int inY) {
    for (int x = 0; x < view_.width; ++x) {
      std::int32_t& first = firstSamples_[Place(x, inY)];
      if (first != kNotRefined) first += rowStarts[static_cast<std::size_t>(inY)];
    }
    CastRow(inPass, inY);
  });
}

/// Numbers the samples of the row's refined pixels from 0; their count goes to the next row's
/// start.
void AdaptiveSampling::MarkRefinedPixels(int inY, std::vector<std::int32_t>& outRowCounts) {
  std::int32_t count = 0;
  for (int x = 0; x < view_.width; ++x) {
    const bool isRefined = IsAtDiscontinuity(x, inY);
    firstSamples_[Place(x, inY)] = isRefined ? count : kNotRefined;
    if (isRefined) count += kSamples;
  }
  outRowCounts[static_cast<std::size_t>(inY) + 1] = count;
}

void AdaptiveSampling::FindDiscontinuities(int inY) {
  const bool hasNextRow = inY + 1 < view_.height;
  for (int x = 0; x < view_.width; ++x) {
    const Sample* const here = pixels_ + Place(x, inY);
    const bool toRight = x + 1 < view_.width && Differ(*here, here[1], 1, 0);
    const bool downwards = hasNextRow && Differ(*here, here[view_.width], 0, 1);
    discontinuities_[Place(x, inY)] =
        static_cast<std::uint8_t>((toRight ? kToRight : 0) | (downwards ? kDownwards : 0));
  }
}

bool AdaptiveSampling::IsAtDiscontinuity(int inX, int inY) const {
  const std::uint8_t* const here = discontinuities_.data() + Place(inX, inY);
  return *here != 0 || (inX > 0 && (here[-1] & kToRight) != 0) ||
         (inY > 0 && (here[-view_.width] & kDownwards) != 0);
}

bool AdaptiveSampling::Differ(const Sample& inA, const Sample& inB, float inDx, float inDy) const {
  if (inA.instance != inB.instance) return true;
  if (inA.instance == Hit::kMiss) return false;
  if (MaxDifference(inA.radiance, inB.radiance) > kRadianceStep) return true;
  // The early exit of nearly all pixels.
  const float gap = std::fabs(inA.inverseDepth - inB.inverseDepth);
  const float inverseDepth = view_.isPerspective ? std::min(inA.inverseDepth, inB.inverseDepth) : 1;
  if (gap <= kDepthBreak * view_.InverseDepthPerPixel(inverseDepth)) return false;
  return IsInFront(inA, inB, inDx, inDy) || IsInFront(inB, inA, -inDx, -inDy);
}

/// Whether the sample's surface ends before the other sample and occludes the surface there.
bool AdaptiveSampling::IsInFront(const Sample& inSample, const Sample& inOther, float inDx,
                                 float inDy) const {
  if (inSample.instance != inOther.instance) {
    // At equal depth the first instance is in front.
    return inSample.inverseDepth > inOther.inverseDepth ||
           (inSample.inverseDepth == inOther.inverseDepth && inSample.instance < inOther.instance);
  }
  if (inOther.inverseDepth == Sample::kBackground)
    return inSample.inverseDepth != Sample::kBackground;
  const float change = inSample.slopeX * inDx + inSample.slopeY * inDy;
  const float gap = inSample.inverseDepth + std::min(change, 0.F) - inOther.inverseDepth;
  return gap > kDepthBreak * view_.InverseDepthPerPixel(inSample.inverseDepth) +
                   kSlopeBreak * (std::fabs(inSample.slopeX) + std::fabs(inSample.slopeY));
}

void AdaptiveSampling::CastRow(const SurfacePass& inPass, int inY) {
  constexpr int kPixelsAtOnce = RenderScene::kPacket / kSamples;
  RasterPoint points[RenderScene::kPacket];
  Sample samples[RenderScene::kPacket];
  Sample* targets[kPixelsAtOnce];
  int pixelCount = 0;
  const auto castWaiting = [&] {
    if (pixelCount > 0) inPass.CastPoints(points, pixelCount * kSamples, samples);
    for (int i = 0; i < pixelCount; ++i) std::copy_n(samples + i * kSamples, kSamples, targets[i]);
    pixelCount = 0;
  };
  for (int x = 0; x < view_.width; ++x) {
    const std::int32_t first = firstSamples_[Place(x, inY)];
    if (first == kNotRefined) continue;
    for (int i = 0; i < kSamples; ++i) {
      const int column = i % kSide, row = i / kSide;
      points[pixelCount * kSamples + i] = {
          static_cast<float>(x) + 0.25F + 0.5F * static_cast<float>(column),
          static_cast<float>(inY) + 0.25F + 0.5F * static_cast<float>(row)};
    }
    targets[pixelCount++] = samples_.get() + first;
    if (pixelCount == kPixelsAtOnce) castWaiting();
  }
  castWaiting();
}

/// A sample of the supersampled grid; in a pixel that is not refined, its surface is extrapolated.
Sample AdaptiveSampling::SampleAt(int inColumn, int inRow) const {
  const std::size_t place = Place(inColumn / kSide, inRow / kSide);
  const std::int32_t first = firstSamples_[place];
  if (first != kNotRefined) return samples_[first + inRow % kSide * kSide + inColumn % kSide];
  Sample sample = pixels_[place];
  sample.inverseDepth += sample.slopeX * (static_cast<float>(inColumn % kSide) * 0.5F - 0.25F) +
                         sample.slopeY * (static_cast<float>(inRow % kSide) * 0.5F - 0.25F);
  return sample;
}

/// Whether a surface ends within two samples, which makes silhouettes one pixel wide.
bool AdaptiveSampling::IsOutline(int inColumn, int inRow) const {
  constexpr int kSteps[][2] = {{1, 0}, {-1, 0}, {0, 1}, {0, -1}, {2, 0}, {-2, 0}, {0, 2}, {0, -2}};
  const Sample sample = SampleAt(inColumn, inRow);
  if (sample.instance == Hit::kMiss) return false;
  for (const auto& [stepX, stepY] : kSteps) {
    const int column = inColumn + stepX, row = inRow + stepY;
    if (column < 0 || row < 0 || column >= kSide * view_.width || row >= kSide * view_.height)
      continue;
    const Sample other = SampleAt(column, row);
    if (IsInFront(sample, other, 0.5F * static_cast<float>(stepX),
                  0.5F * static_cast<float>(stepY)))
      return true;
  }
  return false;
}

ResolvedPixel AdaptiveSampling::Resolve(int inX, int inY) const {
  const std::size_t place = Place(inX, inY);
  const std::int32_t first = firstSamples_[place];
  if (first == kNotRefined) return {pixels_[place].radiance, 0};
  ResolvedPixel pixel{{0, 0, 0}, 0};
  for (int i = 0; i < kSamples; ++i) {
    pixel.radiance = pixel.radiance + (1.F / kSamples) * samples_[first + i].radiance;
    if (IsOutline(kSide * inX + i % kSide, kSide * inY + i / kSide))
      pixel.outline += 1.F / kSamples;
  }
  return pixel;
}

}  // namespace ZORRayCaster
