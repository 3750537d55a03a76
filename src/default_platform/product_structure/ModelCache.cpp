#include "default_platform/product_structure/ModelCache.h"

#include <cstdio>
#include <cstring>
#include <filesystem>
#include <optional>

#include "foundation/AtomicFile.h"
#include "foundation/Descriptor.h"
#include "foundation/Hash.h"
#include "foundation/ReadWholeFile.h"
#include "platform/system/ZORGetEnv.h"

namespace ZORDefault {
namespace {

namespace fs = std::filesystem;

/// What an entry begins with; the encoded model follows.
struct EntryHeader {
  char mark[8] = {'Z', 'O', 'R', 'M', 'O', 'D', 'E', 'L'};
  std::uint64_t size = 0;      // of the bytes that follow
  std::uint64_t checksum = 0;  // of the bytes that follow
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
  hash.AddText(inBytes);
  hash.Add(std::uint64_t{kModelCodecVersion});
  hash.Add(static_cast<std::uint64_t>(inRequest.format));
  hash.Add(inRequest.deflection);
  return ZORFoundation::HexText(hash.Get()) + ".model";
}

/// Whether a referenced file is as it was when the model was read.
bool IsUnchanged(const ReferencedFile& inFile, const fs::path& inFolder) {
  const fs::path path = inFolder / inFile.name;
  std::error_code error;
  switch (inFile.state) {
    case ReferencedFile::State::kRead: {
      const auto whole = ZORFoundation::TryReadWholeFile(path.string());
      return whole && ZORFoundation::Hash64Of(whole->bytes) == inFile.hash;
    }
    case ReferencedFile::State::kMissing:
      return !fs::exists(path, error);
    case ReferencedFile::State::kUnread:
    case ReferencedFile::State::kRefused:
      return fs::exists(path, error);
  }
  return false;
}

bool IsWholeEntry(const std::string& inEntry) {
  if (inEntry.size() < sizeof(EntryHeader)) return false;
  const EntryHeader expected;
  EntryHeader header;
  std::memcpy(&header, inEntry.data(), sizeof header);
  const std::string_view model = std::string_view(inEntry).substr(sizeof header);
  return std::memcmp(header.mark, expected.mark, sizeof expected.mark) == 0 &&
         header.size == model.size() && header.checksum == ZORFoundation::Hash64Of(model);
}

}  // namespace

ModelCache::ModelCache(std::string_view inBytes, const ModelRequest& inRequest)
    : folder_(fs::path(inRequest.path).parent_path().string()), path_(CacheDirectory()) {
  if (!path_.empty()) path_ += '/' + EntryName(inBytes, inRequest);
}

ModelCache::Lookup ModelCache::Load(ModelData& outModel) const {
  const auto entry = path_.empty() ? std::nullopt : ZORFoundation::TryReadWholeFile(path_);
  if (!entry) return Lookup::kMiss;
  ModelData model;
  if (!IsWholeEntry(entry->bytes) ||
      !DecodeModel(std::string_view(entry->bytes).substr(sizeof(EntryHeader)), model))
    return Lookup::kDamaged;
  for (const ReferencedFile& file : model.referencedFiles)
    if (!IsUnchanged(file, folder_)) return Lookup::kMiss;
  outModel = std::move(model);
  return Lookup::kHit;
}

void ModelCache::Store(std::string_view inEncodedModel) const {
  if (path_.empty()) return;
  EntryHeader header;
  header.size = inEncodedModel.size();
  header.checksum = ZORFoundation::Hash64Of(inEncodedModel);
  try {
    fs::create_directories(fs::path(path_).parent_path());
    ZORFoundation::AtomicFileOptions options;
    options.isSynchronised = false;
    ZORFoundation::AtomicFile file(path_, options);
    file.Write({reinterpret_cast<const char*>(&header), sizeof header});
    file.Write(inEncodedModel);
    file.Commit();
  } catch (const std::runtime_error&) {
    // Without an entry the model is read again the next time.
  }
}

}  // namespace ZORDefault
