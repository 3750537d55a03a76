#include "default_platform/visualisation/ray_caster/Shading.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <vector>

namespace ZORRayCaster {
namespace {

/// The sRGB transfer function, IEC 61966-2-1.
float SrgbFromLinear(float inLinear) {
  return inLinear <= 0.0031308F ? 12.92F * inLinear
                                : 1.055F * std::pow(inLinear, 1 / 2.4F) - 0.055F;
}

constexpr int kTableSteps = 8192;

/// Evenly spaced in linear light: the darkest entries differ by one byte at most.
const std::array<std::uint8_t, kTableSteps + 1>& SrgbTable() {
  static const auto bytes = [] {
    std::array<std::uint8_t, kTableSteps + 1> table;
    for (std::size_t i = 0; i < table.size(); ++i) {
      const float srgb = SrgbFromLinear(static_cast<float>(i) / kTableSteps);
      table[i] = static_cast<std::uint8_t>(std::lround(std::clamp(srgb, 0.F, 1.F) * 255));
    }
    return table;
  }();
  return bytes;
}

}  // namespace

float LinearFromSrgb(float inSrgb) {
  if (!(inSrgb > 0)) return 0;
  if (inSrgb >= 1) return 1;
  return inSrgb <= 0.04045F ? inSrgb / 12.92F : std::pow((inSrgb + 0.055F) / 1.055F, 2.4F);
}

std::uint8_t SrgbByteFromLinear(float inLinear) {
  const float clamped = inLinear > 0 ? std::min(inLinear, 1.F) : 0.F;
  return SrgbTable()[static_cast<std::size_t>(clamped * kTableSteps + 0.5F)];
}

SurfaceColour MakeSurfaceColour(const PartColour& inColour) {
  const auto light = [&](std::size_t i) {
    return LinearFromSrgb(static_cast<float>(inColour[i]) / 255);
  };
  return {{light(0), light(1), light(2)}, static_cast<float>(inColour[3]) / 255};
}

Vector3f Shade(Vector3f inAlbedo, Vector3f inNormal, Vector3f inToEye) {
  constexpr float kAmbient = 0.20F, kHead = 0.62F, kFill = 0.28F, kHighlight = 0.07F;
  constexpr Vector3f kFromFill{-0.532300F, -0.725864F, -0.435518F};  // unit
  const float towardsEye = std::max(Dot(inNormal, inToEye), 0.F);
  const float towardsFill = std::max(Dot(inNormal, kFromFill), 0.F);
  // The half vector of the fill light (Blinn, "Models of light reflection", 1977).
  const float half = std::max(Dot(inNormal, Normalised(kFromFill + inToEye)), 0.F);
  float shine = half * half;
  for (int i = 0; i < 4; ++i) shine *= shine;
  const float diffuse = kAmbient + kHead * towardsEye + kFill * towardsFill;
  const float highlight = kHighlight * shine;
  return diffuse * inAlbedo + Vector3f{highlight, highlight, highlight};
}

}  // namespace ZORRayCaster
