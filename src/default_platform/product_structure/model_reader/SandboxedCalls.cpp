#include "default_platform/product_structure/model_reader/SandboxedCalls.h"

#include <fcntl.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <cstdio>
#include <cstring>

namespace ZORDefault {
namespace {

int OpenDirectly(const char* inPath, int inFlags) {
  return static_cast<int>(syscall(SYS_openat, AT_FDCWD, inPath, inFlags | O_CLOEXEC, 0666));
}

int OpenDescriptor(const char* inPath, int inFlags) {
  const std::optional<int> found = OpenInSandbox(inPath, (inFlags & O_ACCMODE) != O_RDONLY);
  return found ? *found : OpenDirectly(inPath, inFlags);
}

std::FILE* OpenStream(const char* inPath, const char* inMode) {
  const bool writes = std::strpbrk(inMode, "wa+") != nullptr;
  const int descriptor = OpenDescriptor(inPath, writes ? O_RDWR : O_RDONLY);
  return descriptor < 0 ? nullptr : fdopen(descriptor, "r");
}

}  // namespace

int Reopen(int inDescriptor) {
  char path[32];
  std::snprintf(path, sizeof path, "/proc/self/fd/%d", inDescriptor);
  return OpenDirectly(path, O_RDONLY);
}

}  // namespace ZORDefault

// A program's own functions come before those of the C library, for all libraries that it loads.
extern "C" {
__attribute__((visibility("default"))) std::FILE* fopen(const char* inPath, const char* inMode) {
  return ZORDefault::OpenStream(inPath, inMode);
}
__attribute__((visibility("default"))) std::FILE* fopen64(const char* inPath, const char* inMode) {
  return ZORDefault::OpenStream(inPath, inMode);
}
__attribute__((visibility("default"))) int open(const char* inPath, int inFlags, ...) {
  return ZORDefault::OpenDescriptor(inPath, inFlags);
}
__attribute__((visibility("default"))) int open64(const char* inPath, int inFlags, ...) {
  return ZORDefault::OpenDescriptor(inPath, inFlags);
}
}
