// The parts' edges as lines of even width.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_EDGELINES_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_EDGELINES_H

#include <cstdint>
#include <vector>

#include "default_platform/visualisation/ray_caster/SurfacePass.h"

namespace ZORRayCaster {

/// How far each pixel is covered by lines, 0 to 255.
struct LineCoverage {
  std::vector<std::uint8_t> visible;
  std::vector<std::uint8_t> hidden;  ///< by lines behind surfaces; empty when not asked for
};

/// @param inPixels the samples in the middle of the pixels, which hide lines.
LineCoverage DrawEdgeLines(const DrawnScene& inScene, const Sample* inPixels, bool inDrawHidden,
                           int inThreadCount);

}  // namespace ZORRayCaster

#endif
