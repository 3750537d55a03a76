// Opening and copying files, over POSIX; ZORFileWindows.cpp takes this file's place on Windows.
#include "platform/system/ZORFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <string>
#include <string_view>

#include "default_platform/system/FileResult.h"
#include "foundation/AtomicFile.h"
#include "foundation/Descriptor.h"
#include "foundation/Utf8.h"

namespace {

using ZORFoundation::Descriptor;

// The file system's bytes of a wide path; empty when it is no text.
std::string NarrowPath(const wchar_t* inPath) {
  std::string narrow;
  for (; inPath && *inPath; ++inPath) {
    const char32_t character = static_cast<char32_t>(*inPath);
    if (character > 0x10FFFF || (character >= 0xD800 && character <= 0xDFFF)) return std::string();
    char bytes[4];
    narrow.append(bytes, ZORFoundation::EncodeCharacter(character, bytes));
  }
  return narrow;
}

bool IsSameFile(const struct stat& inStatus, const std::string& inPath) {
  struct stat other;
  return stat(inPath.c_str(), &other) == 0 && other.st_dev == inStatus.st_dev &&
         other.st_ino == inStatus.st_ino;
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
  Descriptor file(open(path.c_str(), flags | O_CLOEXEC, 0666));
  if (!file.IsOpen()) return ZORDefault::FileResultOf(errno);
  struct stat status;
  if (fstat(file.Get(), &status) == 0 && S_ISDIR(status.st_mode)) return kZORFileIsDirectory;
  *outDescriptor = file.Release();
  return S_OK;
}

HRESULT ZORFCopy(const wchar_t* inSource, const wchar_t* inTarget, int inFlags) try {
  if (!inSource || !inTarget || (inFlags != 0 && inFlags != 1)) return E_INVALIDARG;
  const std::string sourcePath = NarrowPath(inSource);
  const std::string targetPath = NarrowPath(inTarget);
  if (sourcePath.empty() || targetPath.empty()) return kZORFileBadPath;
  const Descriptor source(open(sourcePath.c_str(), O_RDONLY | O_CLOEXEC));
  struct stat status;
  if (!source.IsOpen() || fstat(source.Get(), &status) != 0) return ZORDefault::FileResultOf(errno);
  if (S_ISDIR(status.st_mode)) return kZORFileIsDirectory;
  if (inFlags == 0 && IsSameFile(status, targetPath)) return S_OK;
  ZORFoundation::AtomicFile target(
      targetPath, {.modeOfNew = status.st_mode & 0777, .mayReplace = inFlags == 0});
  const int error = ZORFoundation::CopyBytes(source.Get(), target.Temporary().Descriptor());
  if (error != 0) return ZORDefault::FileResultOf(error);
  target.Commit();
  return S_OK;
} catch (const ZORFoundation::FileError& error) {
  return ZORDefault::FileResultOf(error.Code());
}
