#include <fcntl.h>
#include <io.h>

#include <cerrno>
#include <cstdio>
#include <cwchar>
#include <string>

#include "default_platform/product_structure/model_reader/SandboxedCalls.h"
#include "foundation/WindowsCalls.h"

namespace ZORDefault {
namespace {

int OpenDescriptor(const wchar_t* inPath, bool inWrites) {
  const std::string path = ZORFoundation::Utf8Text(inPath);
  const std::optional<int> found = OpenInSandbox(path.c_str(), inWrites);
  if (found) return *found;
  // Before there is a sandbox this program writes nothing.
  return ZORFoundation::OpenShared(path, {});
}

std::FILE* OpenStream(const wchar_t* inPath, const wchar_t* inMode) {
  const bool writes = std::wcspbrk(inMode, L"wa+") != nullptr;
  const int descriptor = OpenDescriptor(inPath, writes);
  return descriptor < 0 ? nullptr : _fdopen(descriptor, "rb");
}

}  // namespace

int Reopen(int inDescriptor) {
  const HANDLE handle = ReOpenFile(ZORFoundation::HandleOf(inDescriptor), GENERIC_READ,
                                   FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE, 0);
  if (handle == INVALID_HANDLE_VALUE) {
    errno = ZORFoundation::ErrorNumberOf(GetLastError());
    return -1;
  }
  return _open_osfhandle(reinterpret_cast<std::intptr_t>(handle),
                         _O_RDONLY | _O_BINARY | _O_NOINHERIT);
}

}  // namespace ZORDefault

// The program's own functions come before those of the C library, for the CAD kernel, which is linked
// in and opens all files by these two. It calls them through the addresses of an import library.
extern "C" {

std::FILE* ReaderOpenStream(const wchar_t* inPath, const wchar_t* inMode) asm("_wfopen");
std::FILE* ReaderOpenStream(const wchar_t* inPath, const wchar_t* inMode) {
  return ZORDefault::OpenStream(inPath, inMode);
}
extern decltype(&ReaderOpenStream) const readerOpenStream asm("__imp__wfopen");
decltype(&ReaderOpenStream) const readerOpenStream = ReaderOpenStream;

int ReaderOpenDescriptor(int* outDescriptor, const wchar_t* inPath, int inFlags, int inShare,
                         int inMode) asm("_wsopen_s");
int ReaderOpenDescriptor(int* outDescriptor, const wchar_t* inPath, int inFlags, int /*inShare*/,
                         int /*inMode*/) {
  constexpr int kAccess = _O_RDONLY | _O_WRONLY | _O_RDWR;
  *outDescriptor = ZORDefault::OpenDescriptor(inPath, (inFlags & kAccess) != _O_RDONLY);
  return *outDescriptor < 0 ? errno : 0;
}
extern decltype(&ReaderOpenDescriptor) const readerOpenDescriptor asm("__imp__wsopen_s");
decltype(&ReaderOpenDescriptor) const readerOpenDescriptor = ReaderOpenDescriptor;
}
