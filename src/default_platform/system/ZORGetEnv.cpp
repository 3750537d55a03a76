#include "platform/system/ZORGetEnv.h"

#include <cstdlib>

const char* ZORGetEnv(const char* inName) { return inName ? std::getenv(inName) : nullptr; }
