// The short way from bytes to the scanner, for the texts that nearly all documents are.
#ifndef ZOR_DEFAULT_PLATFORM_XML_PLAINTEXT_H
#define ZOR_DEFAULT_PLATFORM_XML_PLAINTEXT_H

#include <cstddef>
#include <memory>
#include <string_view>
#include <xercesc/sax/InputSource.hpp>

#include "default_platform/xml/ByteSource.h"

/// Raised for a text that the short way does not take.
struct NotPlain {};

/// The UTF-8 text of a reader as UTF-16. Raises NotPlain for bytes that are no UTF-8, for a text that
/// declares another encoding and for one that holds U+FFFD, which here stands for broken bytes.
class PlainText {
 public:
  explicit PlainText(ByteReader& ioReader);
  /// @param inMost at least 4. @return the number of units put to outUnits; 0 at the end only.
  std::size_t Read(char16_t* outUnits, std::size_t inMost);
  /// Whether there may be a document type declaration in what has been read so far.
  bool MayHaveDoctype() const;

 private:
  static constexpr std::size_t kMostBytes = std::size_t{24} * 1024;  // of one read

  std::string_view NextBytes(std::size_t inMost);
  std::string_view WithoutMark(std::string_view inText);

  ByteReader& reader_;
  std::unique_ptr<char[]> bytes_;
  std::size_t filled_ = 0;  // of bytes_
  std::size_t used_ = 0;    // of these, decoded
  std::string_view last_;   // what was decoded last
  std::size_t reads_ = 0;
};

/// Gives a text to the XML library as its one and only entity.
class PlainEntity : public xercesc::InputSource {
 public:
  explicit PlainEntity(PlainText& ioText);
  xercesc::BinInputStream* makeStream() const override;

 private:
  PlainText& text_;
};

#endif
