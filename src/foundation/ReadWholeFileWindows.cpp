#include <cerrno>

#include "foundation/ReadWholeFile.h"
#include "foundation/WindowsCalls.h"

namespace ZORFoundation {
namespace {

// Windows counts in steps of 100 ns since 1601.
constexpr std::int64_t kStepsTo1970 = 116'444'736'000'000'000;

std::int64_t Nanoseconds(std::int64_t inSteps) { return (inSteps - kStepsTo1970) * 100; }

std::uint64_t Joined(DWORD inHigh, DWORD inLow) { return std::uint64_t{inHigh} << 32 | inLow; }

std::optional<FileStamp> StampOf(HANDLE inFile) {
  BY_HANDLE_FILE_INFORMATION information{};
  FILE_BASIC_INFO basic{};
  if (GetFileInformationByHandle(inFile, &information) == FALSE ||
      GetFileInformationByHandleEx(inFile, FileBasicInfo, &basic, sizeof basic) == FALSE)
    return std::nullopt;
  return FileStamp{information.dwVolumeSerialNumber,
                   Joined(information.nFileIndexHigh, information.nFileIndexLow),
                   Joined(information.nFileSizeHigh, information.nFileSizeLow),
                   Nanoseconds(basic.LastWriteTime.QuadPart),
                   Nanoseconds(basic.ChangeTime.QuadPart)};
}

}  // namespace

std::optional<FileStamp> StampOfFile(const std::string& inPath) {
  const HANDLE file =
      CreateFileW(WidePath(inPath).c_str(), FILE_READ_ATTRIBUTES,
                  FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE, nullptr, OPEN_EXISTING,
                  FILE_FLAG_BACKUP_SEMANTICS, nullptr);  // a folder too
  if (file == INVALID_HANDLE_VALUE) return std::nullopt;
  const auto stamp = StampOf(file);
  CloseHandle(file);
  return stamp;
}

FileStamp StampOfOpen(int inDescriptor, const std::string& /*inName*/) {
  return StampOf(HandleOf(inDescriptor)).value_or(FileStamp());
}

std::int64_t FileClockNow() {
  FILETIME now{};
  GetSystemTimePreciseAsFileTime(&now);
  return Nanoseconds(static_cast<std::int64_t>(Joined(now.dwHighDateTime, now.dwLowDateTime)));
}

Descriptor OpenForReading(const std::string& inPath, bool inMayBeStream) {
  Descriptor file(OpenShared(inPath, {}));
  if (!file.IsOpen() && errno == EISDIR) throw FileError(inPath, EISDIR, "is a directory");
  if (!file.IsOpen()) throw FileError(inPath, errno);
  if (GetFileType(HandleOf(file.Get())) != FILE_TYPE_DISK && !inMayBeStream)
    throw FileError(inPath, ESPIPE, "is not a regular file");
  return file;
}

Descriptor OpenForAppending(const std::string& inPath) {
  Descriptor file(OpenShared(inPath, {GENERIC_WRITE, OPEN_EXISTING, true}));
  if (!file.IsOpen()) throw FileError(inPath, errno);
  return file;
}

Descriptor OpenCut(const std::string& inPath, std::uint64_t inSize) {
  const DWORD attributes = GetFileAttributesW(WidePath(inPath).c_str());
  if (attributes != INVALID_FILE_ATTRIBUTES && (attributes & FILE_ATTRIBUTE_REPARSE_POINT) != 0)
    throw FileError(inPath, ELOOP);
  Descriptor file(OpenShared(inPath, {GENERIC_READ | GENERIC_WRITE, OPEN_ALWAYS, true}));
  if (!file.IsOpen()) throw FileError(inPath, errno);
  LARGE_INTEGER size{};
  size.QuadPart = static_cast<LONGLONG>(inSize);
  const HANDLE handle = HandleOf(file.Get());
  if (SetFilePointerEx(handle, size, nullptr, FILE_BEGIN) == FALSE || SetEndOfFile(handle) == FALSE)
    throw FileError(inPath, ErrorNumberOf(GetLastError()));
  return file;
}

std::FILE* OpenStream(const std::string& inPath) {
  return _wfopen(WidePath(inPath).c_str(), L"wb");
}

}  // namespace ZORFoundation
