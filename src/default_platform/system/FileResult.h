// Codes of the file operations.
#ifndef ZOR_DEFAULT_PLATFORM_SYSTEM_FILERESULT_H
#define ZOR_DEFAULT_PLATFORM_SYSTEM_FILERESULT_H

#include <filesystem>

#include "platform/system/ZORFile.h"

namespace ZORDefault {

/// The code of an errno value.
HRESULT FileResultOf(int inError);

/// The file system's own.
inline constexpr char kPathSeparator =
    static_cast<char>(std::filesystem::path::preferred_separator);

}  // namespace ZORDefault

#endif
