#include "foundation/ReadWholeFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <time.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>

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

std::size_t ReadSome(int inDescriptor, void* outBytes, std::size_t inMax,
                     const std::string& inName) {
  for (;;) {
    const ssize_t count = read(inDescriptor, outBytes, inMax);
    if (count >= 0) return static_cast<std::size_t>(count);
    if (errno != EINTR) throw FileError(inName, errno);
  }
}

void Rewind(int inDescriptor, const std::string& inName) {
  if (lseek(inDescriptor, 0, SEEK_SET) != 0) throw FileError(inName, errno);
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
  while (const std::size_t count = ReadSome(inDescriptor, part, sizeof part, inName)) {
    bytes.append(part, count);
    CheckSize(bytes.size(), inMaxSize, inName);
  }
  return bytes;
}

WholeFile ReadWholeFile(const std::string& inPath, const ReadOptions& inOptions) {
  const Descriptor file = OpenForReading(inPath, inOptions.mayBeStream);
  WholeFile whole;
  whole.before = StampOf(StatusOf(file.Get(), inPath));
  whole.bytes = ReadToEnd(file.Get(), inPath, inOptions.maxSize);
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
