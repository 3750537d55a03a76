// The files of Windows: what ReadWholeFile.cpp is elsewhere, for stamps and for opening.
#include <io.h>

#include <algorithm>
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

FileStamp StampOfOpen(int inDescriptor) {
  return StampOf(HandleOf(inDescriptor)).value_or(FileStamp());
}

void CheckSize(std::uint64_t inSize, std::uint64_t inMaxSize, const std::string& inPath) {
  if (inSize > inMaxSize) throw FileError(inPath, EFBIG);
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

std::size_t ReadSome(int inDescriptor, void* outBytes, std::size_t inMax,
                     const std::string& inName) {
  constexpr std::size_t kMost = 1 << 30;
  const int count = _read(inDescriptor, outBytes, static_cast<unsigned>(std::min(inMax, kMost)));
  if (count < 0) throw FileError(inName, errno);
  return static_cast<std::size_t>(count);
}

void Rewind(int inDescriptor, const std::string& inName) {
  if (_lseeki64(inDescriptor, 0, SEEK_SET) != 0) throw FileError(inName, errno);
}

std::string ReadToEnd(int inDescriptor, const std::string& inName, std::uint64_t inMaxSize) {
  std::string bytes;
  // Growing step by step would copy large files several times.
  if (const std::uint64_t size = StampOfOpen(inDescriptor).size; size > 0) {
    CheckSize(size, inMaxSize, inName);
    bytes.reserve(static_cast<std::size_t>(size));
  }
  char part[1 << 16];
  while (const std::size_t count = ReadSome(inDescriptor, part, sizeof part, inName)) {
    bytes.append(part, count);
    CheckSize(bytes.size(), inMaxSize, inName);
  }
  return bytes;
}

WholeFile ReadWholeFile(const std::string& inPath, const ReadOptions& inOptions) {
  const Descriptor file = OpenForReading(inPath, inOptions.mayBeStream);
  WholeFile whole;
  whole.before = StampOfOpen(file.Get());
  whole.bytes = ReadToEnd(file.Get(), inPath, inOptions.maxSize);
  whole.after = StampOfOpen(file.Get());
  return whole;
}

std::optional<WholeFile> TryReadWholeFile(const std::string& inPath, const ReadOptions& inOptions) {
  try {
    return ReadWholeFile(inPath, inOptions);
  } catch (const FileError&) {
    return std::nullopt;
  }
}

}  // namespace ZORFoundation
