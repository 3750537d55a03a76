// The process's environment.
#ifndef ZOR_PLATFORM_SYSTEM_ZORGETENV_H
#define ZOR_PLATFORM_SYSTEM_ZORGETENV_H

#include "ZORPlatformExport.h"

/// @return the value of an environment variable, or null when it is not set; the environment's own,
/// read now.
ZOR_PLATFORM_EXPORT const char* ZORGetEnv(const char* inName);

#endif
