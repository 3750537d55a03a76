// A folder for what a run needs only while it lasts.
#ifndef ZOR_FOUNDATION_SCRATCH_FOLDER_H
#define ZOR_FOUNDATION_SCRATCH_FOLDER_H

#include <string>

#include "ZORFoundationExport.h"

namespace ZORFoundation {

/// A new folder of this process's own among the temporary files, removed with all that it holds.
class ZOR_FOUNDATION_EXPORT ScratchFolder {
 public:
  /// Raises FileError.
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
