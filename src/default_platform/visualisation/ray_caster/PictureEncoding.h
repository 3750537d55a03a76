// Picture files of 8-bit sRGB pixels, rows from the top.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_PICTUREENCODING_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_PICTUREENCODING_H

#include <cstdint>
#include <string>

namespace ZORRayCaster {

/// @return the file's bytes; empty when out of memory. Raises std::bad_alloc.
std::string EncodeJpeg(int inWidth, int inHeight, const std::uint8_t* inPixels);
/// @return as EncodeJpeg.
std::string EncodePng(int inWidth, int inHeight, const std::uint8_t* inPixels);

}  // namespace ZORRayCaster

#endif
