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

namespace fs = std::filesystem;

namespace lyra {
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

/// A file that is closed with the scope.
struct Descriptor {
  explicit Descriptor(int inNumber) : number(inNumber) {}
  ~Descriptor() {
    if (number >= 0) close(number);
  }
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;
  int number;
};

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
  if (!temporary_.empty()) unlink(temporary_.c_str());
}

void ReplacedFile::Fail(int inErrorNumber) const {
  throw InputError(path_ + ": " + std::strerror(inErrorNumber));
}

void ReplacedFile::MakeTemporary(const std::string& inDirectory, unsigned int inMode) {
  std::string pattern = inDirectory + "/.lyra-XXXXXX";
  const Descriptor file(mkostemp(pattern.data(), O_CLOEXEC));
  if (file.number < 0) Fail(errno);
  temporary_ = pattern;
  if (fchmod(file.number, inMode) != 0) Fail(errno);
}

void ReplacedFile::Check(HRESULT inResult) const {
  if (FAILED(inResult)) throw InputError(path_ + ": " + ReasonOf(inResult));
}

// Some file systems tell of a full disk only here.
void ReplacedFile::Synchronise() const {
  const Descriptor file(open(temporary_.c_str(), O_RDWR | O_CLOEXEC));
  if (file.number < 0 || fsync(file.number) != 0) Fail(errno);
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
  temporary_.clear();
}

}  // namespace lyra
