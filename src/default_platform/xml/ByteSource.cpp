#include "default_platform/xml/ByteSource.h"

#include <algorithm>
#include <cstring>

#include "foundation/ReadWholeFile.h"
#include "platform/xml/ZORXMLParseError.h"

InputSource::~InputSource() = default;

MemorySource::MemorySource(const unsigned char* inBytes, unsigned int inCount,
                           const ZORUnicodeString& inIdentifier, bool inAdopt)
    : bytes_(inBytes), count_(inCount), identifier_(inIdentifier), adopted_(inAdopt) {}

MemorySource::~MemorySource() {
  if (adopted_) delete[] bytes_;
}

namespace {

class FileReader : public ByteReader {
 public:
  explicit FileReader(const char* inPath) : path_(inPath) {
    Try([&] { file_ = ZORFoundation::OpenForReading(path_); });
  }

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
    Try([&] { ZORFoundation::Rewind(file_.Get(), path_); });
    hasFirst_ = false;
    isFirstDelivered_ = false;
  }

  std::size_t FromFile(unsigned char* outBytes, std::size_t inMax) {
    std::size_t count = 0;
    Try([&] { count = ZORFoundation::ReadSome(file_.Get(), outBytes, inMax, path_); });
    return count;
  }

  template <class Act>
  void Try(const Act& inAct) const {
    try {
      inAct();
    } catch (const ZORFoundation::FileError& error) {
      throw ZORXMLParseError(path_, 0, 0, error.Reason());
    }
  }

  std::string path_;
  ZORFoundation::Descriptor file_;
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
