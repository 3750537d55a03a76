#include "default_platform/product_structure/ModelCache.h"

#include <cstring>
#include <filesystem>

#include "default_platform/product_structure/ModelData.h"
#include "foundation/AtomicFile.h"
#include "foundation/Hash.h"
#include "foundation/ReadWholeFile.h"
#include "platform/system/ZORGetEnv.h"

namespace ZORDefault {
namespace {

namespace fs = std::filesystem;

/// What an entry begins with; the model's bytes follow.
struct EntryHeader {
  char mark[8] = {'Z', 'O', 'R', 'M', 'O', 'D', 'E', 'L'};
  std::uint64_t size = 0;             // of the bytes that follow
  std::uint64_t checksum = 0;         // of the bytes that follow and of referencedFiles
  std::uint64_t referencedFiles = 0;  // of the content of the other files
};

std::string CacheDirectory() {
  const char* const cache = ZORGetEnv("XDG_CACHE_HOME");
  if (cache && *cache == '/') return std::string(cache) + "/zorlyra";
  const char* const home = ZORGetEnv("HOME");
  return home && *home == '/' ? std::string(home) + "/.cache/zorlyra" : std::string();
}

/// The hash of the model's bytes and of all else that decides what is read.
std::string EntryName(std::string_view inBytes, const ModelRequest& inRequest) {
  ZORFoundation::Hash128 hash;
  hash.Add(std::uint64_t{kModelCodecVersion});
  hash.Add(static_cast<std::uint64_t>(inRequest.format));
  hash.Add(inRequest.deflection);
  hash.AddText(inBytes);
  return ZORFoundation::HexText(hash.Get()) + ".model";
}

std::uint64_t HashOfFiles(const std::string& inFolder, const std::vector<std::string>& inFiles) {
  ZORFoundation::Hash64 hash;
  for (const std::string& name : inFiles) {
    const auto file = ZORFoundation::TryReadWholeFile((fs::path(inFolder) / name).string());
    hash.Add(std::uint64_t{file.has_value()});
    hash.AddText(file ? file->bytes : std::string());
  }
  return hash.Get();
}

std::uint64_t ChecksumOf(std::string_view inModel, std::uint64_t inReferencedFiles) {
  return ZORFoundation::Hash64Of(inModel, inReferencedFiles);
}

bool IsWholeEntry(const std::string& inEntry, EntryHeader& outHeader) {
  if (inEntry.size() < sizeof(EntryHeader)) return false;
  const EntryHeader expected;
  std::memcpy(&outHeader, inEntry.data(), sizeof(EntryHeader));
  const std::string_view model = std::string_view(inEntry).substr(sizeof(EntryHeader));
  return std::memcmp(outHeader.mark, expected.mark, sizeof expected.mark) == 0 &&
         outHeader.size == model.size() &&
         outHeader.checksum == ChecksumOf(model, outHeader.referencedFiles);
}

/// Other processes see the old entry or the new one. It is checked when it is read, so it need not
/// be on the disk yet.
void WriteEntry(const std::string& inPath, const EntryHeader& inHeader,
                const std::string& inModel) {
  try {
    fs::create_directories(fs::path(inPath).parent_path());
    ZORFoundation::AtomicFile file(inPath, {.isSynchronised = false});
    file.Write({reinterpret_cast<const char*>(&inHeader), sizeof inHeader});
    file.Write(inModel);
    file.Commit();
  } catch (const std::runtime_error&) {
    // A model that is not kept is read again.
  }
}

}  // namespace

ModelCache::ModelCache(std::string_view inBytes, const ModelRequest& inRequest)
    : folder_(fs::path(inRequest.path).parent_path().string()), path_(CacheDirectory()) {
  if (!path_.empty()) path_ += '/' + EntryName(inBytes, inRequest);
}

ModelCache::Finding ModelCache::Load(ModelData& outModel) const {
  const auto file = ZORFoundation::TryReadWholeFile(path_);
  if (!file) return Finding::kNone;
  const std::string& entry = file->bytes;
  EntryHeader header;
  ModelData model;
  if (!IsWholeEntry(entry, header) ||
      !DecodeModel(std::string_view(entry).substr(sizeof header), model))
    return Finding::kDamaged;
  if (header.referencedFiles != HashOfFiles(folder_, model.referencedFiles)) return Finding::kNone;
  outModel = std::move(model);
  return Finding::kFound;
}

void ModelCache::Store(const ModelData& inModel) const {
  if (path_.empty()) return;
  const std::string model = EncodeModel(inModel);
  EntryHeader header;
  header.size = model.size();
  header.referencedFiles = HashOfFiles(folder_, inModel.referencedFiles);
  header.checksum = ChecksumOf(model, header.referencedFiles);
  WriteEntry(path_, header, model);
}

}  // namespace ZORDefault
