// Atomic replacement of files.
#ifndef ZOR_FOUNDATION_ATOMICFILE_H
#define ZOR_FOUNDATION_ATOMICFILE_H

#include <memory>
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
  /// @param inMode permissions, subject to the umask.
  /// @param inReportedPath the path that a FileError names in place of the temporary one.
  TemporaryFile(const std::string& inFolder, unsigned int inMode,
                const std::string& inReportedPath);
  ~TemporaryFile();
  TemporaryFile(const TemporaryFile&) = delete;
  TemporaryFile& operator=(const TemporaryFile&) = delete;

  const std::string& Path() const { return path_; }
  /// A path to the same file that is valid UTF-8 whatever the folder's name, for as long as this
  /// lives.
  std::string Utf8Path() const;
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

struct AtomicFileOptions {
  unsigned int modeOfNew =
      0666;                ///< permissions of a file that did not exist; subject to the umask
  bool mayReplace = true;  ///< otherwise an existing file is refused (EEXIST)
  /// Flush the bytes to disk before the rename. Not worth the wait for what can be made again.
  bool isSynchronised = true;
  /// Where the new file is until then, on the same file system; empty: beside the old one. Not for
  /// what a link leads to.
  std::string temporaryFolder{};
};

/// Replaces a file by a new one that is written beside it. Until Commit succeeds the old file is
/// untouched; if it never does, nothing is left of the new one unless the process is killed.
///
/// The new file keeps the owner, group, permissions, extended attributes and access control list of
/// the old one. Where the system does not let it, the old file itself is overwritten at Commit, with
/// a copy beside it until that is done, and its old bytes put back when it fails. Symbolic links are
/// followed, dangling ones included. A device or a pipe is never replaced: it receives the bytes at Commit.
///
/// The constructor already raises FileError where nothing could be written; every operation may
/// raise std::bad_alloc.
class ZOR_FOUNDATION_EXPORT AtomicFile {
 public:
  explicit AtomicFile(const std::string& inPath, const AtomicFileOptions& inOptions = {});
  ~AtomicFile();
  AtomicFile(const AtomicFile&) = delete;
  AtomicFile& operator=(const AtomicFile&) = delete;

  void Write(std::string_view inBytes) { temporary_->Write(inBytes); }
  /// The new file, for writers that take a path or a descriptor.
  const TemporaryFile& Temporary() const { return *temporary_; }
  void Commit();

 private:
  void CheckTarget();
  bool KeepAttributes(int inDescriptor) const;
  void OverwriteTarget(int inDescriptor) const;
  void Rename();
  void CopyIntoTarget() const;

  std::string path_;    // as given
  std::string target_;  // with links resolved
  AtomicFileOptions options_;
  bool isNew_ = false;     // nothing is replaced
  bool isStream_ = false;  // a device or a pipe
  std::optional<TemporaryFile> temporary_;
};

/// Replaces a file by these bytes.
ZOR_FOUNDATION_EXPORT void WriteWholeFile(const std::string& inPath, std::string_view inBytes,
                                          const AtomicFileOptions& inOptions = {});

}  // namespace ZORFoundation

#endif
