// Which declarations of this folder every host has.
#ifndef ZOR_PLATFORM_ZORPLATFORMADDITIONS_H
#define ZOR_PLATFORM_ZORPLATFORMADDITIONS_H

/// These headers declare the platform of a host, as far as the library needs it. What the default
/// platform offers beyond that is declared under this condition only, at the end of each class.
/// Defined as 0, it leaves a host's declarations: the library is compiled and tested against them
/// too, since all that it uses of the additions goes through src/PlatformAdapter.h.
#ifndef ZOR_PLATFORM_ADDITIONS
#define ZOR_PLATFORM_ADDITIONS 1
#endif

#endif
