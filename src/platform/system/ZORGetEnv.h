// The process's environment.
#ifndef ZOR_PLATFORM_SYSTEM_ZORGETENV_H
#define ZOR_PLATFORM_SYSTEM_ZORGETENV_H

#include "ZORPlatformExport.h"

/// @return the value that an environment variable has now, or null when it is not set; owned by the
///         environment.
ZOR_PLATFORM_EXPORT const char* ZORGetEnv(const char* inName);

#endif
