#include "default_platform/system/SearchPath.h"

#include <algorithm>

#include "default_platform/system/FileCache.h"
#include "platform/system/ZORGetEnv.h"

namespace ZORDefault {
namespace {

std::string_view Variable(const char* inName) {
  const char* const value = ZORGetEnv(inName);
  return value ? value : "";
}

// Empty parts are no directories: "a::b" is a and b.
void AppendList(std::string_view inList, std::vector<std::string>& ioDirectories) {
  while (!inList.empty()) {
    const std::size_t colon = std::min(inList.find(':'), inList.size());
    if (colon > 0) ioDirectories.emplace_back(inList.substr(0, colon));
    inList.remove_prefix(std::min(colon + 1, inList.size()));
  }
}

void AppendUserDirectory(std::vector<std::string>& ioDirectories) {
  const std::string_view configuration = Variable("XDG_CONFIG_HOME");
  const std::string_view home = Variable("HOME");
  // The rules of XDG base directories: a relative path here is ignored.
  if (!configuration.empty() && configuration.front() == '/')
    ioDirectories.push_back(std::string(configuration) + "/zorlyra");
  else if (!home.empty())
    ioDirectories.push_back(std::string(home) + "/.config/zorlyra");
}

// The library lies in lib or, on some systems, in a folder of lib for the processor's kind.
std::string FindInstalledResources() {
  const std::string libraries = LibraryDirectory();
  for (const char* const up : {"/../share/ZORLyra", "/../../share/ZORLyra"}) {
    FileStamp stamp;
    if (ReadStamp(libraries + up, stamp)) return libraries + up;
  }
  return libraries + "/../share/ZORLyra";
}

const std::string& InstalledResources() {
  static const std::string directory = FindInstalledResources();
  return directory;
}

FileCache<TomlTable>& SettingFiles() {
  static auto* const files = new FileCache<TomlTable>(&ParseToml);
  return *files;
}

}  // namespace

std::vector<std::string> SettingDirectories() {
  std::vector<std::string> directories;
  AppendList(Variable("ZOR_SETTINGS_PATH"), directories);
  AppendUserDirectory(directories);
  directories.push_back(InstalledResources() + "/settings");
  return directories;
}

std::vector<std::string> CatalogueDirectories() {
  std::vector<std::string> directories;
  AppendList(Variable("ZOR_CATALOGUE_PATH"), directories);
  directories.push_back(InstalledResources() + "/catalogues");
  return directories;
}

bool IsFileName(std::string_view inName) {
  return !inName.empty() && inName.front() != '.' &&
         inName.find_first_of("/\\") == std::string_view::npos;
}

bool FindToml(const std::vector<std::string>& inDirectories, std::string_view inFolder,
              std::string_view inName, FoundFile& outFile) {
  if (!IsFileName(inName)) return false;
  for (const std::string& directory : inDirectories) {
    outFile.path.assign(directory).append("/").append(inFolder).append(inName).append(".toml");
    if (ReadStamp(outFile.path, outFile.stamp)) return true;
  }
  return false;
}

std::shared_ptr<const TomlTable> ReadSettingFile(std::string_view inFolder,
                                                 std::string_view inName) {
  FoundFile file;
  if (!FindToml(SettingDirectories(), inFolder, inName, file)) return nullptr;
  return SettingFiles().Get(file.path, file.stamp);
}

}  // namespace ZORDefault
