// Atomic replacement on Windows: ReplaceFile keeps the access list, attributes and streams of the
// old file, and refuses while another program has it open without letting it be renamed. Then its
// bytes are overwritten where that program lets them be, and else the file stays as it is.
#include <cerrno>

#include "foundation/AtomicFile.h"
#include "foundation/FileCalls.h"
#include "foundation/WindowsCalls.h"

namespace ZORFoundation {
namespace {

DWORD AttributesOf(const std::string& inPath) {
  return GetFileAttributesW(WidePath(inPath).c_str());
}

/// Removes what another program may still have open, as one does that replaces it too.
void RemoveWhenFree(const std::wstring& inPath) {
  for (int i = 0; i < kTriesWhileInUse; ++i) {
    if (DeleteFileW(inPath.c_str()) != FALSE || !IsInUse(GetLastError())) return;
    Sleep(kMillisecondsBetweenTries);
  }
}

/// The old file gets a name of ours until it is gone: one that was made up by Windows could stay.
bool Replace(const std::wstring& inOld, const std::wstring& inNew) {
  const std::wstring former = inNew + L".old";
  const bool isDone = ReplaceFileW(inOld.c_str(), inNew.c_str(), former.c_str(),
                                   REPLACEFILE_IGNORE_MERGE_ERRORS, nullptr, nullptr) != FALSE;
  const auto isThere = [&] { return GetFileAttributesW(inOld.c_str()) != INVALID_FILE_ATTRIBUTES; };
  // Another program may be putting its own there.
  for (int i = 0; i < kTriesWhileInUse && !isDone && !isThere(); ++i) {
    if (MoveFileExW(former.c_str(), inOld.c_str(), 0) != FALSE) return false;
    Sleep(kMillisecondsBetweenTries);
  }
  if (isDone || isThere()) RemoveWhenFree(former);
  return isDone;
}

}  // namespace

std::string AtomicFile::FollowLinks(const std::string& inPath) {
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
  const ZORFoundation::Descriptor target(OpenToWrite(target_));
  isNew_ = !target.IsOpen() && errno == ENOENT;
  if (isNew_) return;
  if (!options_.mayReplace) throw FileError(path_, EEXIST);
  if (!target.IsOpen()) throw WhyNotOpened(path_);
  isStream_ = GetFileType(HandleOf(target.Get())) != FILE_TYPE_DISK;
}

// ReplaceFile does.
bool AtomicFile::KeepAttributes(int /*inDescriptor*/) const { return true; }

void AtomicFile::Rename() {
  temporary_->Close();  // an open file is not renamed by every file system
  const std::wstring from = WidePath(temporary_->Path()), to = WidePath(target_);
  // Flushed to the disk; where there is no such file yet, or the file system cannot replace one.
  const DWORD flags =
      MOVEFILE_WRITE_THROUGH | (options_.mayReplace ? MOVEFILE_REPLACE_EXISTING : 0);
  for (int i = 0; i < kTriesWhileInUse; ++i) {
    const bool isReplaced = !isNew_ && Replace(to, from);
    if (isReplaced || MoveFileExW(from.c_str(), to.c_str(), flags) != FALSE) {
      temporary_->Release();
      return;
    }
    const DWORD error = GetLastError();
    if (!IsInUse(error)) throw FileError(path_, ErrorNumberOf(error));
    Sleep(kMillisecondsBetweenTries);
  }
  OverwriteTarget(temporary_->Reopen());
}

}  // namespace ZORFoundation
