// Plugins: libraries loaded on first use.
#ifndef ZOR_FOUNDATION_PLUGINLOADER_H
#define ZOR_FOUNDATION_PLUGINLOADER_H

#include <string>

#include "ZORFoundationExport.h"

namespace ZORFoundation {

/// The directory of this library's file, where all our libraries are, without a trailing separator;
/// empty when unknown.
ZOR_FOUNDATION_EXPORT std::string LibraryDirectory();

/// Finds a function of a library in that directory. The library is loaded by the first call and
/// never unloaded: its own dependencies may keep state until the process ends.
/// @param inFile the library's file name, without a directory.
/// @param outReason why there is no such function; untouched when there is one.
/// @return null when the library or the function is missing.
ZOR_FOUNDATION_EXPORT void* FindPluginFunction(const char* inFile, const char* inFunction,
                                               std::string& outReason);

}  // namespace ZORFoundation

#endif
