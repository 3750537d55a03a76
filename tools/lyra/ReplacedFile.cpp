#include "lyra/ReplacedFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <vector>

#include "lyra/CommandErrors.h"
#include "platform/system/ZORFile.h"
#include "toolkit/records/DocumentText.h"

namespace fs = std::filesystem;

namespace lyra {
using namespace ZORToolkit;
namespace {

const char* ReasonOf(HRESULT inResult) {
  switch (inResult) {
    case kZORFileNotFound:
      return std::strerror(ENOENT);
    case kZORFileAccessDenied:
      return std::strerror(EACCES);
    case kZORFileDiskFull:
      return std::strerror(ENOSPC);
    default:
      return "the file could not be written";
  }
}

unsigned int ModeOfNewFiles() {
  const mode_t mask = umask(0);
  umask(mask);
  return 0666 & ~mask;
}

std::string DirectoryOf(const std::string& inPath) {
  const fs::path parent = fs::path(inPath).parent_path();
  return parent.empty() ? "." : parent.string();
}

}  // namespace

ReplacedFile::ReplacedFile(const std::string& inPath) : path_(inPath) {
  struct stat status {};
  const bool exists = inPath != "-" && stat(inPath.c_str(), &status) == 0;
  if (exists && S_ISDIR(status.st_mode)) Fail(EISDIR);
  if (inPath == "-" || (exists && !S_ISREG(status.st_mode))) {
    std::error_code ignored;
    const fs::path directory = fs::temp_directory_path(ignored);
    MakeTemporary(directory.empty() ? "/tmp" : directory.string(), 0600);
    return;
  }
  if (exists && access(inPath.c_str(), W_OK) != 0) Fail(errno);
  target_ = exists ? fs::canonical(inPath).string() : inPath;
  MakeTemporary(DirectoryOf(target_), exists ? status.st_mode & 07777 : ModeOfNewFiles());
}

ReplacedFile::~ReplacedFile() {
  if (descriptor_ >= 0) close(descriptor_);
  if (!temporary_.empty()) unlink(temporary_.c_str());
  removedAtSignal_.reset();  // while the name is still there
}

void ReplacedFile::Fail(int inErrorNumber) const {
  throw InputError(path_ + ": " + std::strerror(inErrorNumber));
}

void ReplacedFile::MakeTemporary(const std::string& inDirectory, unsigned int inMode) {
  std::string pattern = inDirectory + "/.lyra-XXXXXX";
  descriptor_ = mkostemp(pattern.data(), O_CLOEXEC);
  if (descriptor_ < 0) Fail(errno);
  temporary_ = pattern;
  removedAtSignal_.emplace(temporary_.c_str());
  // A path goes through the library as text, which bytes that are no text do not survive.
  writtenPath_ =
      Utf8(FromUtf8(pattern)) == pattern ? pattern : "/proc/self/fd/" + std::to_string(descriptor_);
  if (fchmod(descriptor_, inMode) != 0) {
    const int reason = errno;
    unlink(temporary_.c_str());
    close(descriptor_);
    Fail(reason);
  }
}

void ReplacedFile::Check(HRESULT inResult) const {
  if (FAILED(inResult)) throw InputError(path_ + ": " + ReasonOf(inResult));
}

// Some file systems tell of a full disk only here.
void ReplacedFile::Synchronise() const {
  if (fsync(descriptor_) != 0) Fail(errno);
}

void ReplacedFile::CopyInto(Output& ioOutput) const {
  std::ifstream source(temporary_, std::ios::binary);
  const bool toStandardOutput = path_ == "-";
  std::FILE* const other = toStandardOutput ? nullptr : std::fopen(path_.c_str(), "wb");
  if (!toStandardOutput && other == nullptr) Fail(errno);
  std::vector<char> bytes(1 << 16);
  bool isWhole = true;
  while (source.read(bytes.data(), static_cast<std::streamsize>(bytes.size())) ||
         source.gcount() > 0) {
    const std::string_view part(bytes.data(), static_cast<std::size_t>(source.gcount()));
    if (toStandardOutput)
      ioOutput.Write(part);
    else
      isWhole = std::fwrite(part.data(), 1, part.size(), other) == part.size() && isWhole;
  }
  if (toStandardOutput) return;
  if (std::fclose(other) != 0 || !isWhole) Fail(errno);
}

void ReplacedFile::Finish(Output& ioOutput) {
  if (target_.empty()) {
    CopyInto(ioOutput);
    return;
  }
  Synchronise();
  if (std::rename(temporary_.c_str(), target_.c_str()) != 0) Fail(errno);
  removedAtSignal_.reset();
  temporary_.clear();
}

}  // namespace lyra
