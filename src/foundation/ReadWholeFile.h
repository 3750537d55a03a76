// Reading whole files.
#ifndef ZOR_FOUNDATION_READWHOLEFILE_H
#define ZOR_FOUNDATION_READWHOLEFILE_H

#include <cstdint>
#include <limits>
#include <optional>
#include <string>

#include "foundation/Descriptor.h"

namespace ZORFoundation {

/// Identifies a file's content without reading it: another content has another stamp.
struct FileStamp {
  std::uint64_t device = 0, inode = 0, size = 0;
  std::int64_t modified = 0, changed = 0;  // nanoseconds since 1970
  friend bool operator==(const FileStamp&, const FileStamp&) = default;
};

/// @return nothing when there is no such file.
ZOR_FOUNDATION_EXPORT std::optional<FileStamp> StampOfFile(const std::string& inPath);

/// @param inName what a FileError names.
/// @return the stamp of an open file; on Windows an empty one for a device or a pipe.
ZOR_FOUNDATION_EXPORT FileStamp StampOfOpen(int inDescriptor, const std::string& inName);

/// @return nanoseconds since 1970, of the clock that file stamps are taken from.
ZOR_FOUNDATION_EXPORT std::int64_t FileClockNow();

struct ReadOptions {
  std::uint64_t maxSize = std::numeric_limits<std::uint64_t>::max();  ///< in bytes
  /// Read devices and pipes too, to their end. Otherwise they are refused at once, without waiting
  /// for a writer.
  bool mayBeStream = false;
};

struct WholeFile {
  std::string bytes;
  FileStamp before, after;  ///< taken before the first and after the last byte was read
  /// Whether the file stayed the same meanwhile, so that bytes and stamp belong together.
  bool IsConsistent() const { return before == after && before.size == bytes.size(); }
};

/// Reads a file from its first byte to its last. Raises FileError when it is missing (ENOENT), a
/// folder (EISDIR), a device, pipe or socket (ESPIPE), larger than allowed (EFBIG), or unreadable
/// for another reason; std::bad_alloc.
ZOR_FOUNDATION_EXPORT WholeFile ReadWholeFile(const std::string& inPath,
                                              const ReadOptions& inOptions = {});

/// The same where the reason does not matter.
ZOR_FOUNDATION_EXPORT std::optional<WholeFile> TryReadWholeFile(const std::string& inPath,
                                                                const ReadOptions& inOptions = {});

/// Opens a file for reading; raises FileError like ReadWholeFile.
ZOR_FOUNDATION_EXPORT Descriptor OpenForReading(const std::string& inPath,
                                                bool inMayBeStream = false);

/// Opens an existing file for appending. Raises FileError.
ZOR_FOUNDATION_EXPORT Descriptor OpenForAppending(const std::string& inPath);

/// Opens a file for appending after its first inSize bytes; what follows them is cut off, and a
/// missing file is made. Raises FileError, also for a symbolic link.
ZOR_FOUNDATION_EXPORT Descriptor OpenCut(const std::string& inPath, std::uint64_t inSize);

/// Reads up to so many bytes, fewer at the end and from streams. @return 0 at the end only.
/// @param inName what a FileError names.
ZOR_FOUNDATION_EXPORT std::size_t ReadSome(int inDescriptor, void* outBytes, std::size_t inMax,
                                           const std::string& inName);

/// Goes back to the start of an open file. Raises FileError.
ZOR_FOUNDATION_EXPORT void Rewind(int inDescriptor, const std::string& inName);

/// Reads what is left of an open file, pipe or device.
/// @param inName what a FileError names.
ZOR_FOUNDATION_EXPORT std::string ReadToEnd(
    int inDescriptor, const std::string& inName,
    std::uint64_t inMaxSize = std::numeric_limits<std::uint64_t>::max());

}  // namespace ZORFoundation

#endif
