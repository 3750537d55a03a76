#include "foundation/WindowsCalls.h"

#include <fcntl.h>
#include <io.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <optional>
#include <utility>

namespace ZORFoundation {
namespace {

bool HasPrefix(std::wstring_view inPath) {
  return inPath.starts_with(LR"(\\?\)") || inPath.starts_with(LR"(\\.\)");
}

/// The absolute path, also of a drive-relative one; the path itself when that is unknown.
std::wstring FullPath(const std::wstring& inPath) {
  const DWORD size = GetFullPathNameW(inPath.c_str(), 0, nullptr, nullptr);
  std::wstring full(size, L'\0');
  const DWORD length = GetFullPathNameW(inPath.c_str(), size, full.data(), nullptr);
  if (length == 0 || length >= size) return inPath;
  full.resize(length);
  return full;
}

constexpr std::array<std::pair<unsigned long, int>, 29> kErrorNumbers = {{
    {ERROR_FILE_NOT_FOUND, ENOENT},
    {ERROR_PATH_NOT_FOUND, ENOENT},
    {ERROR_BAD_NETPATH, ENOENT},
    {ERROR_BAD_NET_NAME, ENOENT},
    {ERROR_INVALID_DRIVE, ENOENT},
    {ERROR_MOD_NOT_FOUND, ENOENT},
    {ERROR_NOT_READY, EIO},
    {ERROR_INVALID_NAME, EINVAL},
    {ERROR_BAD_PATHNAME, EINVAL},
    {ERROR_INVALID_PARAMETER, EINVAL},
    {ERROR_ACCESS_DENIED, EACCES},
    {ERROR_SHARING_VIOLATION, EACCES},
    {ERROR_LOCK_VIOLATION, EACCES},
    {ERROR_WRITE_PROTECT, EROFS},
    {ERROR_CANT_RESOLVE_FILENAME, EINVAL},
    {ERROR_FILE_EXISTS, EEXIST},
    {ERROR_ALREADY_EXISTS, EEXIST},
    {ERROR_TOO_MANY_OPEN_FILES, EMFILE},
    {ERROR_NOT_ENOUGH_MEMORY, ENOMEM},
    {ERROR_OUTOFMEMORY, ENOMEM},
    {ERROR_DISK_FULL, ENOSPC},
    {ERROR_HANDLE_DISK_FULL, ENOSPC},
    {ERROR_DIR_NOT_EMPTY, ENOTEMPTY},
    {ERROR_DIRECTORY, ENOTDIR},
    {ERROR_FILENAME_EXCED_RANGE, ENAMETOOLONG},
    {ERROR_BROKEN_PIPE, EPIPE},
    {ERROR_NO_DATA, EPIPE},
    {ERROR_INVALID_HANDLE, EBADF},
    {ERROR_NOT_SUPPORTED, EINVAL},
}};

/// Why a path was not opened: that of Windows says less.
int OpenErrorOf(const std::wstring& inPath, DWORD inError) {
  constexpr std::size_t kLongestName = 255;
  const auto isFolder = [](const std::wstring& inPlace) -> std::optional<bool> {
    const DWORD attributes = GetFileAttributesW(inPlace.c_str());
    if (attributes == INVALID_FILE_ATTRIBUTES) return std::nullopt;
    return (attributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
  };
  if (isFolder(inPath).value_or(false)) return EISDIR;
  const int error = ErrorNumberOf(inError);
  const std::size_t slash = inPath.find_last_of(L'\\');
  if (error != ENOENT) return error;
  if (inPath.size() - (slash + 1) > kLongestName) return ENAMETOOLONG;
  return slash != inPath.npos && !isFolder(inPath.substr(0, slash)).value_or(true) ? ENOTDIR
                                                                                   : error;
}

}  // namespace

std::wstring WideText(std::string_view inText) {
  const int size = static_cast<int>(inText.size());
  std::wstring wide(static_cast<std::size_t>(std::max(
                        0, MultiByteToWideChar(CP_UTF8, 0, inText.data(), size, nullptr, 0))),
                    L'\0');
  MultiByteToWideChar(CP_UTF8, 0, inText.data(), size, wide.data(), static_cast<int>(wide.size()));
  return wide;
}

std::string Utf8Text(std::wstring_view inText) {
  const int size = static_cast<int>(inText.size());
  std::string text(
      static_cast<std::size_t>(std::max(
          0, WideCharToMultiByte(CP_UTF8, 0, inText.data(), size, nullptr, 0, nullptr, nullptr))),
      '\0');
  WideCharToMultiByte(CP_UTF8, 0, inText.data(), size, text.data(), static_cast<int>(text.size()),
                      nullptr, nullptr);
  return text;
}

std::wstring WidePath(const std::string& inPath) {
  std::wstring path = WideText(inPath);
  std::ranges::replace(path, L'/', L'\\');
  // A folder's path must leave room for a name of 8.3.
  constexpr std::size_t kLongest = MAX_PATH - 12 - 1;
  if (path.size() < kLongest / 2 || HasPrefix(path)) return path;
  const std::wstring full = FullPath(path);
  if (full.size() <= kLongest || HasPrefix(full)) return path;
  if (full.starts_with(LR"(\\)")) return LR"(\\?\UNC\)" + full.substr(2);
  return LR"(\\?\)" + full;
}

int ErrorNumberOf(unsigned long inError) {
  const auto* const found =
      std::ranges::find(kErrorNumbers, inError, &std::pair<unsigned long, int>::first);
  return found == kErrorNumbers.end() ? EIO : found->second;
}

bool IsInUse(unsigned long inError) {
  return inError == ERROR_SHARING_VIOLATION || inError == ERROR_ACCESS_DENIED ||
         inError == ERROR_UNABLE_TO_REMOVE_REPLACED || inError == ERROR_USER_MAPPED_FILE;
}

int OpenShared(const std::string& inPath, const OpenRequest& inRequest) {
  HANDLE handle = INVALID_HANDLE_VALUE;
  for (int i = 0; i < kTriesWhileInUse; ++i) {
    if (i > 0) Sleep(kMillisecondsBetweenTries);
    handle = CreateFileW(WidePath(inPath).c_str(), inRequest.access,
                         FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE, nullptr,
                         inRequest.disposition, inRequest.attributes, nullptr);
    if (handle != INVALID_HANDLE_VALUE || GetLastError() != ERROR_SHARING_VIOLATION) break;
  }
  if (handle == INVALID_HANDLE_VALUE) {
    const DWORD error = GetLastError();
    errno = OpenErrorOf(WidePath(inPath), error);
    SetLastError(error);
    return -1;
  }
  const bool writes = (inRequest.access & GENERIC_WRITE) != 0;
  const int flags = _O_BINARY | _O_NOINHERIT | (writes ? _O_RDWR : _O_RDONLY) |
                    (inRequest.isAppending ? _O_APPEND : 0);
  const int descriptor = _open_osfhandle(reinterpret_cast<std::intptr_t>(handle), flags);
  if (descriptor < 0) CloseHandle(handle);
  return descriptor;
}

HANDLE HandleOf(int inDescriptor) { return reinterpret_cast<HANDLE>(_get_osfhandle(inDescriptor)); }

}  // namespace ZORFoundation
