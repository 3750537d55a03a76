// Atomic replacement on Windows: ReplaceFile keeps the access list, attributes and streams of the
// old file, and refuses while another program has it open without letting it be renamed. Then its
// bytes are overwritten where that program lets them be, and else the file stays as it is.
#include <io.h>

#include <atomic>
#include <cerrno>
#include <filesystem>

#include "foundation/AtomicFile.h"
#include "foundation/Hash.h"
#include "foundation/WindowsCalls.h"

namespace fs = std::filesystem;

namespace ZORFoundation {
namespace {

constexpr std::string_view kTemporaryPrefix = ".zorlyra-";
constexpr std::size_t kTemporaryDigits = 16;

std::string FolderOf(const std::string& inPath) {
  const std::size_t end = inPath.find_last_of("/\\:");  // "C:name" is relative to the drive
  return end == std::string::npos ? "./" : inPath.substr(0, end + 1);
}

std::uint64_t UniqueNumber() {
  static std::atomic<std::uint64_t> count = 0;
  LARGE_INTEGER ticks{};
  QueryPerformanceCounter(&ticks);
  Hash64 hash(++count);
  hash.Add(std::uint64_t{GetCurrentProcessId()});
  hash.Add(static_cast<std::uint64_t>(ticks.QuadPart));
  return hash.Get();
}

DWORD AttributesOf(const std::string& inPath) {
  return GetFileAttributesW(WidePath(inPath).c_str());
}

/// What a symbolic link leads to; the path itself for all else.
std::string FollowLinks(const std::string& inPath) {
  const DWORD attributes = AttributesOf(inPath);
  if (attributes == INVALID_FILE_ATTRIBUTES || (attributes & FILE_ATTRIBUTE_REPARSE_POINT) == 0)
    return inPath;
  const HANDLE file = CreateFileW(WidePath(inPath).c_str(), FILE_READ_ATTRIBUTES,
                                  FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE, nullptr,
                                  OPEN_EXISTING, FILE_FLAG_BACKUP_SEMANTICS, nullptr);
  if (file == INVALID_HANDLE_VALUE) throw FileError(inPath, ErrorNumberOf(GetLastError()));
  std::wstring target(32'768, L'\0');
  const DWORD length =
      GetFinalPathNameByHandleW(file, target.data(), static_cast<DWORD>(target.size()), 0);
  CloseHandle(file);
  if (length == 0 || length >= target.size()) return inPath;
  target.resize(length);
  return Utf8Text(target);
}

/// Makes one open file's bytes those of another. @return 0 or an errno value.
int Overwrite(int inSource, int inTarget) {
  if (_lseeki64(inSource, 0, SEEK_SET) != 0 || _lseeki64(inTarget, 0, SEEK_SET) != 0) return errno;
  if (const int error = CopyBytes(inSource, inTarget); error != 0) return error;
  const bool isCut = SetEndOfFile(HandleOf(inTarget)) != FALSE;
  return isCut && FlushFileBuffers(HandleOf(inTarget)) != FALSE ? 0 : ErrorNumberOf(GetLastError());
}

/// The old file gets a name of ours until it is gone: one that was made up by Windows could stay.
bool Replace(const std::wstring& inOld, const std::wstring& inNew) {
  const std::wstring former = inNew + L".old";
  const bool isDone = ReplaceFileW(inOld.c_str(), inNew.c_str(), former.c_str(),
                                   REPLACEFILE_IGNORE_MERGE_ERRORS, nullptr, nullptr) != FALSE;
  if (!isDone && GetFileAttributesW(inOld.c_str()) == INVALID_FILE_ATTRIBUTES)
    MoveFileExW(former.c_str(), inOld.c_str(), 0);
  else
    DeleteFileW(former.c_str());
  return isDone;
}

bool IsInUse(DWORD inError) {
  return inError == ERROR_SHARING_VIOLATION || inError == ERROR_ACCESS_DENIED ||
         inError == ERROR_UNABLE_TO_REMOVE_REPLACED || inError == ERROR_USER_MAPPED_FILE;
}

[[noreturn]] void RaiseInUse(const std::string& inPath) {
  throw FileError(inPath, EACCES, "is open in another program, which does not let it be written");
}

}  // namespace

TemporaryFile::TemporaryFile(const std::string& inFolder, unsigned int /*inMode*/,
                             const std::string& inReportedPath)
    : reportedPath_(inReportedPath) {
  const bool isClosed =
      !inFolder.empty() && std::string_view("/\\:").find(inFolder.back()) != std::string_view::npos;
  const std::string folder = inFolder + (isClosed ? "" : "/");
  do {
    path_ = folder + std::string(kTemporaryPrefix) + HexText(UniqueNumber());
    removeOnSignal_.emplace(path_.c_str());  // first, so that no signal falls between
    descriptor_ = OpenShared(path_, {GENERIC_READ | GENERIC_WRITE, CREATE_NEW, false});
  } while (descriptor_ < 0 && errno == EEXIST);
  if (descriptor_ < 0) throw FileError(reportedPath_, errno);
}

TemporaryFile::~TemporaryFile() {
  if (descriptor_ >= 0) _close(descriptor_);
  if (!path_.empty()) DeleteFileW(WidePath(path_).c_str());
}

std::string TemporaryFile::Utf8Path() const { return path_; }

void TemporaryFile::Write(std::string_view inBytes) {
  std::size_t written = 0;
  const int error = WriteAll(descriptor_, inBytes, written);
  if (error != 0) throw FileError(reportedPath_, error);
}

int TemporaryFile::Reopen() {
  const int reopened = OpenShared(path_, {GENERIC_READ | GENERIC_WRITE, OPEN_EXISTING, false});
  if (reopened < 0) throw FileError(reportedPath_, errno);
  if (descriptor_ >= 0) _close(descriptor_);
  return descriptor_ = reopened;
}

void TemporaryFile::Close() {
  if (descriptor_ >= 0) CloseDescriptor(std::exchange(descriptor_, -1));
}

bool TemporaryFile::IsTemporaryName(std::string_view inName) {
  return inName.starts_with(kTemporaryPrefix) &&
         inName.size() == kTemporaryPrefix.size() + kTemporaryDigits &&
         inName.find_first_not_of("0123456789abcdef", kTemporaryPrefix.size()) == inName.npos;
}

AtomicFile::AtomicFile(const std::string& inPath, const AtomicFileOptions& inOptions)
    : path_(inPath), target_(FollowLinks(inPath)), options_(inOptions) {
  CheckTarget();
  if (isStream_) {
    temporary_.emplace(fs::temp_directory_path().string(), 0, path_);
  } else {
    const bool isElsewhere = !options_.temporaryFolder.empty() && target_ == path_;
    temporary_.emplace(isElsewhere ? options_.temporaryFolder : FolderOf(target_), 0, path_);
  }
}

AtomicFile::~AtomicFile() = default;

// Opened rather than asked for: names such as NUL and COM1 are devices in every folder.
void AtomicFile::CheckTarget() {
  if (target_.empty()) throw FileError(path_, ENOENT);
  const DWORD attributes = AttributesOf(target_);
  const bool isFolder =
      attributes != INVALID_FILE_ATTRIBUTES && (attributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
  if (isFolder) throw FileError(path_, EISDIR);
  const bool isThere = attributes != INVALID_FILE_ATTRIBUTES;
  if (isThere && options_.mayReplace && (attributes & FILE_ATTRIBUTE_READONLY) != 0)
    throw FileError(path_, EACCES);
  const ZORFoundation::Descriptor target(
      OpenShared(target_, {GENERIC_WRITE, OPEN_EXISTING, false}));
  const int error = target.IsOpen() ? 0 : errno;
  if (error == ENOENT) {
    isNew_ = true;
    return;
  }
  if (!options_.mayReplace) throw FileError(path_, EEXIST);
  if (target.IsOpen()) {
    isStream_ = GetFileType(HandleOf(target.Get())) != FILE_TYPE_DISK;
    return;
  }
  if ((attributes & FILE_ATTRIBUTE_READONLY) == 0 && IsInUse(GetLastError())) RaiseInUse(path_);
  throw FileError(path_, error);
}

bool AtomicFile::KeepAttributes(int /*inDescriptor*/) const { return true; }

/// The old bytes are in a file of their own until the new ones are on the disk.
void AtomicFile::OverwriteTarget(int inDescriptor) const {
  const ZORFoundation::Descriptor target(
      OpenShared(target_, {GENERIC_READ | GENERIC_WRITE, OPEN_EXISTING, false}));
  if (!target.IsOpen()) RaiseInUse(path_);
  TemporaryFile former(FolderOf(target_), 0, path_);
  if (const int error = Overwrite(target.Get(), former.Descriptor()); error != 0)
    throw FileError(path_, error);
  const int error = Overwrite(inDescriptor, target.Get());
  if (error == 0) return;
  if (Overwrite(former.Descriptor(), target.Get()) == 0) throw FileError(path_, error);
  const std::string kept = former.Path();
  former.Release();
  throw FileError(path_, error, "is damaged; what it held is in " + kept);
}

void AtomicFile::Commit() {
  if (isStream_) {
    CopyIntoTarget();
    return;
  }
  const int descriptor = temporary_->Reopen();
  if (options_.isSynchronised && FlushFileBuffers(HandleOf(descriptor)) == FALSE)
    throw FileError(path_, ErrorNumberOf(GetLastError()));
  temporary_->Close();  // an open file is not renamed by every file system
  Rename();
}

void AtomicFile::Rename() {
  const std::wstring from = WidePath(temporary_->Path()), to = WidePath(target_);
  const bool isReplaced = !isNew_ && Replace(to, from);
  // Flushed to the disk; where there is no such file yet, or the file system cannot replace one.
  const DWORD flags =
      MOVEFILE_WRITE_THROUGH | (options_.mayReplace ? MOVEFILE_REPLACE_EXISTING : 0);
  if (isReplaced || MoveFileExW(from.c_str(), to.c_str(), flags) != FALSE) {
    temporary_->Release();
    return;
  }
  const DWORD error = GetLastError();
  if (!IsInUse(error)) throw FileError(path_, ErrorNumberOf(error));
  OverwriteTarget(temporary_->Reopen());
}

void AtomicFile::CopyIntoTarget() const {
  ZORFoundation::Descriptor target(OpenShared(target_, {GENERIC_WRITE, OPEN_EXISTING, false}));
  if (!target.IsOpen()) throw FileError(path_, errno);
  const ZORFoundation::Descriptor source(OpenShared(temporary_->Path(), {}));
  if (!source.IsOpen()) throw FileError(path_, errno);
  int error = CopyBytes(source.Get(), target.Get());
  const int closing = target.Close();
  if (error == 0) error = closing;
  if (error != 0) throw FileError(path_, error);
}

void WriteWholeFile(const std::string& inPath, std::string_view inBytes,
                    const AtomicFileOptions& inOptions) {
  AtomicFile file(inPath, inOptions);
  file.Write(inBytes);
  file.Commit();
}

}  // namespace ZORFoundation
