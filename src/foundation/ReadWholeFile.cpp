#include "foundation/ReadWholeFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <time.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>

#include "foundation/Descriptor.h"

namespace ZORFoundation {
namespace {

std::int64_t Nanoseconds(const timespec& inTime) {
  return std::int64_t{inTime.tv_sec} * 1'000'000'000 + inTime.tv_nsec;
}

FileStamp StampOf(const struct stat& inStatus) {
  return {inStatus.st_dev, inStatus.st_ino, static_cast<std::uint64_t>(inStatus.st_size),
          Nanoseconds(inStatus.st_mtim), Nanoseconds(inStatus.st_ctim)};
}

struct stat StatusOf(int inDescriptor, const std::string& inPath) {
  struct stat status;
  if (fstat(inDescriptor, &status) != 0) throw FileError(inPath, errno);
  return status;
}

void CheckKind(mode_t inMode, const ReadOptions& inOptions, const std::string& inPath) {
  if (S_ISDIR(inMode)) throw FileError(inPath, EISDIR);
  if (!S_ISREG(inMode) && !inOptions.mayBeStream)
    throw FileError(inPath, ESPIPE, "is a device, a pipe or a socket");
}

void CheckSize(std::uint64_t inSize, std::uint64_t inMaxSize, const std::string& inPath) {
  if (inSize > inMaxSize) throw FileError(inPath, EFBIG);
}

}  // namespace

std::optional<FileStamp> StampOfFile(const std::string& inPath) {
  struct stat status;
  if (stat(inPath.c_str(), &status) != 0) return std::nullopt;
  return StampOf(status);
}

std::int64_t FileClockNow() {
  timespec now{};
  clock_gettime(CLOCK_REALTIME, &now);
  return Nanoseconds(now);
}

std::string ReadToEnd(int inDescriptor, const std::string& inName, std::uint64_t inMaxSize) {
  std::string bytes;
  // Growing step by step would copy large files several times.
  struct stat status;
  if (fstat(inDescriptor, &status) == 0 && S_ISREG(status.st_mode) && status.st_size > 0) {
    CheckSize(static_cast<std::uint64_t>(status.st_size), inMaxSize, inName);
    bytes.reserve(static_cast<std::size_t>(status.st_size));
  }
  char part[1 << 16];
  for (;;) {
    const ssize_t count = read(inDescriptor, part, sizeof part);
    if (count == 0) return bytes;
    if (count < 0 && errno == EINTR) continue;
    if (count < 0) throw FileError(inName, errno);
    bytes.append(part, static_cast<std::size_t>(count));
    CheckSize(bytes.size(), inMaxSize, inName);
  }
}

WholeFile ReadWholeFile(const std::string& inPath, const ReadOptions& inOptions) {
  // Without waiting, so that a pipe in a file's place cannot stop the caller.
  const int noWait = inOptions.mayBeStream ? 0 : O_NONBLOCK;
  const Descriptor file(open(inPath.c_str(), O_RDONLY | O_CLOEXEC | O_NOCTTY | noWait));
  // A socket cannot be opened by its path.
  if (!file.IsOpen() && errno == ENXIO) CheckKind(S_IFSOCK, inOptions, inPath);
  if (!file.IsOpen()) throw FileError(inPath, errno);
  const struct stat before = StatusOf(file.Get(), inPath);
  CheckKind(before.st_mode, inOptions, inPath);
  WholeFile whole;
  whole.bytes = ReadToEnd(file.Get(), inPath, inOptions.maxSize);
  whole.before = StampOf(before);
  whole.after = StampOf(StatusOf(file.Get(), inPath));
  return whole;
}

std::optional<WholeFile> TryReadWholeFile(const std::string& inPath, const ReadOptions& inOptions) {
  try {
    return ReadWholeFile(inPath, inOptions);
  } catch (const FileError&) {
    return std::nullopt;
  }
}

}  // namespace ZORFoundation
