#include "foundation/AtomicFile.h"

#include <fcntl.h>
#include <signal.h>
#include <stdio.h>
#include <sys/random.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <filesystem>
#include <vector>

#include "foundation/Descriptor.h"
#include "foundation/Hash.h"
#include "foundation/Utf8.h"

namespace fs = std::filesystem;

namespace ZORFoundation {
namespace {

constexpr std::string_view kTemporaryPrefix = ".zorlyra-";
constexpr std::size_t kTemporaryDigits = 16;

std::string FolderOf(const std::string& inPath) {
  const std::size_t slash = inPath.rfind('/');
  return slash == std::string::npos ? "./" : inPath.substr(0, slash + 1);
}

std::uint64_t RandomNumber() {
  std::uint64_t number = 0;
  if (getrandom(&number, sizeof number, GRND_NONBLOCK) != sizeof number)
    number = Hash64Of(std::to_string(getpid()), static_cast<std::uint64_t>(clock()));
  return number;
}

/// Resolves symbolic links, whether or not the last one leads to a file.
std::string FollowLinks(const std::string& inPath) {
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

/// Keeps termination signals of this thread waiting while a file is half written.
class SignalsHeld {
 public:
  SignalsHeld() {
    sigset_t signals;
    sigemptyset(&signals);
    for (const int signal : {SIGINT, SIGTERM, SIGHUP}) sigaddset(&signals, signal);
    pthread_sigmask(SIG_BLOCK, &signals, &before_);
  }
  ~SignalsHeld() { pthread_sigmask(SIG_SETMASK, &before_, nullptr); }
  SignalsHeld(const SignalsHeld&) = delete;
  SignalsHeld& operator=(const SignalsHeld&) = delete;

 private:
  sigset_t before_;
};

/// Makes one open file's bytes those of another. @return 0 or an errno value.
int Overwrite(int inSource, int inTarget) {
  struct stat status {};
  if (fstat(inSource, &status) != 0 || lseek(inSource, 0, SEEK_SET) != 0 ||
      lseek(inTarget, 0, SEEK_SET) != 0)
    return errno;
  if (const int error = CopyBytes(inSource, inTarget); error != 0) return error;
  return ftruncate(inTarget, status.st_size) != 0 || fsync(inTarget) != 0 ? errno : 0;
}

}  // namespace

TemporaryFile::TemporaryFile(const std::string& inFolder, unsigned int inMode,
                             const std::string& inReportedPath)
    : reportedPath_(inReportedPath) {
  const std::string folder = inFolder + (inFolder.ends_with('/') ? "" : "/");
  do {
    path_ = folder + std::string(kTemporaryPrefix) + HexText(RandomNumber());
    removeOnSignal_.emplace(path_.c_str());  // first, so that no signal falls between
    descriptor_ = open(path_.c_str(), O_RDWR | O_CREAT | O_EXCL | O_CLOEXEC, inMode);
  } while (descriptor_ < 0 && errno == EEXIST);
  if (descriptor_ < 0) throw FileError(reportedPath_, errno);
}

TemporaryFile::~TemporaryFile() {
  Close();
  if (!path_.empty()) unlink(path_.c_str());
}

std::string TemporaryFile::Utf8Path() const {
  return IsUtf8(path_) ? path_ : "/proc/self/fd/" + std::to_string(descriptor_);
}

void TemporaryFile::Write(std::string_view inBytes) {
  std::size_t written = 0;
  const int error = WriteAll(descriptor_, inBytes, written);
  if (error != 0) throw FileError(reportedPath_, error);
}

int TemporaryFile::Reopen() {
  struct stat here {
  }, there{};
  if (fstat(descriptor_, &here) != 0 || stat(path_.c_str(), &there) != 0)
    throw FileError(reportedPath_, errno);
  if (here.st_ino == there.st_ino && here.st_dev == there.st_dev) return descriptor_;
  const int reopened = open(path_.c_str(), O_RDWR | O_CLOEXEC | O_NOFOLLOW);
  if (reopened < 0) throw FileError(reportedPath_, errno);
  close(descriptor_);
  return descriptor_ = reopened;
}

void TemporaryFile::Close() {
  if (descriptor_ >= 0) CloseDescriptor(std::exchange(descriptor_, -1));
}

bool TemporaryFile::IsTemporaryName(std::string_view inName) {
  return inName.starts_with(kTemporaryPrefix) &&
         inName.size() == kTemporaryPrefix.size() + kTemporaryDigits &&
         inName.find_first_not_of("0123456789abcdef", kTemporaryPrefix.size()) == inName.npos;
}

AtomicFile::AtomicFile(const std::string& inPath, const AtomicFileOptions& inOptions)
    : path_(inPath), target_(FollowLinks(inPath)), options_(inOptions) {
  CheckTarget();
  constexpr unsigned int kOwnerOnly = 0600;
  if (isStream_) {
    std::error_code ignored;
    const fs::path folder = fs::temp_directory_path(ignored);
    temporary_.emplace(folder.empty() ? "/tmp" : folder.string(), kOwnerOnly, path_);
  } else {
    const bool isElsewhere = !options_.temporaryFolder.empty() && target_ == path_;
    temporary_.emplace(isElsewhere ? options_.temporaryFolder : FolderOf(target_),
                       isNew_ ? options_.modeOfNew : kOwnerOnly, path_);
  }
}

AtomicFile::~AtomicFile() = default;

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

/// The old bytes are in a file of their own until the new ones are on the disk.
void AtomicFile::OverwriteTarget(int inDescriptor) const {
  const ZORFoundation::Descriptor target(
      open(target_.c_str(), O_RDWR | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK));
  if (!target.IsOpen()) throw FileError(path_, errno);
  TemporaryFile former(FolderOf(target_), 0600, path_);
  if (const int error = Overwrite(target.Get(), former.Descriptor()); error != 0)
    throw FileError(path_, error);
  const SignalsHeld held;
  const int error = Overwrite(inDescriptor, target.Get());
  if (error == 0) return;
  if (Overwrite(former.Descriptor(), target.Get()) == 0) throw FileError(path_, error);
  const std::string kept = former.Path();
  former.Release();
  throw FileError(path_, error, "is damaged; what it held is in " + kept);
}

void AtomicFile::Commit() {
  if (isStream_) {
    CopyIntoTarget();
    return;
  }
  const int descriptor = temporary_->Reopen();
  if (!isNew_ && !KeepAttributes(descriptor)) return OverwriteTarget(descriptor);
  // Some file systems report a full disk only here.
  if (options_.isSynchronised && fsync(descriptor) != 0) throw FileError(path_, errno);
  Rename();
  temporary_->Release();
}

void AtomicFile::Rename() {
  const char* const from = temporary_->Path().c_str();
  if (!options_.mayReplace) {
    // No such file at first, but another process may have made one since.
    if (renameat2(AT_FDCWD, from, AT_FDCWD, target_.c_str(), RENAME_NOREPLACE) == 0) return;
    if (errno != EINVAL && errno != ENOSYS) throw FileError(path_, errno);
  }
  if (rename(from, target_.c_str()) != 0) throw FileError(path_, errno);
}

void AtomicFile::CopyIntoTarget() const {
  ZORFoundation::Descriptor target(open(target_.c_str(), O_WRONLY | O_CLOEXEC | O_NOCTTY));
  if (!target.IsOpen()) throw FileError(path_, errno);
  const ZORFoundation::Descriptor source(open(temporary_->Path().c_str(), O_RDONLY | O_CLOEXEC));
  if (!source.IsOpen()) throw FileError(path_, errno);
  int error = CopyBytes(source.Get(), target.Get());
  const int closing = target.Close();
  if (error == 0) error = closing;
  if (error != 0) throw FileError(path_, error);
}

void WriteWholeFile(const std::string& inPath, std::string_view inBytes,
                    const AtomicFileOptions& inOptions) {
  AtomicFile file(inPath, inOptions);
  file.Write(inBytes);
  file.Commit();
}

}  // namespace ZORFoundation
