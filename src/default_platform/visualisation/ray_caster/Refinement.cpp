#include "default_platform/visualisation/ray_caster/Refinement.h"

#include <algorithm>
#include <cmath>

#include "default_platform/visualisation/ray_caster/Parallel.h"

namespace ZORRayCaster {
namespace {

/// How far two lights may differ without being seen.
constexpr float kLightStep = 0.035F;

/// Where a depth breaks off: so many pixels of depth, and so many times the slope.
constexpr float kDepthBreak = 4;
constexpr float kSlopeBreak = 1.5F;

float LargestDifference(Vec3 inA, Vec3 inB) {
  return std::max({std::fabs(inA.x - inB.x), std::fabs(inA.y - inB.y), std::fabs(inA.z - inB.z)});
}

}  // namespace

Refinement::Refinement(const SurfacePass& inPass, const View& inView, const Sample* inPixels,
                       int inThreadCount)
    : view_(inView),
      pixels_(inPixels),
      changes_(static_cast<std::size_t>(inView.width) * static_cast<std::size_t>(inView.height)),
      firstSamples_(static_cast<std::size_t>(inView.width) *
                    static_cast<std::size_t>(inView.height)) {
  ForEach(inThreadCount, view_.height, [&](int inY) { FindChanges(inY); });
  std::vector<std::int32_t> rowStarts(static_cast<std::size_t>(view_.height) + 1, 0);
  ForEach(inThreadCount, view_.height, [&](int inY) { MarkRow(inY, rowStarts); });
  for (std::size_t i = 1; i < rowStarts.size(); ++i) rowStarts[i] += rowStarts[i - 1];
  samples_ = std::make_unique_for_overwrite<Sample[]>(static_cast<std::size_t>(rowStarts.back()));
  ForEach(inThreadCount, view_.height, [&](int inY) {
    for (int x = 0; x < view_.width; ++x) {
      std::int32_t& first = firstSamples_[Place(x, inY)];
      if (first != kNotRefined) first += rowStarts[static_cast<std::size_t>(inY)];
    }
    CastRow(inPass, inY);
  });
}

/// Numbers the row's refined pixels from 0 and leaves their samples' number behind the row.
void Refinement::MarkRow(int inY, std::vector<std::int32_t>& outRowCounts) {
  std::int32_t count = 0;
  for (int x = 0; x < view_.width; ++x) {
    const bool isRefined = IsNearChange(x, inY);
    firstSamples_[Place(x, inY)] = isRefined ? count : kNotRefined;
    if (isRefined) count += kSamples;
  }
  outRowCounts[static_cast<std::size_t>(inY) + 1] = count;
}

void Refinement::FindChanges(int inY) {
  const bool hasNextRow = inY + 1 < view_.height;
  for (int x = 0; x < view_.width; ++x) {
    const Sample* const here = pixels_ + Place(x, inY);
    const bool toRight = x + 1 < view_.width && Differ(*here, here[1], 1, 0);
    const bool downwards = hasNextRow && Differ(*here, here[view_.width], 0, 1);
    changes_[Place(x, inY)] =
        static_cast<std::uint8_t>((toRight ? kToRight : 0) | (downwards ? kDownwards : 0));
  }
}

bool Refinement::IsNearChange(int inX, int inY) const {
  const std::uint8_t* const here = changes_.data() + Place(inX, inY);
  return *here != 0 || (inX > 0 && (here[-1] & kToRight) != 0) ||
         (inY > 0 && (here[-view_.width] & kDownwards) != 0);
}

bool Refinement::Differ(const Sample& inA, const Sample& inB, float inDx, float inDy) const {
  if (inA.item != inB.item) return true;
  if (inA.item == Hit::kNothing) return false;
  if (LargestDifference(inA.light, inB.light) > kLightStep) return true;
  // Closer than any break can be, which is so nearly everywhere.
  const float gap = std::fabs(inA.nearness - inB.nearness);
  const float nearness = view_.isConic ? std::min(inA.nearness, inB.nearness) : 1;
  if (gap <= kDepthBreak * view_.NearnessOfPixel(nearness)) return false;
  return IsInFront(inA, inB, inDx, inDy) || IsInFront(inB, inA, -inDx, -inDy);
}

/// Whether a sample's surface ends before the other sample, whose surface lies behind it.
bool Refinement::IsInFront(const Sample& inSample, const Sample& inOther, float inDx,
                           float inDy) const {
  if (inSample.item != inOther.item) {
    // Of surfaces at the same depth, the first of the scene is in front.
    return inSample.nearness > inOther.nearness ||
           (inSample.nearness == inOther.nearness && inSample.item < inOther.item);
  }
  if (inOther.nearness == Sample::kBackground) return inSample.nearness != Sample::kBackground;
  const float change = inSample.slopeX * inDx + inSample.slopeY * inDy;
  const float gap = inSample.nearness + std::min(change, 0.F) - inOther.nearness;
  return gap > kDepthBreak * view_.NearnessOfPixel(inSample.nearness) +
                   kSlopeBreak * (std::fabs(inSample.slopeX) + std::fabs(inSample.slopeY));
}

void Refinement::CastRow(const SurfacePass& inPass, int inY) {
  constexpr int kPixelsAtOnce = DrawnScene::kPacket / kSamples;
  PicturePoint points[DrawnScene::kPacket];
  Sample samples[DrawnScene::kPacket];
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
      points[pixelCount * kSamples + i] = {
          static_cast<float>(x) + 0.25F + 0.5F * static_cast<float>(i % kSide),
          static_cast<float>(inY) + 0.25F + 0.5F * static_cast<float>(i / kSide)};
    }
    targets[pixelCount++] = samples_.get() + first;
    if (pixelCount == kPixelsAtOnce) castWaiting();
  }
  castWaiting();
}

/// The sample of the picture's finer grid; of a pixel without its own, its surface continued.
Sample Refinement::SampleAt(int inColumn, int inRow) const {
  const std::size_t place = Place(inColumn / kSide, inRow / kSide);
  const std::int32_t first = firstSamples_[place];
  if (first != kNotRefined) return samples_[first + inRow % kSide * kSide + inColumn % kSide];
  Sample sample = pixels_[place];
  sample.nearness += sample.slopeX * (static_cast<float>(inColumn % kSide) * 0.5F - 0.25F) +
                     sample.slopeY * (static_cast<float>(inRow % kSide) * 0.5F - 0.25F);
  return sample;
}

/// Whether a surface ends within two samples, so that an outline on it is one pixel wide.
bool Refinement::IsOutline(int inColumn, int inRow) const {
  constexpr int kSteps[][2] = {{1, 0}, {-1, 0}, {0, 1}, {0, -1}, {2, 0}, {-2, 0}, {0, 2}, {0, -2}};
  const Sample sample = SampleAt(inColumn, inRow);
  if (sample.item == Hit::kNothing) return false;
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

ShownPixel Refinement::At(int inX, int inY) const {
  const std::size_t place = Place(inX, inY);
  const std::int32_t first = firstSamples_[place];
  if (first == kNotRefined) return {pixels_[place].light, 0};
  ShownPixel pixel{{0, 0, 0}, 0};
  for (int i = 0; i < kSamples; ++i) {
    pixel.light = pixel.light + (1.F / kSamples) * samples_[first + i].light;
    if (IsOutline(kSide * inX + i % kSide, kSide * inY + i / kSide))
      pixel.outline += 1.F / kSamples;
  }
  return pixel;
}

}  // namespace ZORRayCaster
