#include "toolkit/publishing/pictures/PictureStore.h"

#include <cstdlib>
#include <optional>
#include <regex>
#include <sstream>

#include "foundation/AtomicFile.h"
#include "foundation/ReadWholeFile.h"
#include "toolkit/Error.h"

namespace fs = std::filesystem;

namespace ZORToolkit {
namespace {

constexpr char kPictureFolder[] = "pictures";
constexpr char kStampFile[] = ".lyra-publish";
constexpr std::string_view kListStart = "drawn";

constexpr char kOverview[] = "overview";

/// The parts of a picture's name: the number of its interference, negative in the baseline, 0 for
/// the overview, and what kind of picture it is.
struct PictureNameParts {
  std::string number, kind;
};

std::optional<PictureNameParts> PartsOfName(const std::string& inName) {
  static const std::regex names(
      R"((interference|before)_(\d+)((?:_product_[12]|_SubItf_\d+)?\.(?:jpg|png|jpg\.png)))");
  static const std::regex overviews(R"(overview(\.(?:jpg|png)))");
  std::smatch parts;
  if (std::regex_match(inName, parts, overviews)) return PictureNameParts{"0", parts[1]};
  if (!std::regex_match(inName, parts, names)) return std::nullopt;
  const bool isBefore = parts[1] == "before";
  return PictureNameParts{std::string(isBefore ? "-" : "").append(parts[2]), parts[3]};
}

struct Stamp {
  std::string text;  // what the pictures were drawn from
  std::optional<std::set<std::string>> names;
};

/// Anything but a picture's name is skipped: a list can lead nowhere else.
std::optional<Stamp> ReadStamp(const fs::path& inPath) {
  const auto file = ZORFoundation::TryReadWholeFile(inPath.string());
  if (!file) return std::nullopt;
  const std::size_t start = file->bytes.find(std::string(1, '\n').append(kListStart));
  if (start == std::string::npos) return Stamp{file->bytes, std::nullopt};
  Stamp stamp{file->bytes.substr(0, start + 1), std::set<std::string>()};
  std::istringstream lines(file->bytes.substr(start + 1));
  for (std::string line; std::getline(lines, line);)
    if (PartsOfName(line)) stamp.names->insert(line);
  return stamp;
}

/// A line feed comes first, so that a truncated line damages no other.
std::string ListText(const std::vector<std::string>& inNames) {
  std::string text;
  for (const std::string& name : inNames) text.append(1, '\n').append(name);
  return text;
}

std::string Stem(int inNumber) {
  if (inNumber == 0) return kOverview;
  return std::string(inNumber < 0 ? "before_" : "interference_")
      .append(std::to_string(std::abs(inNumber)));
}

bool HasBytes(const fs::path& inPath) {
  std::error_code error;
  return fs::is_regular_file(inPath, error) && fs::file_size(inPath) > 0;
}

}  // namespace

PictureStore::PictureStore(const fs::path& inPublication, const std::string& inEnding)
    : shownFolder_(inPublication / kPictureFolder),
      folder_(fs::absolute(shownFolder_)),
      ending_(inEnding),
      work_(shownFolder_) {}

bool PictureStore::Prepare(const std::string& inStamp, bool inGoesOn,
                           const std::set<std::string>& inNumbers) {
  const std::optional<Stamp> old = ReadStamp(folder_ / kStampFile);
  const std::set<std::string> present = PicturesOf(inNumbers);
  std::set<std::string> own;
  // Former versions listed nothing, but removed every picture of such a name before they drew. So
  // what has the name of a picture that is drawn now was theirs; anything else may have come since
  // and stays.
  if (old) own = old->names.value_or(present);
  for (const std::string& name : present)
    if (!own.contains(name))
      throw Error((shownFolder_ / name).string(),
                  "is in the way of a picture and was not drawn by lyra publish");
  const bool isSame = old && old->text == inStamp;
  const bool stays = inGoesOn && isSame;
  if (!stays)
    for (const std::string& name : own) fs::remove(folder_ / name);
  WriteStamp(inStamp, stays ? own : std::set<std::string>());
  return !inGoesOn || isSame || !old;
}

void PictureStore::Settle(const std::string& inStamp) const {
  std::set<std::string> names = ReadStamp(folder_ / kStampFile).value_or(Stamp()).names.value();
  std::erase_if(names, [&](const std::string& inName) { return !fs::exists(folder_ / inName); });
  WriteStamp(inStamp, names);
}

/// The existing files with names that pictures of these interferences may get.
std::set<std::string> PictureStore::PicturesOf(const std::set<std::string>& inNumbers) const {
  std::set<std::string> names;
  for (const fs::directory_entry& entry : fs::directory_iterator(folder_)) {
    const std::string name = entry.path().filename().string();
    const std::optional<PictureNameParts> parts = PartsOfName(name);
    if (!parts || !inNumbers.contains(parts->number)) continue;
    const std::string& kind = parts->kind;
    if (kind == ending_ || kind == "_product_1" + ending_ || kind == "_product_2" + ending_ ||
        (ending_ == ".png" ? kind.starts_with("_SubItf_") && kind.ends_with(ending_)
                           : kind == ending_ + ".png"))
      names.insert(name);
  }
  return names;
}

void PictureStore::WriteStamp(const std::string& inStamp,
                              const std::set<std::string>& inNames) const {
  ZORFoundation::AtomicFileOptions options;
  options.temporaryFolder = work_.Path();
  ZORFoundation::WriteWholeFile(
      (folder_ / kStampFile).string(),
      inStamp + std::string(kListStart) + ListText({inNames.begin(), inNames.end()}), options);
}

std::string PictureStore::PictureName(int inNumber) const { return Stem(inNumber) + ending_; }

std::string PictureStore::PreviewName(int inNumber, std::size_t inProduct) const {
  return Stem(inNumber) + "_product_" + std::to_string(inProduct + 1) + ending_;
}

std::vector<std::string> PictureStore::ThumbnailNames(int inNumber) const {
  return ThumbnailsIn(folder_, inNumber);
}

// The names follow from that of the main picture: one name for all unless that ends in ".png".
std::vector<std::string> PictureStore::ThumbnailsIn(const fs::path& inFolder, int inNumber) const {
  std::vector<std::string> names;
  if (ending_ != ".png") {
    const std::string only = PictureName(inNumber) + ".png";
    if (HasBytes(inFolder / only)) names.push_back(only);
    return names;
  }
  // A sub-interference without a viewpoint leaves a gap.
  constexpr int kWidestGap = 16;
  for (int i = 1, gap = 0; gap < kWidestGap; ++i) {
    const std::string name = Stem(inNumber) + "_SubItf_" + std::to_string(i) + ".png";
    gap = HasBytes(inFolder / name) ? 0 : gap + 1;
    if (gap == 0) names.push_back(name);
  }
  return names;
}

void PictureStore::Finish(int inNumber) const {
  std::vector<std::string> names = ThumbnailsIn(work_.Path(), inNumber);
  names.push_back(PictureName(inNumber));
  TakeOver(names);
}

void PictureStore::FinishPreview(int inNumber, std::size_t inProduct) const {
  TakeOver({PreviewName(inNumber, inProduct)});
}

// Listed first, so that nothing is there that a later run would take for somebody else's.
void PictureStore::TakeOver(const std::vector<std::string>& inNames) const {
  const fs::path work = work_.Path();
  std::vector<std::string> drawn;
  for (const std::string& name : inNames)
    if (HasBytes(work / name)) drawn.push_back(name);
  const std::string stamp = (folder_ / kStampFile).string();
  const ZORFoundation::Descriptor file = ZORFoundation::OpenForAppending(stamp);
  std::size_t written = 0;
  if (const int error = ZORFoundation::WriteAll(file.Get(), ListText(drawn), written); error != 0)
    throw ZORFoundation::FileError(stamp, error);
  for (const std::string& name : drawn) fs::rename(work / name, folder_ / name);
}

bool PictureStore::Has(const std::string& inName) const { return HasBytes(folder_ / inName); }

std::string PictureStore::Reference(const std::string& inName) const {
  return Has(inName) ? std::string(kPictureFolder) + "/" + inName : "";
}

}  // namespace ZORToolkit
