// The lock of a work folder, by flock.
#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>

#include "foundation/Descriptor.h"
#include "toolkit/publishing/folder/WorkFolder.h"

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

/// @return false when another process has the lock, or may have removed it.
bool WorkFolder::TryLock() {
  lock_ = ZORFoundation::Descriptor(
      open(lockPath_.c_str(), O_RDWR | O_CREAT | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK, 0666));
  if (lock_.IsOpen() && flock(lock_.Get(), LOCK_EX | LOCK_NB) == 0)
    return IsStillThere(lock_.Get(), lockPath_);
  // A shared file system may have no locks; then the scheduler keeps two runs apart.
  if (errno == ENOLCK || errno == EOPNOTSUPP) return true;
  if (errno != EWOULDBLOCK && errno != ENOENT) throw ZORFoundation::FileError(lockPath_, errno);
  return false;
}

}  // namespace ZORToolkit
