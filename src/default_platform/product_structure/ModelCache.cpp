#include "default_platform/product_structure/ModelCache.h"

#define XXH_INLINE_ALL
#include <xxhash.h>

#include <cstdio>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <random>

#include "default_platform/product_structure/ModelData.h"
#include "default_platform/system/SystemFiles.h"
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
  char recipe[96];
  std::snprintf(recipe, sizeof recipe, "%u %d %.17g %zu", kModelCodecVersion,
                static_cast<int>(inRequest.format), inRequest.deflection, inBytes.size());
  const XXH128_hash_t bytes = XXH3_128bits(inBytes.data(), inBytes.size());
  const XXH128_hash_t hash = XXH3_128bits_withSeed(recipe, std::strlen(recipe), bytes.low64);
  char name[64];
  std::snprintf(name, sizeof name, "%016llx%016llx.model",
                static_cast<unsigned long long>(hash.high64 ^ bytes.high64),
                static_cast<unsigned long long>(hash.low64 ^ bytes.low64));
  return name;
}

std::uint64_t HashOfFiles(const std::string& inFolder, const std::vector<std::string>& inFiles) {
  std::uint64_t hash = 0;
  for (const std::string& file : inFiles) {
    std::string content;
    FileStamp stamp;
    const bool isThere = ReadFile((fs::path(inFolder) / file).string(), content, stamp);
    hash = XXH3_64bits_withSeed(content.data(), content.size(), hash + (isThere ? 1 : 2));
  }
  return hash;
}

std::uint64_t ChecksumOf(std::string_view inModel, std::uint64_t inReferencedFiles) {
  return XXH3_64bits_withSeed(inModel.data(), inModel.size(), inReferencedFiles);
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

/// Writes beside the place and renames, so that other processes see the old entry or the new one.
void WriteEntry(const std::string& inPath, const EntryHeader& inHeader,
                const std::string& inModel) {
  std::error_code error;
  fs::create_directories(fs::path(inPath).parent_path(), error);
  const std::string besides = inPath + "." + std::to_string(std::random_device()()) + ".tmp";
  std::ofstream file(besides, std::ios::binary);
  file.write(reinterpret_cast<const char*>(&inHeader), sizeof inHeader);
  file.write(inModel.data(), static_cast<std::streamsize>(inModel.size()));
  file.close();
  if (file) fs::rename(besides, inPath, error);
  if (!file || error) fs::remove(besides, error);
}

}  // namespace

ModelCache::ModelCache(std::string_view inBytes, const ModelRequest& inRequest)
    : folder_(fs::path(inRequest.path).parent_path().string()), path_(CacheDirectory()) {
  if (!path_.empty()) path_ += '/' + EntryName(inBytes, inRequest);
}

ModelCache::Finding ModelCache::Load(ModelData& outModel) const {
  std::string entry;
  FileStamp stamp;
  if (path_.empty() || !ReadFile(path_, entry, stamp)) return Finding::kNone;
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
