// What was made from files, kept for as long as the files do not change.
#ifndef ZOR_DEFAULT_PLATFORM_SYSTEM_FILECACHE_H
#define ZOR_DEFAULT_PLATFORM_SYSTEM_FILECACHE_H

#include <memory>
#include <mutex>
#include <string>
#include <string_view>
#include <unordered_map>

#include "default_platform/system/SystemFiles.h"

namespace ZORDefault {

/// Gives what a file's content means, reading it only when its stamp is another than at the last
/// reading. A file that was written so shortly before it was read that a second change might bear
/// the same time is read again until it has settled.
template <class Content>
class FileCache {
 public:
  using Pointer = std::shared_ptr<const Content>;
  using Reader = Pointer (*)(std::string_view inText);

  explicit FileCache(Reader inReader) : reader_(inReader) {}

  /// @param inStamp the stamp that the file has now.
  /// @return null when the file cannot be read or means nothing.
  Pointer Get(const std::string& inPath, const FileStamp& inStamp) {
    const std::lock_guard lock(mutex_);
    Entry& entry = entries_[inPath];
    if (!entry.isSettled || !(entry.stamp == inStamp)) Read(inPath, entry);
    return entry.content;
  }

 private:
  struct Entry {
    FileStamp stamp;
    bool isSettled = false;
    Pointer content;
  };

  void Read(const std::string& inPath, Entry& outEntry) {
    constexpr std::int64_t kSettlingTime = 50'000'000;  // some ticks of a file system's clock
    outEntry = Entry();
    std::string text;
    const std::int64_t now = FileClockNow();
    if (!ReadFile(inPath, text, outEntry.stamp)) return;
    outEntry.isSettled = outEntry.stamp.changed + kSettlingTime < now;
    outEntry.content = reader_(text);
  }

  Reader reader_;
  std::mutex mutex_;
  std::unordered_map<std::string, Entry> entries_;
};

}  // namespace ZORDefault

#endif
