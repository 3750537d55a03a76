// UTF-8 documents without a document type, which nearly all are, decoded for a faster scanner.
#ifndef ZOR_DEFAULT_PLATFORM_XML_UTF8FASTPATH_H
#define ZOR_DEFAULT_PLATFORM_XML_UTF8FASTPATH_H

#include <cstddef>
#include <memory>
#include <string_view>
#include <xercesc/sax/InputSource.hpp>

#include "default_platform/xml/ByteSource.h"

/// Raised for a text that the fast path does not take.
struct NeedsFullScanner {};

/// The UTF-8 text of a reader as UTF-16. Raises NeedsFullScanner for bytes that are no UTF-8, for a text that
/// declares another encoding and for one that holds U+FFFD, which here stands for broken bytes.
class Utf8FastPath {
 public:
  explicit Utf8FastPath(ByteReader& ioReader);
  /// @param inMax at least 4. @return the number of units put to outUnits; 0 at the end only.
  std::size_t Read(char16_t* outUnits, std::size_t inMax);
  /// Whether there may be a document type declaration in what has been read so far.
  bool MayHaveDoctype() const;

 private:
  static constexpr std::size_t kMaxBytes = std::size_t{24} * 1024;  // of one read

  std::string_view NextBytes(std::size_t inMax);
  std::string_view WithoutMark(std::string_view inText);

  ByteReader& reader_;
  std::unique_ptr<char[]> bytes_;
  std::size_t filled_ = 0;  // of bytes_
  std::size_t used_ = 0;    // of these, decoded
  std::string_view last_;   // what was decoded last
  std::size_t reads_ = 0;
};

/// Gives a text to the XML library as its one and only entity.
class Utf8Entity : public xercesc::InputSource {
 public:
  explicit Utf8Entity(Utf8FastPath& ioText);
  xercesc::BinInputStream* makeStream() const override;

 private:
  Utf8FastPath& text_;
};

#endif
