// Colour spaces and shading.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_SHADING_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_SHADING_H

#include <cstdint>

#include "default_platform/PartMesh.h"
#include "foundation/Vector3.h"

namespace ZORRayCaster {

// Camera space: x to the right, y down, z forward, the eye at the origin.
using ZORFoundation::ToVector3;
using ZORFoundation::Vector3f;
using Matrix3f = ZORFoundation::Matrix3<float>;
using Transform3f = ZORFoundation::Transform<float>;

/// Linear RGB and opacity.
struct SurfaceColour {
  Vector3f albedo{0, 0, 0};
  float opacity = 1;
};

SurfaceColour MakeSurfaceColour(const PartColour& inColour);

/// @param inSrgb clamped to 0 to 1.
float LinearFromSrgb(float inSrgb);

std::uint8_t SrgbByteFromLinear(float inLinear);

/// Ambient light, a headlight, and a fill light from above left with a soft specular highlight.
/// @param inNormal unit, towards the eye. @param inToEye unit.
Vector3f Shade(Vector3f inAlbedo, Vector3f inNormal, Vector3f inToEye);

}  // namespace ZORRayCaster

#endif
