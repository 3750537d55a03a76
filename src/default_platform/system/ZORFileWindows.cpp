#include <string_view>

#include "default_platform/system/FileOperations.h"
#include "foundation/WindowsCalls.h"

namespace ZORDefault {

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

int OpenFile(const std::string& inPath, FileMode inMode) {
  if (inMode == FileMode::kRead) return ZORFoundation::OpenShared(inPath, {});
  const bool isAppending = inMode == FileMode::kAppend;
  const unsigned long disposition = isAppending ? OPEN_ALWAYS : CREATE_ALWAYS;
  return ZORFoundation::OpenShared(inPath,
                                   {GENERIC_READ | GENERIC_WRITE, disposition, isAppending});
}

unsigned int PermissionsOf(int /*inDescriptor*/) { return 0; }  // a file has none here

}  // namespace ZORDefault

// Only opening a file tells for certain what its access list allows.
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
