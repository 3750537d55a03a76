// Temporary files and folders.
#ifndef ZOR_FOUNDATION_TEMPORARYFILE_H
#define ZOR_FOUNDATION_TEMPORARYFILE_H

#include <optional>
#include <string>
#include <string_view>

#include "foundation/Descriptor.h"
#include "foundation/TerminationSignals.h"

namespace ZORFoundation {

/// A new file under a unique name, removed by the destructor or when a termination signal ends the
/// process. Raises FileError.
class ZOR_FOUNDATION_EXPORT TemporaryFile {
 public:
  /// @param inMode permissions, subject to the umask; Windows has none.
  /// @param inReportedPath the path that a FileError names in place of the temporary one.
  TemporaryFile(const std::string& inFolder, unsigned int inMode,
                const std::string& inReportedPath);
  ~TemporaryFile();
  TemporaryFile(const TemporaryFile&) = delete;
  TemporaryFile& operator=(const TemporaryFile&) = delete;

  const std::string& Path() const { return path_; }
  /// A path to the same file that is valid UTF-8 whatever the folder's name, for as long as this
  /// lives. For others to write, so on Windows the descriptor is closed until Reopen.
  std::string Utf8Path();
  /// Open for reading and writing.
  int Descriptor() const { return descriptor_; }

  void Write(std::string_view inBytes);
  /// Switches to whatever file now has this path, in case a writer replaced it.
  /// @return the descriptor.
  int Reopen();
  /// Nothing more is written; the file stays.
  void Close();
  /// The file has been renamed and is no longer this object's to remove.
  void Release() { path_.clear(); }

  /// Whether a file name, without its folder, is of the form that this class generates.
  static bool IsTemporaryName(std::string_view inName);

 private:
  std::string reportedPath_;
  std::string path_;  // empty once released
  std::optional<RemoveOnSignal> removeOnSignal_;
  int descriptor_ = -1;
};

/// A file without a name, for bytes that another process is given or gives back; it goes with its
/// last descriptor. On Windows it is in memory as far as the system's cache has room. Raises
/// FileError.
/// @return it, with the bytes written and its position behind them.
ZOR_FOUNDATION_EXPORT Descriptor NewMemoryFile(std::string_view inBytes);

/// A new folder of this process's own among the temporary files, removed with all that it holds.
class ZOR_FOUNDATION_EXPORT ScratchFolder {
 public:
  /// Raises FileError, and std::filesystem::filesystem_error where there is no folder for temporary
  /// files.
  ScratchFolder();
  ~ScratchFolder();
  ScratchFolder(const ScratchFolder&) = delete;
  ScratchFolder& operator=(const ScratchFolder&) = delete;

  const std::string& Path() const { return path_; }

 private:
  std::string path_;
};

}  // namespace ZORFoundation

#endif
