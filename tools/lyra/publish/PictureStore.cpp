#include "lyra/publish/PictureStore.h"

#include <fstream>
#include <iterator>
#include <regex>

#include "lyra/CommandErrors.h"

namespace fs = std::filesystem;

namespace lyra {
namespace {

constexpr char kFolder[] = "pictures";
constexpr char kStampFile[] = ".lyra-publish";

std::string BytesOf(const fs::path& inPath) {
  std::ifstream stream(inPath, std::ios::binary);
  return {std::istreambuf_iterator<char>(stream), {}};
}

// Also what a drawing that was killed left unfinished.
bool IsOurs(const std::string& inName) {
  static const std::regex pattern(
      R"(interference_\d+(_product_[12]|_SubItf_\d+)?\.(jpg|png|jpg\.png)|\.picture-[0-9a-f]{16})");
  return std::regex_match(inName, pattern);
}

}  // namespace

PictureStore::PictureStore(const fs::path& inPublication, const std::string& inEnding)
    : folder_(fs::absolute(inPublication / kFolder)), ending_(inEnding) {}

void PictureStore::RemovePictures() const {
  std::vector<fs::path> ours;
  for (const fs::directory_entry& entry : fs::directory_iterator(folder_))
    if (IsOurs(entry.path().filename().string())) ours.push_back(entry.path());
  for (const fs::path& path : ours) fs::remove(path);
}

bool PictureStore::Prepare(const std::string& inStamp, bool inGoesOn) const {
  fs::create_directories(folder_);
  const fs::path stampFile = folder_ / kStampFile;
  const bool isSame = BytesOf(stampFile) == inStamp;
  if (inGoesOn && isSame) return true;
  const bool hadStamp = fs::remove(stampFile);
  RemovePictures();
  std::ofstream stream(stampFile, std::ios::binary);
  stream << inStamp;
  if (!stream.flush()) throw InputError(stampFile.string() + ": cannot be written");
  return !inGoesOn || !hadStamp;
}

std::string PictureStore::PictureName(int inNumber) const {
  return "interference_" + std::to_string(inNumber) + ending_;
}

std::string PictureStore::PreviewName(int inNumber, std::size_t inProduct) const {
  return "interference_" + std::to_string(inNumber) + "_product_" + std::to_string(inProduct + 1) +
         ending_;
}

// The names follow from that of the main picture: one name for all unless that ends in ".png".
std::vector<std::string> PictureStore::ThumbnailNames(int inNumber) const {
  std::vector<std::string> names;
  if (ending_ != ".png") {
    const std::string only = PictureName(inNumber) + ".png";
    if (Has(only)) names.push_back(only);
    return names;
  }
  const std::string prefix = "interference_" + std::to_string(inNumber) + "_SubItf_";
  // A sub-interference without a viewpoint leaves a gap.
  constexpr int kWidestGap = 16;
  for (int i = 1, gap = 0; gap < kWidestGap; ++i) {
    const std::string name = prefix + std::to_string(i) + ".png";
    gap = Has(name) ? 0 : gap + 1;
    if (gap == 0) names.push_back(name);
  }
  return names;
}

bool PictureStore::Has(const std::string& inName) const {
  std::error_code error;
  return fs::is_regular_file(folder_ / inName, error) && fs::file_size(folder_ / inName) > 0;
}

std::string PictureStore::Reference(const std::string& inName) const {
  return Has(inName) ? std::string(kFolder) + "/" + inName : "";
}

}  // namespace lyra
