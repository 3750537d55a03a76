// Helpers of the sources for Windows: paths in wide characters, errors as errno values. Paths
// and texts are UTF-8 everywhere else, whatever the ANSI code page.
#ifndef ZOR_FOUNDATION_WINDOWSCALLS_H
#define ZOR_FOUNDATION_WINDOWSCALLS_H

#include <windows.h>

#include <string>
#include <string_view>

#include "foundation/Descriptor.h"

namespace ZORFoundation {

/// Ill-formed UTF-8 or UTF-16 becomes U+FFFD.
ZOR_FOUNDATION_EXPORT std::wstring WideText(std::string_view inText);
ZOR_FOUNDATION_EXPORT std::string Utf8Text(std::wstring_view inText);

/// A path as the calls of Windows take it: with backslashes, and where it is too long for MAX_PATH
/// absolute and marked so that this limit does not hold.
ZOR_FOUNDATION_EXPORT std::wstring WidePath(const std::string& inPath);

/// The errno value for an error of Windows.
ZOR_FOUNDATION_EXPORT int ErrorNumberOf(unsigned long inError);

/// Whether a call failed because another program has the file open.
ZOR_FOUNDATION_EXPORT bool IsInUse(unsigned long inError);
/// Writers such as this one, indexers and virus scanners have a file for a moment only.
inline constexpr int kTriesWhileInUse = 20;
inline constexpr unsigned long kMillisecondsBetweenTries = 10;

struct OpenRequest {
  unsigned long access = GENERIC_READ;
  unsigned long disposition = OPEN_EXISTING;
  bool isAppending = false;
  unsigned long attributes = FILE_ATTRIBUTE_NORMAL;
};

/// Opens a file in binary mode; others may read, write, rename and remove it meanwhile, and
/// processes that are started do not inherit it.
/// @return -1 when that failed; errno says why.
ZOR_FOUNDATION_EXPORT int OpenShared(const std::string& inPath, const OpenRequest& inRequest);

/// The handle of an open file.
ZOR_FOUNDATION_EXPORT HANDLE HandleOf(int inDescriptor);

}  // namespace ZORFoundation

#endif
