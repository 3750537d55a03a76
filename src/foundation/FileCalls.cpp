#include "foundation/FileCalls.h"

#include <fcntl.h>
#include <signal.h>
#include <sys/mman.h>
#include <sys/random.h>
#include <sys/stat.h>
#include <time.h>
#include <unistd.h>

#include <cerrno>

#include "foundation/Hash.h"
#include "foundation/Utf8.h"

namespace ZORFoundation {

std::uint64_t UniqueNumber() {
  std::uint64_t number = 0;
  if (getrandom(&number, sizeof number, GRND_NONBLOCK) != sizeof number)
    number = Hash64Of(std::to_string(getpid()), static_cast<std::uint64_t>(clock()));
  return number;
}

int OpenNew(const std::string& inPath, unsigned int inMode) {
  return open(inPath.c_str(), O_RDWR | O_CREAT | O_EXCL | O_CLOEXEC, inMode);
}

int OpenInMemory() { return memfd_create("memory", MFD_CLOEXEC); }

int OpenExisting(const std::string& inPath) {
  return open(inPath.c_str(), O_RDWR | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK);
}

int OpenToRead(const std::string& inPath) { return open(inPath.c_str(), O_RDONLY | O_CLOEXEC); }

int OpenToWrite(const std::string& inPath) {
  return open(inPath.c_str(), O_WRONLY | O_CLOEXEC | O_NOCTTY);
}

int ReopenIfReplaced(int inDescriptor, const std::string& inPath) {
  struct stat here {
  }, there{};
  if (fstat(inDescriptor, &here) != 0 || stat(inPath.c_str(), &there) != 0) return -1;
  if (here.st_ino == there.st_ino && here.st_dev == there.st_dev) return inDescriptor;
  return open(inPath.c_str(), O_RDWR | O_CLOEXEC | O_NOFOLLOW);
}

FileError WhyNotOpened(const std::string& inPath) { return FileError(inPath, errno); }

std::string Utf8PathOf(int& ioDescriptor, const std::string& inPath) {
  return IsUtf8(inPath) ? inPath : "/proc/self/fd/" + std::to_string(ioDescriptor);
}

int CutHere(int inDescriptor) {
  const off_t end = lseek(inDescriptor, 0, SEEK_CUR);
  return end >= 0 && ftruncate(inDescriptor, end) == 0 ? 0 : errno;
}

int FlushToDisk(int inDescriptor) { return fsync(inDescriptor) == 0 ? 0 : errno; }

int MakeOwnFolder(const std::string& inPath) {
  return mkdir(inPath.c_str(), S_IRWXU) == 0 ? 0 : errno;
}

void RemoveFile(const char* inPath) noexcept { unlink(inPath); }
void RemoveFolder(const char* inPath) noexcept { rmdir(inPath); }

void WithSignalsHeld(const std::function<void()>& inFunction) {
  sigset_t held, before;
  sigemptyset(&held);
  for (const int signal : {SIGINT, SIGTERM, SIGHUP}) sigaddset(&held, signal);
  pthread_sigmask(SIG_BLOCK, &held, &before);
  inFunction();
  pthread_sigmask(SIG_SETMASK, &before, nullptr);
}

}  // namespace ZORFoundation
