// Libraries that are loaded when they are first needed.
#ifndef ZOR_FOUNDATION_PLUGINLOADER_H
#define ZOR_FOUNDATION_PLUGINLOADER_H

#include <string>

#include "ZORFoundationExport.h"

namespace ZORFoundation {

/// The directory of this library's file, without a separator at its end; empty when it cannot be
/// found. All our libraries lie there.
ZOR_FOUNDATION_EXPORT std::string LibraryDirectory();

/// Finds a function of a library that lies beside this one. The library is loaded by the first call
/// and never unloaded: what it loads itself may keep state until the process ends.
/// @param inFile the library's file name, without a directory.
/// @param outReason why there is no such function; untouched when there is one.
/// @return null when the library or the function is missing.
ZOR_FOUNDATION_EXPORT void* FindPluginFunction(const char* inFile, const char* inFunction,
                                               std::string& outReason);

}  // namespace ZORFoundation

#endif
