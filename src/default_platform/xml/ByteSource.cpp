#include "default_platform/xml/ByteSource.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <system_error>

#include "platform/xml/ZORXMLParseError.h"

InputSource::~InputSource() = default;

MemorySource::MemorySource(const unsigned char* inBytes, unsigned int inCount,
                           const ZORUnicodeString& inIdentifier, bool inAdopt)
    : bytes_(inBytes), count_(inCount), identifier_(inIdentifier), adopted_(inAdopt) {}

MemorySource::~MemorySource() {
  if (adopted_) delete[] bytes_;
}

namespace {

// Without O_NONBLOCK, opening a pipe would wait for its writer.
constexpr int kOpenFlags = O_RDONLY | O_NONBLOCK | O_CLOEXEC | O_NOCTTY;

class FileReader : public ByteReader {
 public:
  explicit FileReader(const char* inPath) : path_(inPath), file_(open(inPath, kOpenFlags)) {
    if (file_ < 0) FailWithErrno();
    struct stat status;
    if (fstat(file_, &status) != 0) CloseAndFail(std::generic_category().message(errno));
    if (S_ISDIR(status.st_mode)) CloseAndFail("is a directory");
    if (!S_ISREG(status.st_mode)) CloseAndFail("is not a regular file");
  }
  ~FileReader() override { close(file_); }
  FileReader(const FileReader&) = delete;
  FileReader& operator=(const FileReader&) = delete;

  bool IsEmpty() override {
    if (!hasFirst_) {
      hasFirst_ = true;
      isEmpty_ = FromFile(&first_, 1) == 0;
    }
    return isEmpty_;
  }

 private:
  std::size_t DoRead(unsigned char* outBytes, std::size_t inMax) override {
    if (IsEmpty() || inMax == 0) return 0;
    if (isFirstDelivered_) return FromFile(outBytes, inMax);
    isFirstDelivered_ = true;
    outBytes[0] = first_;
    return 1 + FromFile(outBytes + 1, inMax - 1);
  }

  void DoRewind() override {
    if (lseek(file_, 0, SEEK_SET) != 0) FailWithErrno();
    hasFirst_ = false;
    isFirstDelivered_ = false;
  }

  std::size_t FromFile(unsigned char* outBytes, std::size_t inMax) {
    std::ptrdiff_t count = 0;
    do {
      count = read(file_, outBytes, inMax);
    } while (count < 0 && errno == EINTR);
    if (count < 0) FailWithErrno();
    return static_cast<std::size_t>(count);
  }

  [[noreturn]] void FailWithErrno() const {
    throw ZORXMLParseError(path_, 0, 0, std::generic_category().message(errno));
  }
  [[noreturn]] void CloseAndFail(const std::string& inReason) const {
    close(file_);
    throw ZORXMLParseError(path_, 0, 0, inReason);
  }

  std::string path_;
  int file_;
  // One byte read ahead tells an empty file from others; its stated size may be a lie.
  unsigned char first_ = 0;
  bool hasFirst_ = false;
  bool isFirstDelivered_ = false;
  bool isEmpty_ = false;
};

class MemoryReader : public ByteReader {
 public:
  MemoryReader(const unsigned char* inBytes, std::size_t inCount)
      : bytes_(inBytes), count_(inCount), left_(inCount) {}
  bool IsEmpty() override { return count_ == 0; }

 private:
  std::size_t DoRead(unsigned char* outBytes, std::size_t inMax) override {
    const std::size_t count = std::min(inMax, left_);
    if (count != 0) std::memcpy(outBytes, bytes_ + (count_ - left_), count);
    left_ -= count;
    return count;
  }
  void DoRewind() override { left_ = count_; }

  const unsigned char* bytes_;
  std::size_t count_;
  std::size_t left_;
};

}  // namespace

std::unique_ptr<ByteReader> OpenFile(const char* inPath) {
  if (inPath == nullptr) throw ZORXMLParseError("", 0, 0, "no path");
  return std::make_unique<FileReader>(inPath);
}

std::unique_ptr<ByteReader> OpenMemory(const MemorySource& inSource) {
  return std::make_unique<MemoryReader>(inSource.Bytes(), inSource.Count());
}
