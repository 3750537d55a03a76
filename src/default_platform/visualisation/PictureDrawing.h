// Drawing a representation through a viewpoint.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_PICTUREDRAWING_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_PICTUREDRAWING_H

#include <optional>

#include "default_platform/visualisation/RayCasterEntry.h"
#include "platform/visualisation/ZOR3DRep.h"
#include "platform/visualisation/ZOR3DViewpoint.h"
#include "platform/visualisation/ZORSupport.h"

namespace ZORDefault {

/// The largest width and height of a picture.
inline constexpr int kLargestPictureSize = 16384;

ZOR_PLATFORM_EXPORT bool IsPictureSize(int inWidth, int inHeight);

/// @param inSupport null: default settings. Sizes as IsPictureSize allows.
ZOR_PLATFORM_EXPORT PictureRequest MakePictureRequest(const ZOR3DRep& inRep,
                                                      const ZOR3DViewpoint& inViewpoint,
                                                      int inWidth, int inHeight,
                                                      const ZORSupport* inSupport);

/// How many threads draw a picture: ZOR_PICTURE_THREADS, 1 to 64, else 1. The pixels are the same.
ZOR_PLATFORM_EXPORT int PictureThreadCount();

/// What each pixel of a picture shows in its middle, rows from the top.
/// @return nothing for a wrong size, without memory or without the drawing library.
ZOR_PLATFORM_EXPORT std::optional<std::vector<SeenPixel>> SeePixels(
    const ZOR3DRep& inRep, const ZOR3DViewpoint& inViewpoint, int inWidth, int inHeight);

}  // namespace ZORDefault

#endif
