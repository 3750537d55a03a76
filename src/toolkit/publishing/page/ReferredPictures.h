// The pictures of a page.
#ifndef ZOR_TOOLKIT_PUBLISHING_PAGE_REFERRED_PICTURES_H
#define ZOR_TOOLKIT_PUBLISHING_PAGE_REFERRED_PICTURES_H

#include <map>
#include <string>
#include <vector>

#include "toolkit/publishing/OneFile.h"
#include "toolkit/publishing/folder/Manifest.h"

namespace ZORToolkit {

/// The pictures that a page refers to, with their hashes. In one file equal ones are one.
class ReferredPictures {
 public:
  ReferredPictures(bool inIsOneFile, bool inIsCompact)
      : isOneFile_(inIsOneFile), isCompact_(inIsCompact) {}

  /// @param inPath below the folder, or empty.
  /// @return how the page refers to it. Raises ZORFoundation::FileError.
  std::string Refer(const std::string& inFolder, const std::string& inPath, PictureSize inSize);

  const std::vector<HashedFile>& Files() const { return files_; }
  /// Those that stand in one file.
  const std::vector<PagePicture>& Pictures() const { return pictures_; }

 private:
  bool isOneFile_, isCompact_;
  std::vector<HashedFile> files_;
  std::vector<PagePicture> pictures_;
  std::map<std::string, std::string> ids_;  // by hash
};

}  // namespace ZORToolkit

#endif
