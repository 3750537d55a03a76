// The bytes that a parser reads.
#ifndef ZOR_DEFAULT_PLATFORM_XML_BYTESOURCE_H
#define ZOR_DEFAULT_PLATFORM_XML_BYTESOURCE_H

#include <cstdint>
#include <memory>
#include <string>

#include "platform/system/ZORUnicodeString.h"
#include "platform/xml/InputSource.h"

/// A document in memory, as ZORXMLParser makes it.
class MemorySource : public InputSource {
 public:
  MemorySource(const unsigned char* inBytes, unsigned int inCount,
               const ZORUnicodeString& inIdentifier, bool inAdopt);
  ~MemorySource() override;
  MemorySource(const MemorySource&) = delete;
  MemorySource& operator=(const MemorySource&) = delete;

  const unsigned char* Bytes() const { return bytes_; }
  unsigned int Count() const { return count_; }
  const ZORUnicodeString& Identifier() const { return identifier_; }

 private:
  const unsigned char* bytes_;
  unsigned int count_;
  ZORUnicodeString identifier_;
  bool adopted_;
};

/// What a scanner reads from: bytes in order, counted.
class ByteReader {
 public:
  virtual ~ByteReader() = default;
  /// @return the number of bytes put to outBytes; 0 at the end only.
  std::size_t Read(unsigned char* outBytes, std::size_t inMax) {
    const std::size_t count = DoRead(outBytes, inMax);
    bytesRead_ += count;
    return count;
  }
  std::uint64_t BytesRead() const { return bytesRead_; }
  /// Whether there is nothing to read at all.
  virtual bool IsEmpty() = 0;
  /// Begins again.
  void Rewind() {
    DoRewind();
    bytesRead_ = 0;
  }

 private:
  virtual std::size_t DoRead(unsigned char* outBytes, std::size_t inMax) = 0;
  virtual void DoRewind() = 0;
  std::uint64_t bytesRead_ = 0;
};

/// A regular file. Raises ZORXMLParseError for anything else: a pipe could keep the reader waiting
/// for ever.
std::unique_ptr<ByteReader> OpenFile(const char* inPath);
std::unique_ptr<ByteReader> OpenMemory(const MemorySource& inSource);

#endif
