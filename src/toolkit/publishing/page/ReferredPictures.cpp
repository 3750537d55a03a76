#include "toolkit/publishing/page/ReferredPictures.h"

#include <filesystem>
#include <utility>

#include "foundation/NativePath.h"
#include "foundation/ReadWholeFile.h"
#include "toolkit/publishing/page/PageLibrary.h"

namespace fs = std::filesystem;

namespace ZORToolkit {

std::string ReferredPictures::Refer(const std::string& inFolder, const std::string& inPath,
                                    PictureSize inSize) {
  if (inPath.empty()) return {};
  std::string path(inFolder);
  path.append("/").append(inPath);
  std::string bytes = ZORFoundation::ReadWholeFile(path).bytes;
  HashedFile file = HashedBytes(inPath, bytes);
  if (!isOneFile_) {
    files_.push_back(std::move(file));
    return inPath;
  }
  if (isCompact_)
    if (std::string webp = LoadPageLibrary().webpFromPng(bytes); !webp.empty()) {
      bytes = std::move(webp);
      file =
          HashedBytes(ZORFoundation::NativePath(inPath).replace_extension(".webp").string(), bytes);
    }
  const auto [place, isNew] =
      ids_.try_emplace(file.sha256, std::string("zor-").append(file.sha256, 0, 20));
  if (isNew) {
    pictures_.push_back({place->second, file.name, std::move(bytes), inSize.width, inSize.height});
    files_.push_back(std::move(file));
  }
  return "#" + place->second;
}

}  // namespace ZORToolkit
