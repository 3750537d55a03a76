// The library that draws, loaded when the first picture is drawn.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAYCASTERLIBRARY_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAYCASTERLIBRARY_H

#include "default_platform/visualisation/RayCasterEntry.h"

namespace ZORDefault {

/// @return null when the library is not there or cannot be loaded; tried again at the next call.
const RayCaster* LoadedRayCaster();

}  // namespace ZORDefault

#endif
