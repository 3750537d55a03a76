// From a viewpoint to what can be drawn.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_PICTURECAMERA_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_PICTURECAMERA_H

#include "default_platform/visualisation/RayCasterEntry.h"
#include "platform/visualisation/ZOR3DViewpoint.h"

namespace ZORDefault {

/// The default direction of a camera, from a corner.
ZORMathVector DefaultSight();

/// @return the direction with length 1; inOtherwise when it has none.
ZORMathVector Direction(const ZORMathVector& inVector, const ZORMathVector& inOtherwise);

/// A number that can be worked with: finite and above zero, or the other one.
double PositiveOr(double inValue, double inOtherwise);

/// Anything in a viewpoint that cannot be drawn is mended: a missing sight becomes the default one,
/// an `up` along the sight becomes z (or y), sizes become 1, an eye nowhere becomes the origin.
/// @param inHeight in pixels.
Camera CameraOf(const ZOR3DViewpoint& inViewpoint, int inHeight);

}  // namespace ZORDefault

#endif
