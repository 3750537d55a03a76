#include "default_platform/visualisation/ray_caster/Shading.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <vector>

namespace ZORRayCaster {
namespace {

/// The sRGB transfer function, IEC 61966-2-1.
float ShownOf(float inLight) {
  return inLight <= 0.0031308F ? 12.92F * inLight : 1.055F * std::pow(inLight, 1 / 2.4F) - 0.055F;
}

constexpr int kLightSteps = 8192;

/// Shown bytes of evenly spaced light. The darkest steps differ by one byte at most.
const std::array<std::uint8_t, kLightSteps + 1>& ShownBytes() {
  static const auto bytes = [] {
    std::array<std::uint8_t, kLightSteps + 1> table;
    for (std::size_t i = 0; i < table.size(); ++i) {
      const float shown = ShownOf(static_cast<float>(i) / kLightSteps);
      table[i] = static_cast<std::uint8_t>(std::lround(std::clamp(shown, 0.F, 1.F) * 255));
    }
    return table;
  }();
  return bytes;
}

}  // namespace

float LightOf(float inShown) {
  if (!(inShown > 0)) return 0;
  if (inShown >= 1) return 1;
  return inShown <= 0.04045F ? inShown / 12.92F : std::pow((inShown + 0.055F) / 1.055F, 2.4F);
}

std::uint8_t ShownByte(float inLight) {
  const float clamped = inLight > 0 ? std::min(inLight, 1.F) : 0.F;
  return ShownBytes()[static_cast<std::size_t>(clamped * kLightSteps + 0.5F)];
}

SurfaceColour ToSurfaceColour(const PartColour& inColour) {
  const auto light = [&](std::size_t i) { return LightOf(static_cast<float>(inColour[i]) / 255); };
  return {{light(0), light(1), light(2)}, static_cast<float>(inColour[3]) / 255};
}

Vec3 Lit(Vec3 inSurface, Vec3 inNormal, Vec3 inToEye) {
  constexpr float kAmbient = 0.20F, kHead = 0.62F, kFill = 0.28F, kHighlight = 0.07F;
  constexpr Vec3 kFromFill{-0.532300F, -0.725864F, -0.435518F};  // of length 1
  const float towardsEye = std::max(Dot(inNormal, inToEye), 0.F);
  const float towardsFill = std::max(Dot(inNormal, kFromFill), 0.F);
  // Half way between the fill light and the eye, as in the model of Blinn.
  const float half = std::max(Dot(inNormal, Normalised(kFromFill + inToEye)), 0.F);
  float shine = half * half;
  for (int i = 0; i < 4; ++i) shine *= shine;
  const float diffuse = kAmbient + kHead * towardsEye + kFill * towardsFill;
  const float highlight = kHighlight * shine;
  return diffuse * inSurface + Vec3{highlight, highlight, highlight};
}

}  // namespace ZORRayCaster
