// A whole picture.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_DRAWPICTURE_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_DRAWPICTURE_H

#include <cstdint>
#include <string>
#include <vector>

#include "default_platform/visualisation/RayCasterEntry.h"

namespace ZORRayCaster {

/// Raises std::bad_alloc.
std::vector<std::uint8_t> DrawPicture(const ZORDefault::PictureRequest& inRequest);
std::vector<ZORDefault::SeenPixel> SeePicture(const ZORDefault::PictureRequest& inRequest);

/// @return the bytes of a file; empty when there is not enough memory.
std::string JpegFile(int inWidth, int inHeight, const std::uint8_t* inPixels);
std::string PngFile(int inWidth, int inHeight, const std::uint8_t* inPixels);

}  // namespace ZORRayCaster

#endif
