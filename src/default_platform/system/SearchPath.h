// Where settings and catalogues are looked for.
#ifndef ZOR_DEFAULT_PLATFORM_SYSTEM_SEARCHPATH_H
#define ZOR_DEFAULT_PLATFORM_SYSTEM_SEARCHPATH_H

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "default_platform/system/SystemFiles.h"
#include "default_platform/system/TomlTable.h"

namespace ZORDefault {

/// A file that was found, and the stamp that it had then.
struct FoundFile {
  std::string path;
  FileStamp stamp;
};

/// Directories of settings, the first to be looked into first. Made from the environment now.
std::vector<std::string> SettingDirectories();

/// The same for message catalogues; below each there is a folder for each language.
std::vector<std::string> CatalogueDirectories();

/// @return true when a name can be that of one file in a directory, and of none outside.
bool IsFileName(std::string_view inName);

/// Looks for NAME.toml in a folder ("" or "system/") of each directory in turn.
bool FindToml(const std::vector<std::string>& inDirectories, std::string_view inFolder,
              std::string_view inName, FoundFile& outFile);

/// The entries of the first NAME.toml among the setting directories; null when there is none or it
/// is damaged.
std::shared_ptr<const TomlTable> ReadSettingFile(std::string_view inFolder,
                                                 std::string_view inName);

}  // namespace ZORDefault

#endif
