// More samples where one a pixel is not enough, and the outlines found in them.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_REFINEMENT_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_REFINEMENT_H

#include <cstdint>
#include <memory>
#include <vector>

#include "default_platform/visualisation/ray_caster/SurfacePass.h"

namespace ZORRayCaster {

/// A pixel as it is shown, before lines are drawn over it.
struct ShownPixel {
  Vec3 light;
  float outline;  ///< the share of the pixel that an outline covers
};

/// Four samples, in a square, in each pixel beside which something changes.
class Refinement {
 public:
  Refinement(const SurfacePass& inPass, const View& inView, const Sample* inPixels,
             int inThreadCount);
  ShownPixel At(int inX, int inY) const;
  /// Whether nothing but the background is seen in a pixel.
  bool IsBackground(std::size_t inPlace) const {
    return firstSamples_[inPlace] == kNotRefined && pixels_[inPlace].item == Hit::kNothing;
  }

 private:
  static constexpr int kSide = 2;  // samples along a pixel's side
  static constexpr int kSamples = kSide * kSide;
  static constexpr std::int32_t kNotRefined = -1;
  // Where something changes from a pixel to its neighbour.
  static constexpr std::uint8_t kToRight = 1;
  static constexpr std::uint8_t kDownwards = 2;

  void FindChanges(int inY);
  bool IsNearChange(int inX, int inY) const;
  bool Differ(const Sample& inA, const Sample& inB, float inDx, float inDy) const;
  void MarkRow(int inY, std::vector<std::int32_t>& outRowCounts);
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
  std::vector<std::uint8_t> changes_;       // kToRight and kDownwards of each pixel
  std::vector<std::int32_t> firstSamples_;  // of each pixel, or kNotRefined
  std::unique_ptr<Sample[]> samples_;
};

}  // namespace ZORRayCaster

#endif
