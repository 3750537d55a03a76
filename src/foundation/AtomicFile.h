// Files that take their place only once they are whole.
#ifndef ZOR_FOUNDATION_ATOMICFILE_H
#define ZOR_FOUNDATION_ATOMICFILE_H

#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "foundation/FileError.h"
#include "foundation/TerminationSignals.h"

namespace ZORFoundation {

/// A new file under a name of its own, removed when this goes or a termination signal ends the
/// process. Raises FileError for the path that it stands for.
class ZOR_FOUNDATION_EXPORT TemporaryFile {
 public:
  /// @param inMode permissions, from which the system takes what the user's mask forbids.
  /// @param inStandsFor the path in a FileError.
  TemporaryFile(const std::string& inFolder, unsigned int inMode, const std::string& inStandsFor);
  ~TemporaryFile();
  TemporaryFile(const TemporaryFile&) = delete;
  TemporaryFile& operator=(const TemporaryFile&) = delete;

  const std::string& Path() const { return path_; }
  /// A path that is valid UTF-8, whatever the folder's name is, and works while this lives.
  std::string Utf8Path() const;
  /// Open for reading and writing; from the start of the file as long as only others write.
  int Descriptor() const { return descriptor_; }

  void Write(std::string_view inBytes);
  /// Takes up what another replaced the file by. @return its descriptor.
  int Reopen();
  /// The file has got another name.
  void Release() { path_.clear(); }

  /// Whether a file's name, without its folder, is one of those that this class gives.
  static bool IsTemporaryName(std::string_view inName);

 private:
  std::string standsFor_;
  std::string path_;  // empty when the file is not this object's any more
  std::optional<RemoveOnSignal> removeOnSignal_;
  int descriptor_ = -1;
};

struct AtomicFileOptions {
  unsigned int modeOfNew = 0666;  ///< permissions of a file that did not exist, without the mask's
  bool mayReplace = true;         ///< otherwise an existing file is refused (EEXIST)
  /// Whether the bytes are on the disk before they take their place. Not needed for what can be
  /// made again.
  bool isSynchronised = true;
};

/// Replaces a file by a new one that is written beside it. Whatever happens before Commit has
/// succeeded, the old file stays as it is, and nothing is left of the new one unless the process is
/// killed. The new file has the permissions of the old one, and its owner, group, extended
/// attributes and access control list where the system allows it. A link is followed, also one to
/// where no file is yet. A device or a pipe is never replaced: it is given the bytes at the end.
/// Raises FileError, at once where nothing can be written, and std::bad_alloc.
class ZOR_FOUNDATION_EXPORT AtomicFile {
 public:
  explicit AtomicFile(const std::string& inPath, const AtomicFileOptions& inOptions = {});
  ~AtomicFile();
  AtomicFile(const AtomicFile&) = delete;
  AtomicFile& operator=(const AtomicFile&) = delete;

  void Write(std::string_view inBytes) { temporary_->Write(inBytes); }
  /// The new file, for what writes by a path or a descriptor.
  const TemporaryFile& Temporary() const { return *temporary_; }
  void Commit();

 private:
  void CheckTarget();
  void KeepAttributes(int inDescriptor) const;
  void Rename();
  void CopyIntoTarget() const;

  std::string path_;    // as it was given
  std::string target_;  // behind all links
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
