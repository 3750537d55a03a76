#include "toolkit/exchange/WrittenArchive.h"

#include <gtest/gtest.h>
#include <zip.h>

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <initializer_list>
#include <sstream>

#include "foundation/NativePath.h"

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

// Byte by byte (APPNOTE.TXT of the format, 4.3): libzip takes a second for so many.
std::string WriteEmptyEntries(const std::string& inName, std::size_t inCount) {
  std::string entries, directory;
  const auto add = [](std::string& ioBytes, std::uint64_t inNumber, int inSize) {
    for (int i = 0; i < inSize; ++i) ioBytes += static_cast<char>(inNumber >> (8 * i) & 0xFF);
  };
  const auto addAbout = [&](std::string& ioBytes, std::size_t inNameSize) {
    add(ioBytes, 20, 2);  // the version, then flags and method
    add(ioBytes, 0, 4);
    add(ioBytes, 0x00210000, 4);  // 1 January 1980, then checksum and sizes
    add(ioBytes, 0, 12);
    add(ioBytes, inNameSize, 2);
  };
  for (std::size_t i = 0; i < inCount; ++i) {
    const std::string name = std::to_string(i);
    add(directory, 0x02014b50, 4);
    add(directory, 20, 2);
    addAbout(directory, name.size());
    add(directory, 0, 12);
    add(directory, entries.size(), 4);
    directory += name;
    add(entries, 0x04034b50, 4);
    addAbout(entries, name.size());
    add(entries, 0, 2);
    entries += name;
  }
  const std::size_t start = entries.size();
  entries += directory;
  const std::size_t end = entries.size();
  const auto addAll = [&](std::initializer_list<std::pair<std::uint64_t, int>> inNumbers) {
    for (const auto& [number, size] : inNumbers) add(entries, number, size);
  };
  addAll({{0x06064b50, 4}, {44, 8}, {45, 2}, {45, 2}, {0, 8}, {inCount, 8}, {inCount, 8}});
  addAll({{directory.size(), 8}, {start, 8}});
  addAll({{0x07064b50, 4}, {0, 4}, {end, 8}, {1, 4}});
  addAll({{0x06054b50, 4}, {0, 4}, {~0U, 4}, {~0U, 4}, {~0U, 4}, {0, 2}});
  return WriteBytes(inName, entries);
}

std::string WriteBytes(const std::string& inName, const std::string& inBytes) {
  const std::string path = testing::TempDir() + inName;
  std::ofstream(path, std::ios::binary) << inBytes;
  return path;
}

std::string ReadBytes(const std::string& inPath) {
  std::ostringstream bytes;
  bytes << std::ifstream(ZORFoundation::NativePath(inPath), std::ios::binary).rdbuf();
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
