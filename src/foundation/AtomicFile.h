// Atomic replacement of files.
#ifndef ZOR_FOUNDATION_ATOMICFILE_H
#define ZOR_FOUNDATION_ATOMICFILE_H

#include <optional>
#include <string>
#include <string_view>

#include "foundation/Descriptor.h"
#include "foundation/TemporaryFile.h"

namespace ZORFoundation {

struct AtomicFileOptions {
  /// Permissions of a file that did not exist; subject to the umask.
  unsigned int modeOfNew = 0666;
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
/// the old one. Where the system does not let it, the old file itself is overwritten at Commit,
/// with a copy beside it until that is done, and its old bytes put back when it fails. Symbolic
/// links are followed, dangling ones included. A device or a pipe is never replaced: it receives
/// the bytes at Commit.
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
  TemporaryFile& Temporary() { return *temporary_; }
  void Commit();

 private:
  // Implemented for each system.
  static std::string FollowLinks(const std::string& inPath);
  void CheckTarget();
  bool KeepAttributes(int inDescriptor) const;
  void Rename();

  void OverwriteTarget(int inDescriptor) const;
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
