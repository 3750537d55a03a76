// Sampling of the visible surfaces: one sample per pixel, then adaptive supersampling.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_SAMPLING_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_SAMPLING_H

#include <cstdint>
#include <memory>
#include <vector>

#include "default_platform/visualisation/ray_caster/RenderScene.h"

namespace ZORRayCaster {

/// The visible surface at one raster point. Uninitialised by default.
struct Sample {
  float inverseDepth;  ///< as View::InverseDepth; kBackground without a surface
  float slopeX;        ///< change of the inverse depth per pixel
  float slopeY;
  std::uint32_t instance;  ///< or Hit::kMiss
  Vector3f radiance;

  static constexpr float kBackground = -1e30F;
};

/// The background's linear radiance in each row.
struct Background {
  std::vector<Vector3f> rows;
  bool isShaded = true;  ///< else surfaces take the background's colour
};

/// Casts rays and shades what they hit.
class SurfacePass {
 public:
  SurfacePass(const RenderScene& inScene, const Background& inBackground)
      : scene_(inScene), background_(inBackground) {}

  /// One sample at each pixel's centre, rows from the top.
  std::unique_ptr<Sample[]> CastPixels(int inThreadCount) const;
  /// @param inCount up to RenderScene::kPacket.
  void CastPoints(const RasterPoint* inPoints, int inCount, Sample* outSamples) const;

 private:
  void CastTile(int inTile, Sample* outPixels) const;
  void CastBlock(const PixelBounds& inBlock, Sample* outPixels) const;
  Sample SampleOf(RasterPoint inPoint, const Hit& inHit) const;
  Sample SampleTransparent(RasterPoint inPoint, Hit inHit) const;
  Vector3f ShadeHit(Vector3f inDirection, Vector3f inPlane, const Hit& inHit,
                    const SurfaceColour& inColour) const;
  void SetPlane(Vector3f inDirection, Vector3f inPlane, float inDepth, Sample& outSample) const;
  Vector3f BackgroundAt(RasterPoint inPoint) const;
  Sample BackgroundSample(RasterPoint inPoint) const {
    return {Sample::kBackground, 0, 0, Hit::kMiss, BackgroundAt(inPoint)};
  }

  const RenderScene& scene_;
  const Background& background_;
};

/// A pixel resolved from its samples, without lines.
struct ResolvedPixel {
  Vector3f radiance;
  float outline;  ///< coverage by silhouettes, 0 to 1
};

/// Supersamples with a 2 x 2 grid the pixels at discontinuities of instance, depth or radiance.
class AdaptiveSampling {
 public:
  AdaptiveSampling(const SurfacePass& inPass, const View& inView, const Sample* inPixels,
                   int inThreadCount);
  ResolvedPixel Resolve(int inX, int inY) const;
  /// Whether a pixel shows the background alone.
  bool IsBackground(std::size_t inPlace) const {
    return firstSamples_[inPlace] == kNotRefined && pixels_[inPlace].instance == Hit::kMiss;
  }

 private:
  static constexpr int kSide = 2;  // samples per axis
  static constexpr int kSamples = kSide * kSide;
  static constexpr std::int32_t kNotRefined = -1;
  // Discontinuities towards a pixel's neighbours.
  static constexpr std::uint8_t kToRight = 1;
  static constexpr std::uint8_t kDownwards = 2;

  void FindDiscontinuities(int inY);
  bool IsAtDiscontinuity(int inX, int inY) const;
  bool Differ(const Sample& inA, const Sample& inB, float inDx, float inDy) const;
  void MarkRefinedPixels(int inY, std::vector<std::int32_t>& outRowCounts);
  void CastRow(const SurfacePass& inPass, int inY);
  Sample SampleAt(int inColumn, int inRow) const;
  bool IsOutline(int inColumn, int inRow) const;
  bool IsInFront(const Sample& inSample, const Sample& inOther, float inDx, float inDy) const;
  std::size_t Place(int inX, int inY) const {
    return static_cast<std::size_t>(inY) * static_cast<std::size_t>(view_.width) +
           static_cast<std::size_t>(inX);
  }

  const View& view_;
  const Sample* pixels_;
  std::vector<std::uint8_t> discontinuities_;  // kToRight and kDownwards of each pixel
  std::vector<std::int32_t> firstSamples_;     // of each pixel, or kNotRefined
  std::unique_ptr<Sample[]> samples_;
};

}  // namespace ZORRayCaster

#endif
