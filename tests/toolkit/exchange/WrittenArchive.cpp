#include "toolkit/exchange/WrittenArchive.h"

#include <gtest/gtest.h>
#include <zip.h>

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <sstream>

std::string WriteArchive(const std::string& inName, const Entries& inEntries, bool inIsEncrypted) {
  const std::string path = testing::TempDir() + inName;
  std::remove(path.c_str());
  zip_t* const archive = zip_open(path.c_str(), ZIP_CREATE | ZIP_TRUNCATE, nullptr);
  for (const auto& [name, bytes] : inEntries) {
    zip_source_t* const source = zip_source_buffer(archive, bytes.data(), bytes.size(), 0);
    const zip_int64_t place = zip_file_add(archive, name.c_str(), source, ZIP_FL_ENC_UTF_8);
    EXPECT_GE(place, 0) << name;
    if (inIsEncrypted)
      zip_file_set_encryption(archive, static_cast<zip_uint64_t>(place), ZIP_EM_AES_256, "secret");
  }
  EXPECT_EQ(zip_close(archive), 0) << zip_strerror(archive);
  return path;
}

std::string WriteBytes(const std::string& inName, const std::string& inBytes) {
  const std::string path = testing::TempDir() + inName;
  std::ofstream(path, std::ios::binary) << inBytes;
  return path;
}

std::string ReadBytes(const std::string& inPath) {
  std::ostringstream bytes;
  bytes << std::ifstream(inPath, std::ios::binary).rdbuf();
  return bytes.str();
}

std::map<std::string, std::string> ReadArchive(const std::string& inPath) {
  std::map<std::string, std::string> entries;
  zip_t* const archive = zip_open(inPath.c_str(), ZIP_RDONLY, nullptr);
  EXPECT_NE(archive, nullptr) << inPath;
  if (archive == nullptr) return entries;
  for (zip_int64_t i = 0; i < zip_get_num_entries(archive, 0); ++i) {
    zip_stat_t about;
    const auto place = static_cast<zip_uint64_t>(i);
    zip_stat_index(archive, place, 0, &about);
    std::string bytes(about.size, '\0');
    zip_file_t* const file = zip_fopen_index(archive, place, 0);
    zip_fread(file, bytes.data(), bytes.size());
    zip_fclose(file);
    entries[about.name] = bytes;
  }
  zip_discard(archive);
  return entries;
}

std::string OfficialFolder() {
  const std::string folder = ZOR_SOURCE_DIR "/../shared/data/bcf";
  return std::filesystem::exists(folder) ? folder : "";
}
