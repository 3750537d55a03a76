// Pixels as picture files.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_IMAGEENCODING_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_IMAGEENCODING_H

#include <cstdint>
#include <string>

namespace ZORRayCaster {

/// @param inPixels 8-bit sRGB, rows from the top.
/// @return the file's bytes; empty when out of memory.
std::string EncodeJpeg(int inWidth, int inHeight, const std::uint8_t* inPixels);
std::string EncodePng(int inWidth, int inHeight, const std::uint8_t* inPixels);

}  // namespace ZORRayCaster

#endif
