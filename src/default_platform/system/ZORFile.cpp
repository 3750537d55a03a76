// The file operations over POSIX; another system gets a twin of this file.
#include "platform/system/ZORFile.h"

#include <fcntl.h>
#include <stdio.h>
#include <stdlib.h>
#include <sys/stat.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <cstring>
#include <memory>
#include <string>
#include <string_view>

#include "default_platform/system/Utf8.h"

namespace {

constexpr std::size_t kPathRoom = 260;

HRESULT ResultOf(int inError) {
  switch (inError) {
    case ENOENT:
      return kZORFileNotFound;
    case EACCES:
    case EPERM:
    case EROFS:
      return kZORFileAccessDenied;
    case EEXIST:
      return kZORFileExists;
    case ENOSPC:
    case EDQUOT:
    case EFBIG:  // the process may write no larger file: no room, for its purposes
      return kZORFileDiskFull;
    case ENOTDIR:
    case ENAMETOOLONG:
    case ELOOP:
      return kZORFileBadPath;
    case EISDIR:
      return kZORFileIsDirectory;
    default:
      return E_FAIL;
  }
}

// The file system's bytes of a wide path; empty when it is no text.
std::string NarrowPath(const wchar_t* inPath) {
  std::string narrow;
  for (; inPath && *inPath; ++inPath) {
    const char32_t character = static_cast<char32_t>(*inPath);
    if (character > 0x10FFFF || (character >= 0xD800 && character <= 0xDFFF)) return std::string();
    char bytes[4];
    narrow.append(bytes, ZORDefault::EncodeCharacter(character, bytes));
  }
  return narrow;
}

// An open file, closed when the scope ends.
class Descriptor {
 public:
  explicit Descriptor(int inDescriptor) : descriptor_(inDescriptor) {}
  ~Descriptor() {
    if (IsOpen()) close(descriptor_);
  }
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;
  bool IsOpen() const { return descriptor_ >= 0; }
  int Get() const { return descriptor_; }
  // Closes now, since closing can be what fails.
  HRESULT Close() {
    const int descriptor = descriptor_;
    descriptor_ = -1;
    return ZORFClose(descriptor);
  }

 private:
  int descriptor_;
};

HRESULT CopyBytes(int inSource, int inTarget) {
  constexpr std::size_t kBlock = 1 << 18;
  const auto block = std::make_unique<char[]>(kBlock);
  for (;;) {
    const ssize_t count = read(inSource, block.get(), kBlock);
    if (count == 0) return S_OK;
    if (count < 0 && errno == EINTR) continue;
    if (count < 0) return ResultOf(errno);
    const HRESULT written =
        ZORFWrite(inTarget, block.get(), static_cast<std::size_t>(count), nullptr);
    if (FAILED(written)) return written;
  }
}

// Makes a new file beside a path, under a name that no other file has.
int MakeFileBeside(const std::string& inPath, mode_t inMode, std::string& outPath) {
  static std::atomic<unsigned> number{0};
  const std::string directory = inPath.substr(0, inPath.rfind('/') + 1);
  int descriptor = -1;
  do {
    outPath = directory + ".zorcopy-" + std::to_string(getpid()) + "-" + std::to_string(++number);
    descriptor = open(outPath.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, inMode);
  } while (descriptor < 0 && errno == EEXIST);
  return descriptor;
}

// What a copy finds in its target's place and may do with it.
enum class Target { kReplaced, kNew, kNewOrRefused };

HRESULT Rename(const std::string& inFrom, const std::string& inTo, Target inTarget) {
  if (inTarget != Target::kNewOrRefused)
    return rename(inFrom.c_str(), inTo.c_str()) == 0 ? S_OK : ResultOf(errno);
  // Seen to be free before; another process may have been quicker.
  if (renameat2(AT_FDCWD, inFrom.c_str(), AT_FDCWD, inTo.c_str(), RENAME_NOREPLACE) == 0)
    return S_OK;
  if (errno != EINVAL && errno != ENOSYS) return ResultOf(errno);
  return Rename(inFrom, inTo, Target::kNew);
}

// Copies to a new file beside the target and puts it in the target's place when it is complete.
HRESULT CopyBeside(int inSource, const std::string& inTarget, mode_t inMode, Target inState) {
  std::string besidePath;
  Descriptor beside(MakeFileBeside(inTarget, inMode & 0777, besidePath));
  if (!beside.IsOpen()) return ResultOf(errno);
  // A file that is replaced keeps its permissions; a new one has those of the user's mask.
  if (inState == Target::kReplaced) fchmod(beside.Get(), inMode & 07777);
  HRESULT result = CopyBytes(inSource, beside.Get());
  const HRESULT closed = beside.Close();
  if (SUCCEEDED(result)) result = closed;
  if (SUCCEEDED(result)) result = Rename(besidePath, inTarget, inState);
  if (FAILED(result)) unlink(besidePath.c_str());
  return result;
}

// The file that a path leads to through symbolic links; the path itself when there is none.
std::string ResolvedPath(const std::string& inPath) {
  const std::unique_ptr<char, decltype(&free)> resolved(realpath(inPath.c_str(), nullptr), &free);
  return resolved ? std::string(resolved.get()) : inPath;
}

HRESULT OpenSource(const std::string& inPath, int& outDescriptor, struct stat& outStatus) {
  outDescriptor = open(inPath.c_str(), O_RDONLY | O_CLOEXEC);
  if (outDescriptor < 0 || fstat(outDescriptor, &outStatus) != 0) return ResultOf(errno);
  return S_ISDIR(outStatus.st_mode) ? kZORFileIsDirectory : S_OK;
}

// Overwrites the target, which exists.
HRESULT CopyOnto(int inSource, const struct stat& inSourceStatus, const std::string& inTarget,
                 const struct stat& inTargetStatus) {
  if (S_ISDIR(inTargetStatus.st_mode)) return kZORFileIsDirectory;
  if (inTargetStatus.st_dev == inSourceStatus.st_dev &&
      inTargetStatus.st_ino == inSourceStatus.st_ino)
    return S_OK;
  if (access(inTarget.c_str(), W_OK) != 0) return ResultOf(errno);
  if (S_ISREG(inTargetStatus.st_mode))
    return CopyBeside(inSource, ResolvedPath(inTarget), inTargetStatus.st_mode, Target::kReplaced);
  // A device or a pipe is written into, not replaced by a file.
  Descriptor target(open(inTarget.c_str(), O_WRONLY | O_CLOEXEC));
  if (!target.IsOpen()) return ResultOf(errno);
  const HRESULT copied = CopyBytes(inSource, target.Get());
  const HRESULT closed = target.Close();
  return FAILED(copied) ? copied : closed;
}

int OpenFlags(std::string_view inMode) {
  if (inMode == "rb") return O_RDONLY;
  if (inMode == "wb") return O_WRONLY | O_CREAT | O_TRUNC;
  if (inMode == "ab") return O_WRONLY | O_CREAT | O_APPEND;
  return -1;
}

}  // namespace

int ZORFileAccess(const char* inPath, int inMode) {
  if (!inPath || (inMode & ~6) != 0) return -1;
  const int read = inMode & 4 ? R_OK : 0;
  const int write = inMode & 2 ? W_OK : 0;
  return access(inPath, F_OK | read | write);
}

HRESULT ZORFOpen(const wchar_t* inPath, const char* inMode, int* outDescriptor) {
  if (!inPath || !inMode || !outDescriptor) return E_INVALIDARG;
  const int flags = OpenFlags(inMode);
  if (flags < 0) return E_INVALIDARG;
  const std::string path = NarrowPath(inPath);
  if (path.empty()) return kZORFileBadPath;
  const int descriptor = open(path.c_str(), flags | O_CLOEXEC, 0666);
  if (descriptor < 0) return ResultOf(errno);
  struct stat status;
  if (fstat(descriptor, &status) == 0 && S_ISDIR(status.st_mode)) {
    close(descriptor);
    return kZORFileIsDirectory;
  }
  *outDescriptor = descriptor;
  return S_OK;
}

HRESULT ZORFWrite(int inDescriptor, const void* inBytes, std::size_t inCount,
                  std::size_t* outWritten) {
  std::size_t unused = 0;
  std::size_t& written = outWritten ? *outWritten : unused;
  written = 0;
  if (!inBytes && inCount > 0) return E_INVALIDARG;
  const char* const bytes = static_cast<const char*>(inBytes);
  while (written < inCount) {
    const ssize_t count = write(inDescriptor, bytes + written, inCount - written);
    if (count >= 0)
      written += static_cast<std::size_t>(count);
    else if (errno != EINTR)
      return ResultOf(errno);
  }
  return S_OK;
}

HRESULT ZORFClose(int inDescriptor) {
  // An interrupted close has closed: trying again might close another's file.
  return close(inDescriptor) == 0 || errno == EINTR ? S_OK : ResultOf(errno);
}

HRESULT ZORFCopy(const wchar_t* inSource, const wchar_t* inTarget, int inFlags) {
  if (!inSource || !inTarget || (inFlags != 0 && inFlags != 1)) return E_INVALIDARG;
  const std::string sourcePath = NarrowPath(inSource);
  const std::string targetPath = NarrowPath(inTarget);
  if (sourcePath.empty() || targetPath.empty()) return kZORFileBadPath;
  int descriptor = -1;
  struct stat sourceStatus;
  const HRESULT opened = OpenSource(sourcePath, descriptor, sourceStatus);
  const Descriptor source(descriptor);
  if (FAILED(opened)) return opened;
  struct stat targetStatus;
  if (stat(targetPath.c_str(), &targetStatus) != 0) {
    if (errno != ENOENT) return ResultOf(errno);
    return CopyBeside(source.Get(), targetPath, sourceStatus.st_mode,
                      inFlags == 1 ? Target::kNewOrRefused : Target::kNew);
  }
  if (inFlags == 1) return kZORFileExists;
  return CopyOnto(source.Get(), sourceStatus, targetPath, targetStatus);
}

HRESULT ZORMakePath(const char* inDirectory, const char* inFileName, char* outPath) {
  if (!outPath) return E_INVALIDARG;
  *outPath = '\0';
  if (!inDirectory || !inFileName) return E_INVALIDARG;
  std::string path = inDirectory;
  // No directory is the current one: a separator would make it the root.
  if (!path.empty() && path.back() != '/') path += '/';
  path += inFileName;
  if (path.size() >= kPathRoom) return E_INVALIDARG;
  std::memcpy(outPath, path.c_str(), path.size() + 1);
  return S_OK;
}
