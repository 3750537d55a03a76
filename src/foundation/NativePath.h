// Paths of the standard library from narrow text.
#ifndef ZOR_FOUNDATION_NATIVEPATH_H
#define ZOR_FOUNDATION_NATIVEPATH_H

#include <filesystem>
#include <string>

namespace ZORFoundation {

/// A path in UTF-8. Its own constructor takes narrow text for that of the C locale on Windows, where
/// its string() is UTF-8 all the same; elsewhere bytes are taken as they are.
inline std::filesystem::path NativePath(const std::string& inPath) {
#ifdef _WIN32
  return std::u8string(inPath.begin(), inPath.end());
#else
  return inPath;
#endif
}

}  // namespace ZORFoundation

#endif
