// Verifying a publication: whether it is what would be made now.
#include <algorithm>
#include <cctype>
#include <filesystem>
#include <optional>
#include <utility>

#include "foundation/NativePath.h"
#include "foundation/ReadWholeFile.h"
#include "toolkit/publishing/OneFile.h"
#include "toolkit/publishing/folder/Manifest.h"
#include "toolkit/publishing/pictures/PictureDrawing.h"
#include "toolkit/records/DocumentText.h"

namespace fs = std::filesystem;

namespace ZORToolkit {
namespace {

/// An existing publication.
class FoundPublication {
 public:
  explicit FoundPublication(const PublicationOptions& inOptions) : folder_(inOptions.folder) {
    const bool isFolder = fs::is_directory(ZORFoundation::NativePath(folder_));
    const std::string path = isFolder ? folder_ + "/" + kManifestFile : folder_;
    std::string bytes = ZORFoundation::ReadWholeFile(path).bytes;
    if (!isFolder) {
      page_.emplace(path, std::move(bytes));
      bytes = page_->ManifestText();
    }
    manifest = ManifestFrom(path, bytes);
  }

  /// @return nothing when it is missing.
  std::optional<std::string> File(const std::string& inName) const {
    if (page_) {
      const bool isPicture = inName.starts_with("pictures/");
      return isPicture ? page_->Picture(inName) : page_->PackedBlock(inName);
    }
    auto file = ZORFoundation::TryReadWholeFile(folder_ + "/" + inName);
    if (!file) return std::nullopt;
    return std::move(file->bytes);
  }

  /// @return why the result in it is none; empty when it is whole, or in a folder.
  std::string WhyNoResult() const {
    try {
      if (page_ && manifest.result) static_cast<void>(page_->Result());
      return {};
    } catch (const Error& error) {
      return error.what();
    }
  }

  Manifest manifest;

 private:
  std::string folder_;
  std::optional<PublishedPage> page_;
};

}  // namespace

std::vector<std::string> VerifyPublication(const PublicationOptions& inOptions) {
  const FoundPublication found(inOptions);
  const ZoomOfOptions zoom(inOptions);
  std::vector<std::string> lines;
  if (!inOptions.source.empty())
    lines = Differences(found.manifest, ManifestOf(inOptions, PictureSettings()));
  if (const std::string why = found.WhyNoResult(); !why.empty()) lines.push_back(why);
  for (const HashedFile& file : found.manifest.files) {
    const std::optional<std::string> bytes = found.File(file.name);
    if (!bytes)
      lines.push_back(file.name + ": missing");
    else if (HashedBytes(file.name, *bytes).sha256 != file.sha256)
      lines.push_back(file.name + ": changed");
  }
  return lines;
}

void SetTarget(PublicationOptions& ioOptions, const std::string& inPath) {
  std::string ending = ZORFoundation::NativePath(inPath).extension().string();
  std::ranges::transform(ending, ending.begin(), [](unsigned char inByte) {
    return static_cast<char>(std::tolower(inByte));
  });
  ioOptions.folder = inPath;
  ioOptions.isOneFile = ending == ".html" && !fs::is_directory(ZORFoundation::NativePath(inPath));
}

std::string FileNameOf(const std::string& inPath) {
  return Utf8(FromUtf8(ZORFoundation::NativePath(inPath).filename().string()));
}

}  // namespace ZORToolkit
