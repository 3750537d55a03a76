// What the file operations have in common on all systems.
#include <cerrno>
#include <cstring>
#include <string>

#include "default_platform/system/FileResult.h"
#include "foundation/Descriptor.h"
#include "platform/system/ZORFile.h"

namespace {

constexpr std::size_t kPathRoom = 260;

bool EndsInSeparator(const std::string& inDirectory) {
  constexpr std::string_view kSeparators = ZORDefault::kPathSeparator == '/' ? "/" : "/\\";
  return kSeparators.find(inDirectory.back()) != std::string_view::npos;
}

}  // namespace

HRESULT ZORDefault::FileResultOf(int inError) {
  switch (inError) {
    case ENOENT:
      return kZORFileNotFound;
    case EACCES:
    case EPERM:
    case EROFS:
      return kZORFileAccessDenied;
    case EEXIST:
      return kZORFileExists;
    case ENOSPC:
#ifdef EDQUOT
    case EDQUOT:
#endif
    case EFBIG:  // the process may write no larger file: no room, for its purposes
      return kZORFileDiskFull;
    case ENOTDIR:
    case ENAMETOOLONG:
    case ELOOP:
      return kZORFileBadPath;
    case EISDIR:
      return kZORFileIsDirectory;
    default:
      return E_FAIL;
  }
}

HRESULT ZORFWrite(int inDescriptor, const void* inBytes, std::size_t inCount,
                  std::size_t* outWritten) {
  std::size_t unused = 0;
  std::size_t& written = outWritten ? *outWritten : unused;
  written = 0;
  if (!inBytes && inCount > 0) return E_INVALIDARG;
  const int error =
      ZORFoundation::WriteAll(inDescriptor, {static_cast<const char*>(inBytes), inCount}, written);
  return error == 0 ? S_OK : ZORDefault::FileResultOf(error);
}

HRESULT ZORFClose(int inDescriptor) {
  const int error = ZORFoundation::CloseDescriptor(inDescriptor);
  return error == 0 ? S_OK : ZORDefault::FileResultOf(error);
}

HRESULT ZORMakePath(const char* inDirectory, const char* inFileName, char* outPath) {
  if (!outPath) return E_INVALIDARG;
  *outPath = '\0';
  if (!inDirectory || !inFileName) return E_INVALIDARG;
  std::string path = inDirectory;
  // No directory is the current one: a separator would make it the root.
  if (!path.empty() && !EndsInSeparator(path)) path += ZORDefault::kPathSeparator;
  path += inFileName;
  if (path.size() >= kPathRoom) return E_INVALIDARG;
  std::memcpy(outPath, path.c_str(), path.size() + 1);
  return S_OK;
}
