// What a library is made of that is loaded on first use.
#ifndef ZOR_FOUNDATION_PLUGINFUNCTION_H
#define ZOR_FOUNDATION_PLUGINFUNCTION_H

/// Declares a function that FindPluginFunction finds by its name. On Windows it must be exported by
/// itself: what is linked into such a library may export functions, and then no others are.
#ifdef _WIN32
#define ZOR_PLUGIN_FUNCTION extern "C" __declspec(dllexport)
#else
#define ZOR_PLUGIN_FUNCTION extern "C" __attribute__((visibility("default")))
#endif

#endif
