// Folders of a test's own.
#ifndef ZOR_TESTS_SUPPORT_PLATFORM_FOLDER_H
#define ZOR_TESTS_SUPPORT_PLATFORM_FOLDER_H

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <random>
#include <string>

#include "foundation/NativePath.h"
#include "support/ScopedVariable.h"

namespace support {
/// All the bytes of a file; a test failure when there is none.
inline std::string ReadFile(const std::filesystem::path& inPath) {
  std::ifstream file(inPath, std::ios::binary);
  EXPECT_TRUE(file.is_open()) << inPath;
  return {std::istreambuf_iterator<char>(file), {}};
}
inline std::string ReadFile(const std::string& inPath) {
  return ReadFile(ZORFoundation::NativePath(inPath));
}
inline std::string ReadFile(const char* inPath) { return ReadFile(std::string(inPath)); }

/// What separates folders in a list of them.
#ifdef _WIN32
inline constexpr char kListSeparator[] = ";";
#else
inline constexpr char kListSeparator[] = ":";
#endif

/// A new folder, removed with all that it holds when this ends.
class TemporaryFolder {
 public:
  TemporaryFolder() {
    do path = testing::TempDir() + "zor_" + std::to_string(std::random_device()());
    while (!std::filesystem::create_directory(path));
  }
  ~TemporaryFolder() { std::filesystem::remove_all(path); }
  TemporaryFolder(const TemporaryFolder&) = delete;
  TemporaryFolder& operator=(const TemporaryFolder&) = delete;

  std::string FilePath(const std::string& inName) const {
    return (path / ZORFoundation::NativePath(inName)).string();
  }
  void WriteFile(const std::string& inName, const std::string& inBytes) const {
    const std::filesystem::path file = path / ZORFoundation::NativePath(inName);
    std::filesystem::create_directories(file.parent_path());
    std::ofstream(file, std::ios::binary) << inBytes;
  }

  std::filesystem::path path;
};

/// A folder in which the platform looks first for settings, logical names and message catalogues
/// (English) while it lives.
class PlatformFolder : public TemporaryFolder {
 public:
  void WriteSettings(const std::string& inRepository, const std::string& inToml) const {
    WriteFile(inRepository + ".toml", inToml);
  }
  void WriteLogicalNames(const std::string& inToml) const { WriteSettings("DLNames", inToml); }
  void WriteCatalogue(const std::string& inName, const std::string& inToml) const {
    WriteFile("en/" + inName + ".toml", inToml);
  }
  /// Makes a catalogue unreadable, so that those behind it are not looked at.
  void DamageCatalogue(const std::string& inName) const { WriteCatalogue(inName, "= damaged"); }

 private:
  ScopedVariable settingsPath_{"ZOR_SETTINGS_PATH", path.string()};
  ScopedVariable cataloguePath_{"ZOR_CATALOGUE_PATH", path.string()};
  ScopedVariable language_{"ZOR_LANG", "en"};
};
}  // namespace support

#endif
