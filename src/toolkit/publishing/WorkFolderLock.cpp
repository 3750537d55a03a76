// The lock of a work folder, by flock; WorkFolderLockWindows.cpp takes this file's place on Windows.
#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <chrono>
#include <thread>

#include "foundation/Descriptor.h"
#include "toolkit/Error.h"
#include "toolkit/publishing/WorkFolder.h"

namespace fs = std::filesystem;

namespace ZORToolkit {
namespace {

/// Whoever ends removes the lock, so a file that was locked may be no longer the one of its name.
bool IsStillThere(int inDescriptor, const std::string& inPath) {
  struct stat here {
  }, there{};
  return fstat(inDescriptor, &here) == 0 && stat(inPath.c_str(), &there) == 0 &&
         here.st_ino == there.st_ino && here.st_dev == there.st_dev;
}

}  // namespace

void WorkFolder::RemoveFolder() {
  unlink(lockPath_.c_str());  // while it is locked
  rmdir(path_.c_str());
}

// Waits a moment, since the drawing processes of one that was killed end a little after it.
void WorkFolder::Lock(const fs::path& inFolder) {
  using Clock = std::chrono::steady_clock;
  const auto end = Clock::now() + std::chrono::milliseconds(500);
  for (;; std::this_thread::sleep_for(std::chrono::milliseconds(10))) {
    fs::create_directory(path_);
    lock_ = ZORFoundation::Descriptor(
        open(lockPath_.c_str(), O_RDWR | O_CREAT | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK, 0666));
    const bool isLocked = lock_.IsOpen() && flock(lock_.Get(), LOCK_EX | LOCK_NB) == 0;
    if (isLocked && IsStillThere(lock_.Get(), lockPath_)) return;
    // A shared file system may have no locks; then the scheduler keeps two runs apart.
    if (!isLocked && (errno == ENOLCK || errno == EOPNOTSUPP)) return;
    if (!isLocked && errno != EWOULDBLOCK && errno != ENOENT)
      throw ZORFoundation::FileError(lockPath_, errno);
    if (Clock::now() > end)
      throw Error(inFolder.string(), "another lyra publishes into this folder");
  }
}

}  // namespace ZORToolkit
