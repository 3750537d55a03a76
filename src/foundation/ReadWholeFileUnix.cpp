#include <fcntl.h>
#include <sys/stat.h>
#include <time.h>
#include <unistd.h>

#include <cerrno>

#include "foundation/ReadWholeFile.h"

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

void CheckKind(mode_t inMode, bool inMayBeStream, const std::string& inPath) {
  if (S_ISDIR(inMode)) throw FileError(inPath, EISDIR, "is a directory");
  if (!S_ISREG(inMode) && !inMayBeStream) throw FileError(inPath, ESPIPE, "is not a regular file");
}

}  // namespace

std::optional<FileStamp> StampOfFile(const std::string& inPath) {
  struct stat status;
  if (stat(inPath.c_str(), &status) != 0) return std::nullopt;
  return StampOf(status);
}

FileStamp StampOfOpen(int inDescriptor, const std::string& inName) {
  return StampOf(StatusOf(inDescriptor, inName));
}

std::int64_t FileClockNow() {
  timespec now{};
  clock_gettime(CLOCK_REALTIME, &now);
  return Nanoseconds(now);
}

Descriptor OpenForReading(const std::string& inPath, bool inMayBeStream) {
  // Without waiting, so that a pipe in a file's place cannot stop the caller.
  const int noWait = inMayBeStream ? 0 : O_NONBLOCK;
  Descriptor file(open(inPath.c_str(), O_RDONLY | O_CLOEXEC | O_NOCTTY | noWait));
  // A socket cannot be opened by its path.
  if (!file.IsOpen() && errno == ENXIO) CheckKind(S_IFSOCK, inMayBeStream, inPath);
  if (!file.IsOpen()) throw FileError(inPath, errno);
  CheckKind(StatusOf(file.Get(), inPath).st_mode, inMayBeStream, inPath);
  return file;
}

Descriptor OpenForAppending(const std::string& inPath) {
  Descriptor file(open(inPath.c_str(), O_WRONLY | O_APPEND | O_CLOEXEC));
  if (!file.IsOpen()) throw FileError(inPath, errno);
  return file;
}

Descriptor OpenCut(const std::string& inPath, std::uint64_t inSize) {
  constexpr int kMode = 0666;
  Descriptor file(
      open(inPath.c_str(), O_WRONLY | O_CREAT | O_APPEND | O_CLOEXEC | O_NOFOLLOW, kMode));
  if (!file.IsOpen() || ftruncate(file.Get(), static_cast<off_t>(inSize)) != 0)
    throw FileError(inPath, errno);
  return file;
}

std::FILE* OpenStream(const std::string& inPath) { return std::fopen(inPath.c_str(), "wb"); }

}  // namespace ZORFoundation
