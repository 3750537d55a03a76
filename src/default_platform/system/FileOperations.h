// What the file operations have in common.
#ifndef ZOR_DEFAULT_PLATFORM_SYSTEM_FILEOPERATIONS_H
#define ZOR_DEFAULT_PLATFORM_SYSTEM_FILEOPERATIONS_H

#include <filesystem>
#include <string>

#include "platform/system/ZORFile.h"

namespace ZORDefault {

/// The code of an errno value.
HRESULT FileResultOf(int inError);

/// The file system's own.
inline constexpr char kPathSeparator =
    static_cast<char>(std::filesystem::path::preferred_separator);

// Implemented for each system.

/// A wide path in UTF-8; empty when it is no well-formed text.
std::string NarrowPath(const wchar_t* inPath);

enum class FileMode { kRead, kReplace, kAppend };

/// Opens a file, which is made where it may be written; a folder is refused (EISDIR).
/// @return -1 when that failed; errno says why.
int OpenFile(const std::string& inPath, FileMode inMode);

/// The permissions that a copy of an open file starts with.
unsigned int PermissionsOf(int inDescriptor);

}  // namespace ZORDefault

#endif
