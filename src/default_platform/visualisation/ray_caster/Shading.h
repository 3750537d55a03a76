// From surface colour and normal to light.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_SHADING_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_SHADING_H

#include <cstdint>

#include "default_platform/visualisation/PartMesh.h"
#include "default_platform/visualisation/ray_caster/Vec3.h"

namespace ZORRayCaster {

/// A surface's colour in proportion to light.
struct SurfaceColour {
  Vec3 light{0, 0, 0};
  float opacity = 1;
};

SurfaceColour ToSurfaceColour(const PartColour& inColour);

/// @param inShown 0 to 1, as a screen takes it; others are brought into this range.
float LightOf(float inShown);

/// @return 0 to 255, as a screen takes it.
std::uint8_t ShownByte(float inLight);

/// The light that comes from a point of a surface to the eye: a lamp at the eye, a fill light from
/// above left, a little light from everywhere, a soft highlight.
/// @param inNormal unit, towards the eye. @param inToEye unit.
Vec3 Lit(Vec3 inSurface, Vec3 inNormal, Vec3 inToEye);

}  // namespace ZORRayCaster

#endif
