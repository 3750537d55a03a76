#include "default_platform/system/TomlFiles.h"

#include <toml++/toml.h>

#include <algorithm>
#include <cerrno>
#include <filesystem>
#include <optional>

#include "foundation/PluginLoader.h"
#include "foundation/TomlNesting.h"
#include "platform/system/ZORGetEnv.h"

namespace ZORDefault {
namespace {

std::optional<TomlValue> IntegersOf(const toml::array& inArray) {
  std::vector<std::int64_t> integers;
  for (const toml::node& element : inArray) {
    const auto* const integer = element.as_integer();
    if (!integer) return std::nullopt;
    integers.push_back(integer->get());
  }
  return integers;
}

std::optional<TomlValue> ValueOf(const toml::node& inNode) {
  if (const auto* const text = inNode.as_string()) return text->get();
  if (const auto* const integer = inNode.as_integer()) return integer->get();
  if (const auto* const number = inNode.as_floating_point()) return number->get();
  if (const auto* const truth = inNode.as_boolean()) return truth->get();
  if (const auto* const array = inNode.as_array()) return IntegersOf(*array);
  return std::nullopt;
}

constexpr bool kIsWindows = std::filesystem::path::preferred_separator == '\\';

/// Between the directories of a list in the environment. On Windows a colon follows a drive's
/// letter.
constexpr char kListSeparator = kIsWindows ? ';' : ':';

std::string_view Variable(const char* inName) {
  const char* const value = ZORGetEnv(inName);
  return value ? value : "";
}

// Empty parts are no directories: "a::b" is a and b where the colon separates.
void AppendList(std::string_view inList, std::vector<std::string>& ioDirectories) {
  while (!inList.empty()) {
    const std::size_t end = std::min(inList.find(kListSeparator), inList.size());
    if (end > 0) ioDirectories.emplace_back(inList.substr(0, end));
    inList.remove_prefix(std::min(end + 1, inList.size()));
  }
}

// The library lies in lib or, on some systems, in a folder of lib for the processor's kind.
std::string FindInstalledResources() {
  const std::string libraries = ZORFoundation::LibraryDirectory();
  for (const char* const up : {"/../share/ZORLyra", "/../../share/ZORLyra"}) {
    if (ZORFoundation::StampOfFile(libraries + up)) return libraries + up;
  }
  return libraries + "/../share/ZORLyra";
}

const std::string& InstalledResources() {
  static const std::string directory = FindInstalledResources();
  return directory;
}

// The user's own settings; empty when there is no place for them. Elsewhere than on Windows by the
// rules of XDG base directories: a relative path in XDG_CONFIG_HOME is ignored.
std::string UserSettingDirectory() {
  const std::string_view configuration = Variable(kIsWindows ? "APPDATA" : "XDG_CONFIG_HOME");
  if (kIsWindows ? !configuration.empty() : configuration.starts_with('/'))
    return std::string(configuration) + "/zorlyra";
  const std::string_view home = kIsWindows ? "" : Variable("HOME");
  return home.empty() ? std::string() : std::string(home) + "/.config/zorlyra";
}

std::vector<std::string> SettingDirectories() {
  std::vector<std::string> directories;
  AppendList(Variable("ZOR_SETTINGS_PATH"), directories);
  if (std::string own = UserSettingDirectory(); !own.empty()) directories.push_back(std::move(own));
  directories.push_back(InstalledResources() + "/settings");
  return directories;
}

// Whether a name can be that of one file in a directory, and of none outside.
bool IsFileName(std::string_view inName) {
  return !inName.empty() && inName.front() != '.' &&
         inName.find_first_of("/\\") == std::string_view::npos;
}

FileCache<TomlTable>& SettingFiles() {
  static auto* const files = new FileCache<TomlTable>(&ParseToml);
  return *files;
}

}  // namespace

std::optional<ZORFoundation::WholeFile> ReadUnlessUnreadable(const std::string& inPath) {
  try {
    ZORFoundation::ReadOptions options;
    options.maxSize = std::uint64_t{64} << 20;
    return ZORFoundation::ReadWholeFile(inPath, options);
  } catch (const ZORFoundation::FileError& error) {
    switch (error.Code()) {
      case EMFILE:
      case ENFILE:
      case ENOMEM:
      case EIO:
        throw;
      default:
        return std::nullopt;
    }
  }
}

std::shared_ptr<const TomlTable> ParseToml(std::string_view inText) {
  if (ZORFoundation::FindTooDeepToml(inText)) return nullptr;
  try {
    auto table = std::make_shared<TomlTable>();
    for (const auto& [key, node] : toml::parse(inText))
      if (auto value = ValueOf(node)) table->emplace(std::string(key.str()), *std::move(value));
    return table;
  } catch (const toml::parse_error&) {
    return nullptr;
  }
}

std::vector<std::string> CatalogueDirectories() {
  std::vector<std::string> directories;
  AppendList(Variable("ZOR_CATALOGUE_PATH"), directories);
  directories.push_back(InstalledResources() + "/catalogues");
  return directories;
}

std::vector<std::string> TomlCandidates(const std::vector<std::string>& inDirectories,
                                        std::string_view inFolder, std::string_view inName) {
  std::vector<std::string> paths;
  if (!IsFileName(inName)) return paths;
  for (const std::string& directory : inDirectories)
    paths.push_back(
        std::string(directory).append("/").append(inFolder).append(inName).append(".toml"));
  return paths;
}

std::shared_ptr<const TomlTable> ReadSettingFile(std::string_view inFolder,
                                                 std::string_view inName) {
  return SettingFiles().GetFirst(TomlCandidates(SettingDirectories(), inFolder, inName));
}

}  // namespace ZORDefault
