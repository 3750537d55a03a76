#include "platform/system/ZORFile.h"

#include <cerrno>
#include <cstring>
#include <optional>
#include <string>

#include "default_platform/system/FileOperations.h"
#include "foundation/AtomicFile.h"
#include "foundation/Descriptor.h"
#include "foundation/ReadWholeFile.h"

namespace {

using ZORDefault::FileMode;
using ZORFoundation::Descriptor;
using ZORFoundation::FileStamp;

constexpr std::size_t kPathRoom = 260;

bool EndsInSeparator(const std::string& inDirectory) {
  constexpr std::string_view kSeparators = ZORDefault::kPathSeparator == '/' ? "/" : "/\\";
  return kSeparators.find(inDirectory.back()) != std::string_view::npos;
}

std::optional<FileMode> ModeOf(std::string_view inMode) {
  if (inMode == "rb") return FileMode::kRead;
  if (inMode == "wb") return FileMode::kReplace;
  if (inMode == "ab") return FileMode::kAppend;
  return std::nullopt;
}

bool IsSameFile(const FileStamp& inStamp, const std::string& inPath) {
  const auto other = ZORFoundation::StampOfFile(inPath);
  return other && other->device == inStamp.device && other->inode == inStamp.inode;
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
    case EFBIG:  // beyond the process's limit for files: no room, for its purposes
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

HRESULT ZORFOpen(const wchar_t* inPath, const char* inMode, int* outDescriptor) {
  if (!inPath || !inMode || !outDescriptor) return E_INVALIDARG;
  const std::optional<FileMode> mode = ModeOf(inMode);
  if (!mode) return E_INVALIDARG;
  const std::string path = ZORDefault::NarrowPath(inPath);
  if (path.empty()) return kZORFileBadPath;
  const int descriptor = ZORDefault::OpenFile(path, *mode);
  if (descriptor < 0) return ZORDefault::FileResultOf(errno);
  *outDescriptor = descriptor;
  return S_OK;
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

HRESULT ZORFCopy(const wchar_t* inSource, const wchar_t* inTarget, int inFlags) try {
  if (!inSource || !inTarget || (inFlags != 0 && inFlags != 1)) return E_INVALIDARG;
  const std::string sourcePath = ZORDefault::NarrowPath(inSource);
  const std::string targetPath = ZORDefault::NarrowPath(inTarget);
  if (sourcePath.empty() || targetPath.empty()) return kZORFileBadPath;
  const Descriptor source(ZORDefault::OpenFile(sourcePath, FileMode::kRead));
  if (!source.IsOpen()) return ZORDefault::FileResultOf(errno);
  const FileStamp stamp = ZORFoundation::StampOfOpen(source.Get(), sourcePath);
  if (inFlags == 0 && IsSameFile(stamp, targetPath)) return S_OK;
  ZORFoundation::AtomicFile target(
      targetPath,
      {.modeOfNew = ZORDefault::PermissionsOf(source.Get()), .mayReplace = inFlags == 0});
  const int error = ZORFoundation::CopyBytes(source.Get(), target.Temporary().Descriptor());
  if (error != 0) return ZORDefault::FileResultOf(error);
  target.Commit();
  return S_OK;
} catch (const ZORFoundation::FileError& error) {
  return ZORDefault::FileResultOf(error.Code());
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
