// Libraries that are loaded when they are first needed.
#ifndef ZOR_DEFAULT_PLATFORM_NEIGHBOURLIBRARY_H
#define ZOR_DEFAULT_PLATFORM_NEIGHBOURLIBRARY_H

#include <string>

#include "ZORPlatformExport.h"

namespace ZORDefault {

/// Finds a function of a library that lies beside this platform's own one. The library is loaded by
/// the first call and never unloaded: what it loads itself may keep state until the process ends.
/// @param inFile the library's file name, without a directory.
/// @param outReason why there is no such function; untouched when there is one.
/// @return null when the library or the function is missing.
ZOR_PLATFORM_EXPORT void* FindInNeighbourLibrary(const char* inFile, const char* inFunction,
                                                 std::string& outReason);

}  // namespace ZORDefault

#endif
