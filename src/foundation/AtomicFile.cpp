#include "foundation/AtomicFile.h"

#include <stdio.h>
#include <unistd.h>

#include <cerrno>
#include <filesystem>

#include "foundation/FileCalls.h"

namespace fs = std::filesystem;

namespace ZORFoundation {
namespace {

std::string FolderOf(const std::string& inPath) {
  const std::size_t end = inPath.find_last_of(kPathSeparators);
  return end == std::string::npos ? "./" : inPath.substr(0, end + 1);
}

/// Makes one open file's bytes those of another. @return 0 or an errno value.
int Overwrite(int inSource, int inTarget) {
  if (lseek(inSource, 0, SEEK_SET) != 0 || lseek(inTarget, 0, SEEK_SET) != 0) return errno;
  if (const int error = CopyBytes(inSource, inTarget); error != 0) return error;
  if (const int error = CutHere(inTarget); error != 0) return error;
  return FlushToDisk(inTarget);
}

}  // namespace

AtomicFile::AtomicFile(const std::string& inPath, const AtomicFileOptions& inOptions)
    : path_(inPath), target_(FollowLinks(inPath)), options_(inOptions) {
  CheckTarget();
  constexpr unsigned int kOwnerOnly = 0600;
  if (isStream_) {
    std::error_code ignored;
    const fs::path folder = fs::temp_directory_path(ignored);
    temporary_.emplace(folder.empty() ? "/tmp" : folder.string(), kOwnerOnly, path_);
  } else {
    const bool isElsewhere = !options_.temporaryFolder.empty() && target_ == path_;
    temporary_.emplace(isElsewhere ? options_.temporaryFolder : FolderOf(target_),
                       isNew_ ? options_.modeOfNew : kOwnerOnly, path_);
  }
}

AtomicFile::~AtomicFile() = default;

void AtomicFile::Commit() {
  if (isStream_) {
    CopyIntoTarget();
    return;
  }
  const int descriptor = temporary_->Reopen();
  if (!isNew_ && !KeepAttributes(descriptor)) return OverwriteTarget(descriptor);
  if (options_.isSynchronised) {
    // Some file systems report a full disk only here.
    if (const int error = FlushToDisk(descriptor); error != 0) throw FileError(path_, error);
  }
  Rename();
}

/// The old bytes are in a file of their own until the new ones are on the disk.
void AtomicFile::OverwriteTarget(int inDescriptor) const {
  const ZORFoundation::Descriptor target(OpenExisting(target_));
  if (!target.IsOpen()) throw WhyNotOpened(path_);
  TemporaryFile former(FolderOf(target_), 0600, path_);
  if (const int error = Overwrite(target.Get(), former.Descriptor()); error != 0)
    throw FileError(path_, error);
  int failure = 0;
  bool isPutBack = false;
  WithSignalsHeld([&] {
    failure = Overwrite(inDescriptor, target.Get());
    isPutBack = failure != 0 && Overwrite(former.Descriptor(), target.Get()) == 0;
  });
  if (failure == 0) return;
  if (isPutBack) throw FileError(path_, failure);
  const std::string kept = former.Path();
  former.Release();
  throw FileError(path_, failure, "is damaged; what it held is in " + kept);
}

void AtomicFile::CopyIntoTarget() const {
  ZORFoundation::Descriptor target(OpenToWrite(target_));
  if (!target.IsOpen()) throw FileError(path_, errno);
  const ZORFoundation::Descriptor source(OpenToRead(temporary_->Path()));
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
