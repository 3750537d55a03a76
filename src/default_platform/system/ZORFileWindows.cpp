// Opening and copying files on Windows, by its wide calls.
#include <cerrno>
#include <string>
#include <string_view>

#include "default_platform/system/FileResult.h"
#include "foundation/AtomicFile.h"
#include "foundation/ReadWholeFile.h"
#include "foundation/WindowsCalls.h"
#include "platform/system/ZORFile.h"

namespace {

using ZORFoundation::Descriptor;
using ZORFoundation::StampOfFile;

/// Empty when it is no text.
std::string NarrowPath(const wchar_t* inPath) {
  if (!inPath) return std::string();
  const std::wstring_view path = inPath;
  for (std::size_t i = 0; i < path.size(); ++i) {
    const bool isPair = IS_SURROGATE_PAIR(path[i], i + 1 < path.size() ? path[i + 1] : 0);
    if (!isPair && (IS_HIGH_SURROGATE(path[i]) || IS_LOW_SURROGATE(path[i]))) return std::string();
    if (isPair) ++i;
  }
  return ZORFoundation::Utf8Text(path);
}

bool IsFolder(const std::string& inPath) {
  const DWORD attributes = GetFileAttributesW(ZORFoundation::WidePath(inPath).c_str());
  return attributes != INVALID_FILE_ATTRIBUTES && (attributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
}

bool IsSameFile(const std::string& inPath, const std::string& inOther) {
  const auto stamp = StampOfFile(inPath), other = StampOfFile(inOther);
  return stamp && other && stamp->device == other->device && stamp->inode == other->inode;
}

}  // namespace

// What the access list of a file says is known for certain only once the file is opened.
int ZORFileAccess(const char* inPath, int inMode) {
  if (!inPath || (inMode & ~6) != 0) return -1;
  const std::wstring path = ZORFoundation::WidePath(inPath);
  const DWORD attributes = GetFileAttributesW(path.c_str());
  if (attributes == INVALID_FILE_ATTRIBUTES) return -1;
  const bool isFolder = (attributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
  if (!isFolder && (inMode & 2) != 0 && (attributes & FILE_ATTRIBUTE_READONLY) != 0) return -1;
  const DWORD read = (inMode & 4) != 0 ? GENERIC_READ : 0;
  const DWORD write = (inMode & 2) != 0 && !isFolder ? GENERIC_WRITE : 0;
  const HANDLE file = CreateFileW(path.c_str(), read | write,
                                  FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE, nullptr,
                                  OPEN_EXISTING, FILE_FLAG_BACKUP_SEMANTICS, nullptr);
  if (file == INVALID_HANDLE_VALUE) return -1;
  CloseHandle(file);
  return 0;
}

HRESULT ZORFOpen(const wchar_t* inPath, const char* inMode, int* outDescriptor) {
  if (!inPath || !inMode || !outDescriptor) return E_INVALIDARG;
  const std::string_view mode = inMode;
  ZORFoundation::OpenRequest request;
  if (mode == "wb" || mode == "ab")
    request = {GENERIC_READ | GENERIC_WRITE,
               static_cast<unsigned long>(mode == "wb" ? CREATE_ALWAYS : OPEN_ALWAYS),
               mode == "ab"};
  else if (mode != "rb")
    return E_INVALIDARG;
  const std::string path = NarrowPath(inPath);
  if (path.empty()) return kZORFileBadPath;
  const int descriptor = ZORFoundation::OpenShared(path, request);
  if (descriptor < 0) return ZORDefault::FileResultOf(errno);
  *outDescriptor = descriptor;
  return S_OK;
}

HRESULT ZORFCopy(const wchar_t* inSource, const wchar_t* inTarget, int inFlags) try {
  if (!inSource || !inTarget || (inFlags != 0 && inFlags != 1)) return E_INVALIDARG;
  const std::string sourcePath = NarrowPath(inSource);
  const std::string targetPath = NarrowPath(inTarget);
  if (sourcePath.empty() || targetPath.empty()) return kZORFileBadPath;
  if (IsFolder(sourcePath)) return kZORFileIsDirectory;
  const Descriptor source(ZORFoundation::OpenShared(sourcePath, {}));
  if (!source.IsOpen()) return ZORDefault::FileResultOf(errno);
  if (inFlags == 0 && IsSameFile(sourcePath, targetPath)) return S_OK;
  ZORFoundation::AtomicFile target(targetPath, {.mayReplace = inFlags == 0});
  const int error = ZORFoundation::CopyBytes(source.Get(), target.Temporary().Descriptor());
  if (error != 0) return ZORDefault::FileResultOf(error);
  target.Commit();
  return S_OK;
} catch (const ZORFoundation::FileError& error) {
  return ZORDefault::FileResultOf(error.Code());
}
