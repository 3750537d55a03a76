// Rendering a representation through a viewpoint.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RENDERING_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RENDERING_H

#include <optional>

#include "default_platform/visualisation/RayCaster.h"
#include "platform/visualisation/ZOR3DRep.h"
#include "platform/visualisation/ZOR3DViewpoint.h"
#include "platform/visualisation/ZORSupport.h"

namespace ZORDefault {

/// Of a picture's width and height.
inline constexpr int kMaxPictureSize = 16384;

/// @return whether width and height are 1 to kMaxPictureSize.
ZOR_PLATFORM_EXPORT bool IsPictureSize(int inWidth, int inHeight);

/// @param inSupport null: default settings. Sizes as IsPictureSize allows.
ZOR_PLATFORM_EXPORT PictureRequest MakePictureRequest(const ZOR3DRep& inRep,
                                                      const ZOR3DViewpoint& inViewpoint,
                                                      int inWidth, int inHeight,
                                                      const ZORSupport* inSupport);

/// Threads per picture: ZOR_PICTURE_THREADS, 1 to 64, else 1. Pixels do not depend on it.
ZOR_PLATFORM_EXPORT int PictureThreadCount();

/// The picture's id buffer, rows from the top.
/// @return nothing for a wrong size, without memory or without the ray caster.
ZOR_PLATFORM_EXPORT std::optional<std::vector<IdBufferPixel>> RenderIdBuffer(
    const ZOR3DRep& inRep, const ZOR3DViewpoint& inViewpoint, int inWidth, int inHeight);

/// Loads the plugin at the first call.
/// @return null when it is missing or cannot be loaded; tried again at the next call.
const RayCaster* LoadRayCaster();

/// The isometric direction of sight.
ZORMathVector DefaultSightDirection();

/// @return the vector with length 1; inOtherwise when it is zero or not finite.
ZORMathVector NormalizeOr(const ZORMathVector& inVector, const ZORMathVector& inOtherwise);

/// @return inValue when it is finite and above zero, else inOtherwise.
double PositiveOr(double inValue, double inOtherwise);

/// Invalid values of the viewpoint are replaced: a missing sight by the isometric one, an `up`
/// along the sight by z (or y), sizes by 1, a non-finite eye by the origin.
/// @param inHeight in pixels.
Camera MakeCamera(const ZOR3DViewpoint& inViewpoint, int inHeight);

}  // namespace ZORDefault

#endif
