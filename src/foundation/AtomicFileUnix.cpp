#include <fcntl.h>
#include <stdio.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <filesystem>
#include <vector>

#include "foundation/AtomicFile.h"

namespace fs = std::filesystem;

namespace ZORFoundation {
namespace {

/// @return whether the new file has all of them.
bool CopyExtendedAttributes(int inFrom, int inTo) {
  const ssize_t size = flistxattr(inFrom, nullptr, 0);
  if (size <= 0) return true;
  bool isComplete = true;
  std::string names(static_cast<std::size_t>(size), '\0');
  names.resize(static_cast<std::size_t>(
      std::max<ssize_t>(0, flistxattr(inFrom, names.data(), names.size()))));
  for (std::size_t start = 0; start < names.size();) {
    const char* const name = names.data() + start;
    start = names.find('\0', start) + 1;
    // Granted to the old content, not to whatever replaces it, or given by the system's policy.
    if (std::string_view(name).starts_with("security.")) continue;
    const ssize_t count = std::max<ssize_t>(0, fgetxattr(inFrom, name, nullptr, 0));
    std::vector<char> value(static_cast<std::size_t>(count));
    isComplete = fgetxattr(inFrom, name, value.data(), value.size()) == count &&
                 fsetxattr(inTo, name, value.data(), value.size(), 0) == 0 && isComplete;
  }
  return isComplete;
}

}  // namespace

std::string AtomicFile::FollowLinks(const std::string& inPath) {
  constexpr int kMaxLinks = 40;  // as many as Linux follows
  fs::path path = inPath;
  for (int i = 0; i < kMaxLinks; ++i) {
    std::error_code error;
    const fs::path link = fs::read_symlink(path, error);
    if (error) return path.string();
    path = path.parent_path() / link;
  }
  throw FileError(inPath, ELOOP);
}

void AtomicFile::CheckTarget() {
  struct stat status {};
  isNew_ = stat(target_.c_str(), &status) != 0;
  if (isNew_) {
    if (errno != ENOENT || target_.empty()) throw FileError(path_, errno);
    return;
  }
  if (!options_.mayReplace) throw FileError(path_, EEXIST);
  if (S_ISDIR(status.st_mode)) throw FileError(path_, EISDIR);
  if (access(target_.c_str(), W_OK) != 0) throw FileError(path_, errno);
  isStream_ = !S_ISREG(status.st_mode);
}

/// @return false when the new file cannot have all that the old one has.
bool AtomicFile::KeepAttributes(int inDescriptor) const {
  const ZORFoundation::Descriptor old(open(target_.c_str(), O_PATH | O_CLOEXEC));
  struct stat status {};
  if (!old.IsOpen() && errno != ENOENT) throw FileError(path_, errno);
  if (!old.IsOpen() || fstat(old.Get(), &status) != 0 || !S_ISREG(status.st_mode)) return true;
  // Without the right to change the owner, the group may still be one of the process's own.
  const bool isOwnerKept = fchown(inDescriptor, status.st_uid, status.st_gid) == 0 ||
                           (status.st_uid == geteuid() &&
                            fchown(inDescriptor, static_cast<uid_t>(-1), status.st_gid) == 0);
  if (!isOwnerKept) return false;
  if (fchmod(inDescriptor, status.st_mode & 07777U) != 0) throw FileError(path_, errno);
  ZORFoundation::Descriptor present(open(target_.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK));
  if (!present.IsOpen())
    present = ZORFoundation::Descriptor(open(target_.c_str(), O_WRONLY | O_CLOEXEC | O_NONBLOCK));
  if (!present.IsOpen()) throw FileError(path_, errno);
  return CopyExtendedAttributes(present.Get(), inDescriptor);
}

void AtomicFile::Rename() {
  const char* const from = temporary_->Path().c_str();
  // No such file at first, but another process may have made one since.
  bool isRenamed = !options_.mayReplace &&
                   renameat2(AT_FDCWD, from, AT_FDCWD, target_.c_str(), RENAME_NOREPLACE) == 0;
  const bool mayTryAgain = options_.mayReplace || errno == EINVAL || errno == ENOSYS;
  if (!isRenamed && mayTryAgain) isRenamed = rename(from, target_.c_str()) == 0;
  if (!isRenamed) throw FileError(path_, errno);
  temporary_->Release();
}

}  // namespace ZORFoundation
