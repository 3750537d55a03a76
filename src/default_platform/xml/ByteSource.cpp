#include "default_platform/xml/ByteSource.h"

#include <fcntl.h>
#include <sys/stat.h>
#ifdef _WIN32
#include <io.h>

#include <cstdio>
#else
#include <unistd.h>
#endif

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

std::size_t ByteReader::Read(unsigned char* outBytes, std::size_t inMost) {
  const std::size_t count = DoRead(outBytes, inMost);
  given_ += count;
  return count;
}

void ByteReader::Rewind() {
  DoRewind();
  given_ = 0;
}

namespace {

#ifdef _WIN32
constexpr int kOpenFlags = _O_RDONLY | _O_BINARY;
using FileStatus = struct _stat64;
int OpenDescriptor(const char* inPath) { return _open(inPath, kOpenFlags); }
int StatusOf(int inFile, FileStatus* outStatus) { return _fstat64(inFile, outStatus); }
std::ptrdiff_t ReadSome(int inFile, void* outBytes, std::size_t inMost) {
  return _read(inFile, outBytes, static_cast<unsigned int>(inMost));
}
bool SeekStart(int inFile) { return _lseeki64(inFile, 0, SEEK_SET) == 0; }
void CloseDescriptor(int inFile) { _close(inFile); }
bool IsDirectory(const FileStatus& inStatus) { return (inStatus.st_mode & _S_IFMT) == _S_IFDIR; }
bool IsRegular(const FileStatus& inStatus) { return (inStatus.st_mode & _S_IFMT) == _S_IFREG; }
#else
// Without O_NONBLOCK, opening a pipe would wait for its writer.
constexpr int kOpenFlags = O_RDONLY | O_NONBLOCK | O_CLOEXEC | O_NOCTTY;
using FileStatus = struct stat;
int OpenDescriptor(const char* inPath) { return open(inPath, kOpenFlags); }
int StatusOf(int inFile, FileStatus* outStatus) { return fstat(inFile, outStatus); }
std::ptrdiff_t ReadSome(int inFile, void* outBytes, std::size_t inMost) {
  return read(inFile, outBytes, inMost);
}
bool SeekStart(int inFile) { return lseek(inFile, 0, SEEK_SET) == 0; }
void CloseDescriptor(int inFile) { close(inFile); }
bool IsDirectory(const FileStatus& inStatus) { return S_ISDIR(inStatus.st_mode); }
bool IsRegular(const FileStatus& inStatus) { return S_ISREG(inStatus.st_mode); }
#endif

class FileReader : public ByteReader {
 public:
  explicit FileReader(const char* inPath) : path_(inPath), file_(OpenDescriptor(inPath)) {
    if (file_ < 0) FailWithErrno();
    FileStatus status;
    if (StatusOf(file_, &status) != 0) CloseAndFail(std::generic_category().message(errno));
    if (IsDirectory(status)) CloseAndFail("is a directory");
    if (!IsRegular(status)) CloseAndFail("is not a regular file");
  }
  ~FileReader() override { CloseDescriptor(file_); }
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
  std::size_t DoRead(unsigned char* outBytes, std::size_t inMost) override {
    if (IsEmpty() || inMost == 0) return 0;
    if (isFirstGiven_) return FromFile(outBytes, inMost);
    isFirstGiven_ = true;
    outBytes[0] = first_;
    return 1 + FromFile(outBytes + 1, inMost - 1);
  }

  void DoRewind() override {
    if (!SeekStart(file_)) FailWithErrno();
    hasFirst_ = false;
    isFirstGiven_ = false;
  }

  std::size_t FromFile(unsigned char* outBytes, std::size_t inMost) {
    std::ptrdiff_t count = 0;
    do {
      count = ReadSome(file_, outBytes, inMost);
    } while (count < 0 && errno == EINTR);
    if (count < 0) FailWithErrno();
    return static_cast<std::size_t>(count);
  }

  [[noreturn]] void FailWithErrno() const {
    throw ZORXMLParseError(path_, 0, 0, std::generic_category().message(errno));
  }
  [[noreturn]] void CloseAndFail(const std::string& inReason) const {
    CloseDescriptor(file_);
    throw ZORXMLParseError(path_, 0, 0, inReason);
  }

  std::string path_;
  int file_;
  // One byte read ahead tells an empty file from others; its stated size may be a lie.
  unsigned char first_ = 0;
  bool hasFirst_ = false;
  bool isFirstGiven_ = false;
  bool isEmpty_ = false;
};

class MemoryReader : public ByteReader {
 public:
  MemoryReader(const unsigned char* inBytes, std::size_t inCount)
      : bytes_(inBytes), count_(inCount), left_(inCount) {}
  bool IsEmpty() override { return count_ == 0; }

 private:
  std::size_t DoRead(unsigned char* outBytes, std::size_t inMost) override {
    const std::size_t count = std::min(inMost, left_);
    if (count != 0) std::memcpy(outBytes, bytes_ + (count_ - left_), count);
    left_ -= count;
    return count;
  }
  void DoRewind() override { left_ = count_; }

  const unsigned char* bytes_;
  std::size_t count_;
  std::size_t left_;
};

class ReaderStream : public xercesc::BinInputStream {
 public:
  explicit ReaderStream(ByteReader& ioReader) : reader_(ioReader) {}
  XMLFilePos curPos() const override { return reader_.Given(); }
  XMLSize_t readBytes(XMLByte* const outBytes, const XMLSize_t inMost) override {
    return reader_.Read(outBytes, inMost);
  }
  const XMLCh* getContentType() const override { return nullptr; }

 private:
  ByteReader& reader_;
};

}  // namespace

std::unique_ptr<ByteReader> OpenFile(const char* inPath) {
  if (inPath == nullptr) throw ZORXMLParseError("", 0, 0, "no path");
  return std::make_unique<FileReader>(inPath);
}

std::unique_ptr<ByteReader> OpenMemory(const MemorySource& inSource) {
  return std::make_unique<MemoryReader>(inSource.Bytes(), inSource.Count());
}

ReaderEntity::ReaderEntity(ByteReader& ioReader, const std::string& inName) : reader_(ioReader) {
  const ZORUnicodeString name(inName.c_str());
  const std::u16string terminated(name.ConvertToUCChar(),
                                  static_cast<std::size_t>(name.GetLengthInChar()));
  setSystemId(terminated.c_str());
}

xercesc::BinInputStream* ReaderEntity::makeStream() const { return new ReaderStream(reader_); }
