// What this platform's own files need from the file system.
#ifndef ZOR_DEFAULT_PLATFORM_SYSTEM_SYSTEMFILES_H
#define ZOR_DEFAULT_PLATFORM_SYSTEM_SYSTEMFILES_H

#include <cstdint>
#include <string>

namespace ZORDefault {

/// What tells one content of a file from another without reading it.
struct FileStamp {
  std::uint64_t device = 0, inode = 0, size = 0;
  std::int64_t modified = 0, changed = 0;  // nanoseconds since 1970
  friend bool operator==(const FileStamp&, const FileStamp&) = default;
};

/// @return false when there is no such file.
bool ReadStamp(const std::string& inPath, FileStamp& outStamp);

/// @param outStamp the stamp that the file had before its first byte was read.
/// @return false when it is no regular file or cannot be read.
bool ReadFile(const std::string& inPath, std::string& outContent, FileStamp& outStamp);

/// The directory of the library file that holds this code, without a separator at its end; empty
/// when it cannot be told.
std::string LibraryDirectory();

/// @return nanoseconds since 1970, of the clock that file stamps are taken from.
std::int64_t FileClockNow();

}  // namespace ZORDefault

#endif
