// The folder in which the files of a publication are written before they are moved into place.
#ifndef ZOR_TOOLKIT_PUBLISHING_FOLDER_WORKFOLDER_H
#define ZOR_TOOLKIT_PUBLISHING_FOLDER_WORKFOLDER_H

#include <filesystem>
#include <optional>
#include <string>

#include "foundation/Descriptor.h"
#include "foundation/TerminationSignals.h"

namespace ZORToolkit {

/// A hidden folder in one that is published into, for this process and those that it forks alone.
/// What a killed process left in it is removed; nothing outside of it ever is.
class WorkFolder {
 public:
  /// Makes both folders where they are missing. Raises Error when another process publishes into
  /// this one, ZORFoundation::FileError and std::filesystem::filesystem_error.
  explicit WorkFolder(const std::filesystem::path& inFolder);
  /// Removes it with the unfinished files.
  ~WorkFolder();
  WorkFolder(const WorkFolder&) = delete;
  WorkFolder& operator=(const WorkFolder&) = delete;

  /// Absolute.
  const std::string& Path() const { return path_; }

 private:
  void Lock(const std::filesystem::path& inFolder);
  void RemoveFiles() const;
  // Implemented for each system.
  bool TryLock();
  void RemoveFolder();

  std::string path_, lockPath_;
  ZORFoundation::Descriptor lock_;  // released by the system when the last process that has it ends
  std::optional<ZORFoundation::RemoveOnSignal> removeLock_, removeFolder_;
};

}  // namespace ZORToolkit

#endif
