#include "default_platform/system/SystemFiles.h"

#include <dlfcn.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <time.h>
#include <unistd.h>

#include <cerrno>

namespace ZORDefault {
namespace {

std::int64_t Nanoseconds(const timespec& inTime) {
  return std::int64_t{inTime.tv_sec} * 1'000'000'000 + inTime.tv_nsec;
}

FileStamp StampOf(const struct stat& inStatus) {
  return {inStatus.st_dev, inStatus.st_ino, static_cast<std::uint64_t>(inStatus.st_size),
          Nanoseconds(inStatus.st_mtim), Nanoseconds(inStatus.st_ctim)};
}

bool ReadAll(int inDescriptor, std::string& outContent) {
  char buffer[16384];
  for (;;) {
    const ssize_t count = read(inDescriptor, buffer, sizeof(buffer));
    if (count == 0) return true;
    if (count > 0)
      outContent.append(buffer, static_cast<std::size_t>(count));
    else if (errno != EINTR)
      return false;
  }
}

}  // namespace

bool ReadStamp(const std::string& inPath, FileStamp& outStamp) {
  struct stat status;
  if (stat(inPath.c_str(), &status) != 0) return false;
  outStamp = StampOf(status);
  return true;
}

bool ReadFile(const std::string& inPath, std::string& outContent, FileStamp& outStamp) {
  outContent.clear();
  // Without waiting, so that a pipe in a file's place cannot stop the caller.
  const int descriptor = open(inPath.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK);
  if (descriptor < 0) return false;
  struct stat status;
  bool read = fstat(descriptor, &status) == 0 && S_ISREG(status.st_mode);
  if (read) {
    outStamp = StampOf(status);
    // Growing step by step would copy large files several times.
    outContent.reserve(static_cast<std::size_t>(status.st_size));
    read = ReadAll(descriptor, outContent);
  }
  close(descriptor);
  return read;
}

std::string LibraryDirectory() {
  Dl_info info;
  if (!dladdr(reinterpret_cast<const void*>(&LibraryDirectory), &info) || !info.dli_fname)
    return std::string();
  const std::string file = info.dli_fname;
  const std::size_t slash = file.rfind('/');
  return slash == std::string::npos ? std::string(".") : file.substr(0, slash);
}

std::int64_t FileClockNow() {
  timespec now{};
  clock_gettime(CLOCK_REALTIME, &now);
  return Nanoseconds(now);
}

}  // namespace ZORDefault
