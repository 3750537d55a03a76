// Feature edges as anti-aliased lines of constant width.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_EDGELINES_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_EDGELINES_H

#include <cstdint>
#include <vector>

#include "default_platform/visualisation/ray_caster/Sampling.h"

namespace ZORRayCaster {

/// Coverage of each pixel by lines, 0 to 255.
struct LineCoverage {
  std::vector<std::uint8_t> visible;
  std::vector<std::uint8_t> hidden;  ///< by lines behind surfaces; empty unless requested
};

/// @param inPixels one sample per pixel centre: the surfaces that hide lines.
LineCoverage DrawEdgeLines(const RenderScene& inScene, const Sample* inPixels, bool inDrawHidden,
                           int inThreadCount);

}  // namespace ZORRayCaster

#endif
