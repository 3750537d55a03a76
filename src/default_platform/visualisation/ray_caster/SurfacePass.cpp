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
  for (int blockY = top; blockY < bottom; blockY += kBlockHeight) {
    for (int blockX = left; blockX < right; blockX += kBlockWidth) {
      PicturePoint points[DrawnScene::kPacket];
      Sample* targets[DrawnScene::kPacket];
      int count = 0;
      for (int y = blockY; y < std::min(blockY + kBlockHeight, bottom); ++y) {
        for (int x = blockX; x < std::min(blockX + kBlockWidth, right); ++x) {
          points[count] = {static_cast<float>(x) + 0.5F, static_cast<float>(y) + 0.5F};
          targets[count++] = outPixels + static_cast<std::ptrdiff_t>(y) * view.width + x;
        }
      }
      Sample samples[DrawnScene::kPacket];
      CastPoints(points, count, samples);
      for (int i = 0; i < count; ++i) *targets[i] = samples[i];
    }
  }
}

void SurfacePass::CastPoints(const PicturePoint* inPoints, int inCount, Sample* outSamples) const {
  Hit hits[DrawnScene::kPacket];
  scene_.Cast(inPoints, inCount, hits);
  for (int i = 0; i < inCount; ++i) outSamples[i] = SampleOf(inPoints[i], hits[i]);
}

Vec3 SurfacePass::Background(PicturePoint inPoint) const {
  const int row = static_cast<int>(inPoint.y);
  return backdrop_.rows[static_cast<std::size_t>(std::clamp(row, 0, scene_.GetView().height - 1))];
}

Sample SurfacePass::SampleOf(PicturePoint inPoint, const Hit& inHit) const {
  Sample sample;
  sample.item = inHit.item;
  sample.nearness = Sample::kBackground;
  Vec3 light;
  float through = 1;  // the share of what lies behind that is still seen
  Hit hit = inHit;
  for (int layer = 0; hit.item != Hit::kNothing && layer < kMostLayers; ++layer) {
    const SurfaceColour& colour = scene_.GetItems()[hit.item].ColourOf(hit.triangle);
    const bool isOpaque = colour.opacity >= 1 || !backdrop_.isShaded;
    const float opacity = isOpaque ? 1 : colour.opacity;
    light = light + through * opacity * LightOf(inPoint, hit, colour);
    through *= 1 - opacity;
    if (isOpaque) {
      SetSurface(inPoint, hit, sample);
      break;
    }
    constexpr float kStep = 1e-6F;
    hit = scene_.CastBeyond(inPoint, hit.depth * (1 + kStep));
  }
  sample.light = through > 0 ? light + through * Background(inPoint) : light;
  return sample;
}

Vec3 SurfacePass::LightOf(PicturePoint inPoint, const Hit& inHit,
                          const SurfaceColour& inColour) const {
  if (!backdrop_.isShaded) return Background(inPoint);
  const Vec3 toEye = Normalised(-1 * scene_.GetView().RayDirection(inPoint));
  return Lit(inColour.light, FacingNormal(scene_.GetItems()[inHit.item], inHit, toEye), toEye);
}

/// The surface's normal on the side that is seen, of unit length.
Vec3 SurfacePass::FacingNormal(const DrawnItem& inItem, const Hit& inHit, Vec3 inToEye) const {
  const Affine toCamera{{inItem.normalMatrix[0], inItem.normalMatrix[1], inItem.normalMatrix[2]},
                        {}};
  Vec3 plane = toCamera.Direction(inHit.meshNormal);
  if (Dot(plane, inToEye) < 0) plane = -1 * plane;
  if (!inItem.hasNormals) return Normalised(plane);
  const auto& corners = inItem.mesh->triangles[inHit.triangle];
  const auto& normals = inItem.mesh->normals;
  const Vec3 meshNormal = (1 - inHit.u - inHit.v) * ToVec3(normals[corners[0]]) +
                          inHit.u * ToVec3(normals[corners[1]]) +
                          inHit.v * ToVec3(normals[corners[2]]);
  const Vec3 smooth = Normalised(toCamera.Direction(meshNormal));
  const float side = Dot(smooth, plane);
  if (side == 0 || std::isnan(side)) return Normalised(plane);
  return side < 0 ? -1 * smooth : smooth;
}

void SurfacePass::SetSurface(PicturePoint inPoint, const Hit& inHit, Sample& outSample) const {
  const View& view = scene_.GetView();
  const DrawnItem& item = scene_.GetItems()[inHit.item];
  const Affine toCamera{{item.normalMatrix[0], item.normalMatrix[1], item.normalMatrix[2]}, {}};
  const Vec3 plane = toCamera.Direction(inHit.meshNormal);
  outSample.nearness = view.Nearness(inHit.depth);
  // Over the plane n . p = c, the nearness is n . direction / c (conic) or (n.x x + n.y y - c) / n.z.
  const Vec3 direction = view.RayDirection(inPoint);
  const float across = view.isConic ? inHit.depth * Dot(plane, direction) : plane.z;
  const float steepest = kSteepest * view.NearnessOfPixel(outSample.nearness);
  const auto slope = [&](float inComponent) {
    const float value = inComponent * view.pixelSize / across;
    return std::isfinite(value) ? std::clamp(value, -steepest, steepest) : 0.F;
  };
  outSample.slopeX = slope(plane.x);
  outSample.slopeY = slope(plane.y);
}

}  // namespace ZORRayCaster
