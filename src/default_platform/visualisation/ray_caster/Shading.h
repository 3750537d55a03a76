// Colour spaces and shading.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_SHADING_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_SHADING_H

#include <cstdint>

#include "default_platform/visualisation/PartMesh.h"
#include "default_platform/visualisation/ray_caster/Vec3.h"

namespace ZORRayCaster {

/// Linear RGB and opacity.
struct SurfaceColour {
  Vec3 albedo{0, 0, 0};
  float opacity = 1;
};

SurfaceColour MakeSurfaceColour(const PartColour& inColour);

/// @param inSrgb clamped to 0 to 1.
float LinearFromSrgb(float inSrgb);

std::uint8_t SrgbByteFromLinear(float inLinear);

/// Ambient light, a headlight, and a fill light from above left with a soft specular highlight.
/// @param inNormal unit, towards the eye. @param inToEye unit.
Vec3 Shade(Vec3 inAlbedo, Vec3 inNormal, Vec3 inToEye);

}  // namespace ZORRayCaster

#endif
