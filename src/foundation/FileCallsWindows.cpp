#include <atomic>
#include <cerrno>
#include <utility>

#include "foundation/FileCalls.h"
#include "foundation/Hash.h"
#include "foundation/WindowsCalls.h"

namespace ZORFoundation {

std::uint64_t UniqueNumber() {
  static std::atomic<std::uint64_t> count = 0;
  LARGE_INTEGER ticks{};
  QueryPerformanceCounter(&ticks);
  Hash64 hash(++count);
  hash.Add(std::uint64_t{GetCurrentProcessId()});
  hash.Add(static_cast<std::uint64_t>(ticks.QuadPart));
  return hash.Get();
}

int OpenNew(const std::string& inPath, unsigned int /*inMode*/) {
  return OpenShared(inPath, {GENERIC_READ | GENERIC_WRITE, CREATE_NEW, false});
}

int OpenInMemory() {
  const std::string folder = std::filesystem::temp_directory_path().string();
  for (;;) {
    const int descriptor = OpenShared(folder + "/lyra-" + HexText(UniqueNumber()),
                                      {GENERIC_READ | GENERIC_WRITE, CREATE_NEW, false,
                                       FILE_ATTRIBUTE_TEMPORARY | FILE_FLAG_DELETE_ON_CLOSE});
    if (descriptor >= 0 || errno != EEXIST) return descriptor;
  }
}

int OpenExisting(const std::string& inPath) {
  return OpenShared(inPath, {GENERIC_READ | GENERIC_WRITE, OPEN_EXISTING, false});
}

int OpenToRead(const std::string& inPath) { return OpenShared(inPath, {}); }

int OpenToWrite(const std::string& inPath) {
  return OpenShared(inPath, {GENERIC_WRITE, OPEN_EXISTING, false});
}

// Always opened anew: a file is closed before it is renamed.
int ReopenIfReplaced(int /*inDescriptor*/, const std::string& inPath) {
  return OpenExisting(inPath);
}

FileError WhyNotOpened(const std::string& inPath) {
  const int number = errno;
  if (!IsInUse(GetLastError())) return FileError(inPath, number);
  return FileError(inPath, EACCES, "is open in another program, which does not let it be written");
}

// Closed: a writer may put another file in its place, which Windows allows of none that is open.
// The path is marked where it is long, which other libraries do not do.
std::string Utf8PathOf(int& ioDescriptor, const std::string& inPath) {
  if (ioDescriptor >= 0) CloseDescriptor(std::exchange(ioDescriptor, -1));
  return Utf8Text(WidePath(inPath));
}

int CutHere(int inDescriptor) {
  return SetEndOfFile(HandleOf(inDescriptor)) != FALSE ? 0 : ErrorNumberOf(GetLastError());
}

int FlushToDisk(int inDescriptor) {
  return FlushFileBuffers(HandleOf(inDescriptor)) != FALSE ? 0 : ErrorNumberOf(GetLastError());
}

int MakeOwnFolder(const std::string& inPath) {
  return CreateDirectoryW(WidePath(inPath).c_str(), nullptr) != FALSE
             ? 0
             : ErrorNumberOf(GetLastError());
}

void RemoveFile(const char* inPath) noexcept { DeleteFileW(WidePath(inPath).c_str()); }
void RemoveFolder(const char* inPath) noexcept { RemoveDirectoryW(WidePath(inPath).c_str()); }

void WithSignalsHeld(const std::function<void()>& inFunction) { inFunction(); }

}  // namespace ZORFoundation
