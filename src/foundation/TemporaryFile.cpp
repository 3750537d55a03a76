#include "foundation/TemporaryFile.h"

#include <cerrno>
#include <filesystem>
#include <utility>

#include "foundation/FileCalls.h"
#include "foundation/Hash.h"

namespace fs = std::filesystem;

namespace ZORFoundation {
namespace {

constexpr std::string_view kTemporaryPrefix = ".zorlyra-";
constexpr std::size_t kTemporaryDigits = 16;

bool EndsInSeparator(std::string_view inPath) {
  return !inPath.empty() && kPathSeparators.find(inPath.back()) != std::string_view::npos;
}

}  // namespace

TemporaryFile::TemporaryFile(const std::string& inFolder, unsigned int inMode,
                             const std::string& inReportedPath)
    : reportedPath_(inReportedPath) {
  const std::string folder = inFolder + (EndsInSeparator(inFolder) ? "" : "/");
  do {
    path_ = folder + std::string(kTemporaryPrefix) + HexText(UniqueNumber());
    removeOnSignal_.emplace(path_.c_str());  // first, so that no signal falls between
    descriptor_ = OpenNew(path_, inMode);
  } while (descriptor_ < 0 && errno == EEXIST);
  if (descriptor_ < 0) throw FileError(reportedPath_, errno);
}

TemporaryFile::~TemporaryFile() {
  Close();
  if (!path_.empty()) RemoveFile(path_.c_str());
}

std::string TemporaryFile::Utf8Path() { return Utf8PathOf(descriptor_, path_); }

void TemporaryFile::Write(std::string_view inBytes) {
  std::size_t written = 0;
  const int error = WriteAll(descriptor_, inBytes, written);
  if (error != 0) throw FileError(reportedPath_, error);
}

int TemporaryFile::Reopen() {
  const int reopened = ReopenIfReplaced(descriptor_, path_);
  if (reopened < 0) throw FileError(reportedPath_, errno);
  if (reopened != descriptor_) Close();
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

Descriptor NewMemoryFile(std::string_view inBytes) {
  Descriptor file(OpenInMemory());
  std::size_t written = 0;
  const int error = file.IsOpen() ? WriteAll(file.Get(), inBytes, written) : errno;
  if (error != 0) throw FileError("a file in memory", error);
  return file;
}

ScratchFolder::ScratchFolder() {
  const std::string folder = fs::temp_directory_path().string();
  int error = 0;
  do {
    path_ = folder + "/lyra-" + HexText(UniqueNumber());
    error = MakeOwnFolder(path_);
  } while (error == EEXIST);
  if (error != 0) throw FileError(path_, error);
}

ScratchFolder::~ScratchFolder() {
  std::error_code ignored;
  fs::remove_all(path_, ignored);
}

}  // namespace ZORFoundation
