// Preloaded into a program, makes one of its system calls or allocations fail: ZOR_FAULT is KIND:N,
// with the kinds memory, open, full (a write without space) and broken (a write with an error of the
// device). What comes before main is left alone. ZOR_FAULT_COUNTS names a file to which the numbers
// of allocations, openings and writes are written at the end.
#include <dlfcn.h>
#include <fcntl.h>
#include <stdarg.h>
#include <stdio.h>
#include <sys/syscall.h>
#include <sys/types.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <cstdlib>
#include <cstring>

#define ZOR_INTERPOSED extern "C" __attribute__((visibility("default")))

namespace {

enum Kind { kMemory, kOpen, kWrite, kKinds };

std::atomic<bool> isArmed{false};
std::atomic<long> counts[kKinds];
long failing[kKinds] = {};
int writeError = ENOSPC;

/// Counts one more. @return whether it is the one that fails.
bool Fails(Kind inKind) {
  if (!isArmed.load(std::memory_order_relaxed)) return false;
  return counts[inKind].fetch_add(1) + 1 == failing[inKind];
}

template <class Function>
Function* Next(const char* inName) {
  return reinterpret_cast<Function*>(dlsym(RTLD_NEXT, inName));
}

void ReadRequest() {
  const char* const request = getenv("ZOR_FAULT");
  const char* const colon = request == nullptr ? nullptr : strchr(request, ':');
  if (colon == nullptr) return;
  const auto is = [&](const char* inWord) {
    return strncmp(request, inWord, static_cast<size_t>(colon - request)) == 0;
  };
  if (is("broken")) writeError = EIO;
  failing[is("memory") ? kMemory : is("open") ? kOpen : kWrite] = atol(colon + 1);
}

// By system calls, since the functions are those below.
__attribute__((destructor)) void TellCounts() {
  isArmed = false;
  const char* const path = getenv("ZOR_FAULT_COUNTS");
  if (path == nullptr) return;
  char text[96];
  const int size = snprintf(text, sizeof text, "%ld %ld %ld\n", counts[kMemory].load(),
                            counts[kOpen].load(), counts[kWrite].load());
  const long file = syscall(SYS_openat, AT_FDCWD, path, O_WRONLY | O_CREAT | O_TRUNC, 0600);
  syscall(SYS_write, file, text, static_cast<size_t>(size));
  syscall(SYS_close, file);
}

using Main = int(int, char**, char**);
Main* realMain = nullptr;

int ArmedMain(int inCount, char** inArguments, char** inEnvironment) {
  ReadRequest();
  isArmed = true;
  return realMain(inCount, inArguments, inEnvironment);
}

}  // namespace

ZOR_INTERPOSED int __libc_start_main(Main* inMain, int inCount, char** inArguments,
                                     void (*inStart)(), void (*inEnd)(), void (*inLoaderEnd)(),
                                     void* inStackEnd) {
  realMain = inMain;
  using Start = int(Main*, int, char**, void (*)(), void (*)(), void (*)(), void*);
  return Next<Start>("__libc_start_main")(ArmedMain, inCount, inArguments, inStart, inEnd,
                                          inLoaderEnd, inStackEnd);
}

// ---- memory

extern "C" {
void* __libc_malloc(size_t);
void* __libc_calloc(size_t, size_t);
void* __libc_realloc(void*, size_t);
}

namespace {
void* NoMemory() {
  errno = ENOMEM;
  return nullptr;
}
}  // namespace

ZOR_INTERPOSED void* malloc(size_t inSize) {
  return Fails(kMemory) ? NoMemory() : __libc_malloc(inSize);
}
ZOR_INTERPOSED void* calloc(size_t inCount, size_t inSize) {
  return Fails(kMemory) ? NoMemory() : __libc_calloc(inCount, inSize);
}
ZOR_INTERPOSED void* realloc(void* inBlock, size_t inSize) {
  return Fails(kMemory) ? NoMemory() : __libc_realloc(inBlock, inSize);
}

// ---- opening

namespace {
int OpenAt(int inFolder, const char* inPath, int inFlags, va_list inArguments) {
  const int mode = (inFlags & (O_CREAT | O_TMPFILE)) != 0 ? va_arg(inArguments, int) : 0;
  if (!Fails(kOpen)) return static_cast<int>(syscall(SYS_openat, inFolder, inPath, inFlags, mode));
  errno = EMFILE;
  return -1;
}
}  // namespace

#define ZOR_OPEN(NAME, FOLDER, ...)                                           \
  ZOR_INTERPOSED int NAME(__VA_ARGS__ const char* inPath, int inFlags, ...) { \
    va_list arguments;                                                        \
    va_start(arguments, inFlags);                                             \
    const int file = OpenAt(FOLDER, inPath, inFlags, arguments);              \
    va_end(arguments);                                                        \
    return file;                                                              \
  }
#define ZOR_AND ,
ZOR_OPEN(open, AT_FDCWD)
ZOR_OPEN(open64, AT_FDCWD)
ZOR_OPEN(openat, inFolder, int inFolder ZOR_AND)
ZOR_OPEN(openat64, inFolder, int inFolder ZOR_AND)

ZOR_INTERPOSED FILE* fopen(const char* inPath, const char* inMode) {
  if (!Fails(kOpen)) return Next<FILE*(const char*, const char*)>("fopen")(inPath, inMode);
  errno = EMFILE;
  return nullptr;
}
ZOR_INTERPOSED FILE* fopen64(const char* inPath, const char* inMode) {
  return fopen(inPath, inMode);
}

// ---- writing

ZOR_INTERPOSED ssize_t write(int inFile, const void* inBytes, size_t inSize) {
  if (inFile == STDERR_FILENO || !Fails(kWrite)) return syscall(SYS_write, inFile, inBytes, inSize);
  errno = writeError;
  return -1;
}
ZOR_INTERPOSED ssize_t pwrite64(int inFile, const void* inBytes, size_t inSize, off64_t inPlace) {
  if (!Fails(kWrite)) return syscall(SYS_pwrite64, inFile, inBytes, inSize, inPlace);
  errno = writeError;
  return -1;
}
ZOR_INTERPOSED ssize_t pwrite(int inFile, const void* inBytes, size_t inSize, off_t inPlace) {
  return pwrite64(inFile, inBytes, inSize, inPlace);
}
// The C library writes a stream's bytes later and by itself: the stream is led where none fit.
ZOR_INTERPOSED size_t fwrite(const void* inBytes, size_t inSize, size_t inCount, FILE* inStream) {
  if (inStream != stderr && Fails(kWrite)) {
    const long full = syscall(SYS_openat, AT_FDCWD, "/dev/full", O_WRONLY | O_CLOEXEC, 0);
    dup2(static_cast<int>(full), fileno(inStream));
    syscall(SYS_close, full);
  }
  using Write = size_t(const void*, size_t, size_t, FILE*);
  static Write* const next = Next<Write>("fwrite");
  return next(inBytes, inSize, inCount, inStream);
}
ZOR_INTERPOSED int fsync(int inFile) {
  if (!Fails(kWrite)) return static_cast<int>(syscall(SYS_fsync, inFile));
  errno = writeError;
  return -1;
}
