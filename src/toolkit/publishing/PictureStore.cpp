#include "toolkit/publishing/PictureStore.h"

#include <regex>

#include "foundation/AtomicFile.h"
#include "foundation/ReadWholeFile.h"

namespace fs = std::filesystem;

namespace ZORToolkit {
namespace {

constexpr char kFolder[] = "pictures";
constexpr char kStampFile[] = ".lyra-publish";

/// Of pictures that are being drawn, and of these and other files that are being written.
bool IsUnfinished(const std::string& inName) {
  static const std::regex drawn(R"(\.drawing_\d+(_SubItf_\d+)?\.(jpg|png|jpg\.png))");
  return ZORFoundation::TemporaryFile::IsTemporaryName(inName) || std::regex_match(inName, drawn);
}

bool IsFinished(const std::string& inName) {
  static const std::regex names(
      R"(interference_\d+(_product_[12]|_SubItf_\d+)?\.(jpg|png|jpg\.png))");
  return std::regex_match(inName, names);
}

void RemoveFiles(const fs::path& inFolder, bool (*inIsMeant)(const std::string& inName)) {
  std::vector<fs::path> meant;
  for (const fs::directory_entry& entry : fs::directory_iterator(inFolder))
    if (inIsMeant(entry.path().filename().string())) meant.push_back(entry.path());
  for (const fs::path& path : meant) fs::remove(path);
}

std::string FinishedStem(int inNumber) { return "interference_" + std::to_string(inNumber); }
std::string UnfinishedStem(int inNumber) { return ".drawing_" + std::to_string(inNumber); }

}  // namespace

PictureStore::PictureStore(const fs::path& inPublication, const std::string& inEnding)
    : folder_(fs::absolute(inPublication / kFolder)), ending_(inEnding) {}

bool PictureStore::Prepare(const std::string& inStamp, bool inGoesOn) const {
  fs::create_directories(folder_);
  const fs::path stampFile = folder_ / kStampFile;
  const auto old = ZORFoundation::TryReadWholeFile(stampFile.string());
  const bool isSame = old && old->bytes == inStamp;
  if (inGoesOn && isSame) return true;
  const bool hadStamp = fs::remove(stampFile);
  RemoveFiles(folder_, IsFinished);
  ZORFoundation::WriteWholeFile(stampFile.string(), inStamp);
  return !inGoesOn || !hadStamp;
}

std::string PictureStore::PictureName(int inNumber) const {
  return FinishedStem(inNumber) + ending_;
}

std::string PictureStore::PreviewName(int inNumber, std::size_t inProduct) const {
  return FinishedStem(inNumber) + "_product_" + std::to_string(inProduct + 1) + ending_;
}

std::string PictureStore::UnfinishedName(int inNumber) const {
  return UnfinishedStem(inNumber) + ending_;
}

std::vector<std::string> PictureStore::ThumbnailNames(int inNumber) const {
  return ThumbnailsBeside(FinishedStem(inNumber));
}

// The names follow from that of the main picture: one name for all unless that ends in ".png".
std::vector<std::string> PictureStore::ThumbnailsBeside(const std::string& inStem) const {
  std::vector<std::string> names;
  if (ending_ != ".png") {
    const std::string only = inStem + ending_ + ".png";
    if (Has(only)) names.push_back(only);
    return names;
  }
  // A sub-interference without a viewpoint leaves a gap.
  constexpr int kWidestGap = 16;
  for (int i = 1, gap = 0; gap < kWidestGap; ++i) {
    const std::string name = inStem + "_SubItf_" + std::to_string(i) + ".png";
    gap = Has(name) ? 0 : gap + 1;
    if (gap == 0) names.push_back(name);
  }
  return names;
}

void PictureStore::Finish(int inNumber) const {
  const std::string stem = UnfinishedStem(inNumber);
  const auto finish = [&](const std::string& inName) {
    fs::rename(folder_ / inName, folder_ / (FinishedStem(inNumber) + inName.substr(stem.size())));
  };
  for (const std::string& thumbnail : ThumbnailsBeside(stem)) finish(thumbnail);
  if (Has(UnfinishedName(inNumber))) finish(UnfinishedName(inNumber));
}

bool PictureStore::Has(const std::string& inName) const {
  std::error_code error;
  return fs::is_regular_file(folder_ / inName, error) && fs::file_size(folder_ / inName) > 0;
}

std::string PictureStore::Reference(const std::string& inName) const {
  return Has(inName) ? std::string(kFolder) + "/" + inName : "";
}

void RemoveUnfinishedFiles(const fs::path& inPublication) {
  RemoveFiles(inPublication, IsUnfinished);
  const fs::path pictures = inPublication / kFolder;
  if (fs::is_directory(pictures)) RemoveFiles(pictures, IsUnfinished);
}

}  // namespace ZORToolkit
