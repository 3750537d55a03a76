// Settings and message catalogues: where their TOML files are searched for, and a cache of them.
#ifndef ZOR_DEFAULT_PLATFORM_SYSTEM_TOMLFILES_H
#define ZOR_DEFAULT_PLATFORM_SYSTEM_TOMLFILES_H

#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <variant>
#include <vector>

#include "foundation/ReadWholeFile.h"

namespace ZORDefault {

/// The value of one entry.
using TomlValue = std::variant<std::string, std::int64_t, double, bool, std::vector<std::int64_t>>;

/// The entries at the top of a file, by key. Entries of other kinds (tables, dates, mixed arrays)
/// are left out.
using TomlTable = std::map<std::string, TomlValue, std::less<>>;

/// @return the entries, or null when the text is not TOML.
std::shared_ptr<const TomlTable> ParseToml(std::string_view inText);

/// Directories of message catalogues, the first to be looked into first, from the environment as it
/// is now; below each there is a folder for each language.
std::vector<std::string> CatalogueDirectories();

/// NAME.toml in a folder ("" or "system/") of each directory in turn; none for a name that is not
/// that of one file in a directory.
std::vector<std::string> TomlCandidates(const std::vector<std::string>& inDirectories,
                                        std::string_view inFolder, std::string_view inName);
/// The entries of the first NAME.toml among the setting directories; null when there is none or it
/// is damaged.
std::shared_ptr<const TomlTable> ReadSettingFile(std::string_view inFolder,
                                                 std::string_view inName);

/// @return nothing for a file that is missing, not regular, too large or not for this user. Raises
/// FileError for other reasons.
std::optional<ZORFoundation::WholeFile> ReadUnlessUnreadable(const std::string& inPath);

/// Caches the parsed content of files, reading one again only when its stamp has changed. A file
/// written so recently that a second change could carry the same time is read again until it has
/// settled.
template <class Content>
class FileCache {
 public:
  using Pointer = std::shared_ptr<const Content>;
  using Reader = Pointer (*)(std::string_view inText);

  explicit FileCache(Reader inReader) : reader_(inReader) {}

  /// The content of the first of these files that exists now.
  /// @return null when there is none, or it cannot be read or parsed. Raises FileError when the
  /// system is short of what reading takes: what the file says is not known then.
  Pointer GetFirst(const std::vector<std::string>& inPaths) {
    for (const std::string& path : inPaths)
      if (const auto stamp = ZORFoundation::StampOfFile(path)) return Get(path, *stamp);
    return nullptr;
  }

 private:
  struct Entry {
    ZORFoundation::FileStamp stamp;
    bool isSettled = false;
    Pointer content;
  };

  Pointer Get(const std::string& inPath, const ZORFoundation::FileStamp& inStamp) {
    const std::lock_guard lock(mutex_);
    if (last_ == nullptr || last_->first != inPath) last_ = &*entries_.try_emplace(inPath).first;
    Entry& entry = last_->second;
    if (!entry.isSettled || entry.stamp != inStamp) Read(inPath, entry);
    return entry.content;
  }

  void Read(const std::string& inPath, Entry& outEntry) {
    constexpr std::int64_t kSettlingTime = 50'000'000;  // some ticks of a file system's clock
    outEntry = Entry();
    const std::int64_t now = ZORFoundation::FileClockNow();
    const auto file = ReadUnlessUnreadable(inPath);
    if (!file) return;
    outEntry.stamp = file->before;
    outEntry.isSettled = file->IsConsistent() && file->before.changed + kSettlingTime < now;
    outEntry.content = reader_(file->bytes);
  }

  Reader reader_;
  std::mutex mutex_;
  std::unordered_map<std::string, Entry> entries_;
  std::pair<const std::string, Entry>* last_ = nullptr;  // mostly asked for again
};

}  // namespace ZORDefault

#endif
