// Plugins: libraries loaded on first use.
#ifndef ZOR_FOUNDATION_PLUGINLOADER_H
#define ZOR_FOUNDATION_PLUGINLOADER_H

#include <string>

#include "ZORFoundationExport.h"

namespace ZORFoundation {

/// The directory of this library's file, where all our libraries are, without a trailing separator;
/// empty when unknown.
ZOR_FOUNDATION_EXPORT std::string LibraryDirectory();

/// The path of a library in that directory, by its name alone: "ZORPage" is libZORPage.so, and
/// ZORPage.dll on Windows.
ZOR_FOUNDATION_EXPORT std::string PluginPath(const char* inName);

/// Finds a function of a library in that directory. The library is loaded by the first call and
/// never unloaded: its own dependencies may keep state until the process ends.
/// @param inName the library's, as above.
/// @param outReason why there is no such function; untouched when there is one.
/// @return null when the library or the function is missing.
ZOR_FOUNDATION_EXPORT void* FindPluginFunction(const char* inName, const char* inFunction,
                                               std::string& outReason);

}  // namespace ZORFoundation

#endif
