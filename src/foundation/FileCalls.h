// The system calls under atomic and temporary files; for the foundation's own sources. Where a call
// fails, a descriptor is -1, with the reason in errno; other calls return an errno value, 0 for
// success.
#ifndef ZOR_FOUNDATION_FILECALLS_H
#define ZOR_FOUNDATION_FILECALLS_H

#include <cstdint>
#include <filesystem>
#include <functional>
#include <string>
#include <string_view>

#include "foundation/Descriptor.h"

namespace ZORFoundation {

/// A file's name begins after the last of these in its path. "C:name" is relative to the drive.
inline constexpr std::string_view kPathSeparators =
    std::filesystem::path::preferred_separator == '/' ? "/" : "/\\:";

/// A number that no other call gets, in this process or another. Not for secrets.
std::uint64_t UniqueNumber();

/// Makes a file for reading and writing; one that exists is refused (EEXIST).
/// @param inMode permissions, subject to the umask. Windows has none.
int OpenNew(const std::string& inPath, unsigned int inMode);
/// Makes a file that has no name, or none for others, and goes with its last descriptor.
int OpenInMemory();
/// Opens a file for reading and writing, not through a link, without waiting for anybody.
int OpenExisting(const std::string& inPath);
/// Opens a file, device or pipe, for reading or for writing alone.
int OpenToRead(const std::string& inPath);
int OpenToWrite(const std::string& inPath);
/// Opens the file that has this path now; the same descriptor when that is the open one.
int ReopenIfReplaced(int inDescriptor, const std::string& inPath);
/// What is raised when a file could not be opened by one of these.
FileError WhyNotOpened(const std::string& inPath);

/// A path in valid UTF-8 to an open file, which another program or library may write or replace. It
/// stays open but on Windows, where the descriptor becomes -1; see ReopenIfReplaced.
std::string Utf8PathOf(int& ioDescriptor, const std::string& inPath);

/// Ends an open file where it was last written.
int CutHere(int inDescriptor);
int FlushToDisk(int inDescriptor);

/// Makes a folder that nobody else may enter.
int MakeOwnFolder(const std::string& inPath);

/// Remove a file, or an empty folder, if there is one. Async-signal-safe where there are signals.
void RemoveFile(const char* inPath) noexcept;
void RemoveFolder(const char* inPath) noexcept;

/// Runs a function while the termination signals of this thread are kept waiting. On Windows they
/// come on a thread of their own and are not held up.
void WithSignalsHeld(const std::function<void()>& inFunction);

}  // namespace ZORFoundation

#endif
