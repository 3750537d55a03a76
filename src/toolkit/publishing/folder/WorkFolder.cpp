#include "toolkit/publishing/folder/WorkFolder.h"

#include <chrono>
#include <thread>
#include <vector>

#include "foundation/NativePath.h"
#include "toolkit/Error.h"

namespace fs = std::filesystem;

namespace ZORToolkit {
namespace {

constexpr char kWorkFolder[] = ".lyra-unfinished";
constexpr char kLockFile[] = "lock";

}  // namespace

WorkFolder::WorkFolder(const fs::path& inFolder)
    : path_(fs::absolute(inFolder / kWorkFolder).string()), lockPath_(path_ + "/" + kLockFile) {
  fs::create_directories(inFolder);
  Lock(inFolder);
  removeLock_.emplace(lockPath_.c_str());
  removeFolder_.emplace(path_.c_str());
  try {
    RemoveFiles();
  } catch (const std::exception&) {
    RemoveFolder();
    throw;
  }
}

WorkFolder::~WorkFolder() {
  try {
    RemoveFiles();
  } catch (const std::exception&) {
    // The next run tries again.
  }
  RemoveFolder();
}

// Waits a moment, since the processes of a publication that was killed end a little after it.
void WorkFolder::Lock(const fs::path& inFolder) {
  using Clock = std::chrono::steady_clock;
  const auto end = Clock::now() + std::chrono::milliseconds(500);
  for (;; std::this_thread::sleep_for(std::chrono::milliseconds(10))) {
    fs::create_directory(ZORFoundation::NativePath(path_));
    if (TryLock()) return;
    if (Clock::now() > end)
      throw Error(inFolder.string(), "another lyra publishes into this folder");
  }
}

void WorkFolder::RemoveFiles() const {
  std::vector<fs::path> files;
  for (const fs::directory_entry& entry : fs::directory_iterator(ZORFoundation::NativePath(path_)))
    if (entry.path() != ZORFoundation::NativePath(lockPath_)) files.push_back(entry.path());
  for (const fs::path& file : files) fs::remove(file);
}

}  // namespace ZORToolkit
