#include "default_platform/visualisation/ray_caster/SurfacePass.h"

#include <algorithm>
#include <cmath>

#include "default_platform/visualisation/ray_caster/Parallel.h"

namespace ZORRayCaster {
namespace {

constexpr int kTileSize = 32;
constexpr int kBlockWidth = 4;
constexpr int kBlockHeight = 2;
static_assert(kBlockWidth * kBlockHeight == DrawnScene::kPacket);

/// Steeper surfaces are taken to be as steep as this, in pixels of depth a pixel.
constexpr float kSteepest = 20;

/// How many transparent surfaces are seen through.
constexpr int kMostLayers = 24;

int TilesAcross(int inPixels) { return (inPixels + kTileSize - 1) / kTileSize; }

}  // namespace

std::unique_ptr<Sample[]> SurfacePass::CastPixels(int inThreadCount) const {
  const View& view = scene_.GetView();
  auto pixels = std::make_unique_for_overwrite<Sample[]>(static_cast<std::size_t>(view.width) *
                                                         static_cast<std::size_t>(view.height));
  const int tileCount = TilesAcross(view.width) * TilesAcross(view.height);
  ForEach(inThreadCount, tileCount, [&](int inTile) { CastTile(inTile, pixels.get()); });
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

void SurfacePass::CastBlock(const PictureBox& inBlock, Sample* outPixels) const {
  PicturePoint points[DrawnScene::kPacket] = {};  // a compiler cannot see that blocks are never empty
  Sample* targets[DrawnScene::kPacket];
  int count = 0;
  for (int y = inBlock.top; y < inBlock.bottom; ++y) {
    for (int x = inBlock.left; x < inBlock.right; ++x) {
      points[count] = {static_cast<float>(x) + 0.5F, static_cast<float>(y) + 0.5F};
      targets[count++] = outPixels + static_cast<std::ptrdiff_t>(y) * scene_.GetView().width + x;
    }
  }
  const PictureBox& box = scene_.GetBox();
  const bool isOutside = inBlock.right <= box.left || inBlock.left >= box.right ||
                         inBlock.bottom <= box.top || inBlock.top >= box.bottom;
  Sample samples[DrawnScene::kPacket];
  if (!isOutside) CastPoints(points, count, samples);
  for (int i = 0; i < count; ++i)
    *targets[i] = isOutside ? BackgroundSample(points[i]) : samples[i];
}

void SurfacePass::CastPoints(const PicturePoint* inPoints, int inCount, Sample* outSamples) const {
  Hit hits[DrawnScene::kPacket];
  const bool meetAny = scene_.Cast(inPoints, inCount, hits);
  for (int i = 0; i < inCount; ++i)
    outSamples[i] = meetAny ? SampleOf(inPoints[i], hits[i]) : BackgroundSample(inPoints[i]);
}

Vec3 SurfacePass::Background(PicturePoint inPoint) const {
  return backdrop_.rows[static_cast<std::size_t>(inPoint.y)];
}

Sample SurfacePass::SampleOf(PicturePoint inPoint, const Hit& inHit) const {
  if (inHit.item == Hit::kNothing) return BackgroundSample(inPoint);
  const DrawnItem& item = scene_.GetItems()[inHit.item];
  const SurfaceColour& colour = item.ColourOf(inHit.triangle);
  if (colour.opacity < 1 && backdrop_.isShaded) return SampleThrough(inPoint, inHit);
  const Vec3 direction = scene_.GetView().RayDirection(inPoint);
  const Vec3 plane = item.normalMatrix * inHit.meshNormal;
  Sample sample;
  sample.item = inHit.item;
  SetSurface(direction, plane, inHit.depth, sample);
  sample.light =
      backdrop_.isShaded ? LightOf(direction, plane, inHit, colour) : Background(inPoint);
  return sample;
}

/// The item that is seen is the transparent one in front, the surface the opaque one behind.
Sample SurfacePass::SampleThrough(PicturePoint inPoint, Hit inHit) const {
  constexpr float kStep = 1e-6F;
  const std::uint32_t front = inHit.item;
  const Vec3 direction = scene_.GetView().RayDirection(inPoint);
  Vec3 light{0, 0, 0};
  float through = 1;  // the share of what lies behind that is still seen
  for (int layer = 0; inHit.item != Hit::kNothing && layer < kMostLayers; ++layer) {
    const DrawnItem& item = scene_.GetItems()[inHit.item];
    const SurfaceColour& colour = item.ColourOf(inHit.triangle);
    if (colour.opacity >= 1) break;
    const Vec3 plane = item.normalMatrix * inHit.meshNormal;
    light = light + through * colour.opacity * LightOf(direction, plane, inHit, colour);
    through *= 1 - colour.opacity;
    inHit = scene_.CastBeyond(inPoint, inHit.depth * (1 + kStep));
  }
  const bool isEnded = inHit.item != Hit::kNothing &&
                       scene_.GetItems()[inHit.item].ColourOf(inHit.triangle).opacity < 1;
  Sample sample = isEnded ? BackgroundSample(inPoint) : SampleOf(inPoint, inHit);
  sample.item = front;
  sample.light = light + through * sample.light;
  return sample;
}

/// @param inPlane the triangle's normal in camera space.
Vec3 SurfacePass::LightOf(Vec3 inDirection, Vec3 inPlane, const Hit& inHit,
                          const SurfaceColour& inColour) const {
  const Vec3 toEye = Normalised(-1 * inDirection);
  const Vec3 plane = Dot(inPlane, toEye) < 0 ? -1 * inPlane : inPlane;
  const DrawnItem& item = scene_.GetItems()[inHit.item];
  if (!item.hasNormals) return Lit(inColour.light, Normalised(plane), toEye);
  const auto& corners = item.mesh->triangles[inHit.triangle];
  const auto& normals = item.mesh->normals;
  const Vec3 meshNormal = (1 - inHit.u - inHit.v) * ToVec3(normals[corners[0]]) +
                          inHit.u * ToVec3(normals[corners[1]]) +
                          inHit.v * ToVec3(normals[corners[2]]);
  const Vec3 smooth = Normalised(item.normalMatrix * meshNormal);
  const float side = Dot(smooth, plane);
  // The side that is seen; without a usable normal the triangle's own.
  if (!(side < 0 || side > 0)) return Lit(inColour.light, Normalised(plane), toEye);
  return Lit(inColour.light, side < 0 ? -1 * smooth : smooth, toEye);
}

void SurfacePass::SetSurface(Vec3 inDirection, Vec3 inPlane, float inDepth,
                             Sample& outSample) const {
  const View& view = scene_.GetView();
  outSample.nearness = view.Nearness(inDepth);
  // Over the plane n . p = c, the nearness is n . direction / c, or (n.x x + n.y y - c) / n.z.
  const float across = view.isConic ? inDepth * Dot(inPlane, inDirection) : inPlane.z;
  const float scale = view.pixelSize / across;
  const float steepest = kSteepest * view.NearnessOfPixel(outSample.nearness);
  const auto slope = [&](float inComponent) {
    const float value = inComponent * scale;
    return std::fabs(value) <= steepest ? value : std::copysign(steepest, value);
  };
  const bool isUsable = std::isfinite(scale);
  outSample.slopeX = isUsable ? slope(inPlane.x) : 0;
  outSample.slopeY = isUsable ? slope(inPlane.y) : 0;
}

}  // namespace ZORRayCaster
