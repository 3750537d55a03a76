// A document's bytes as Xerces-C gets them.
#ifndef ZOR_DEFAULT_PLATFORM_XML_FULL_SCANNER_DOCUMENTENTITY_H
#define ZOR_DEFAULT_PLATFORM_XML_FULL_SCANNER_DOCUMENTENTITY_H

#include <string>
#include <xercesc/sax/InputSource.hpp>

#include "default_platform/xml/ByteSource.h"

/// Gives a reader to the library as its one and only entity. The library reads damaged bytes as if
/// nothing were wrong with them: it drops some sequences of UTF-8, and in encodings that it leaves
/// to ICU each bad byte becomes U+FFFD. Here it gets what it refuses instead.
class DocumentEntity : public xercesc::InputSource {
 public:
  /// Reads the beginning. Raises what the reader raises.
  DocumentEntity(ByteReader& ioReader, const std::string& inName);
  xercesc::BinInputStream* makeStream() const override;

  /// What is wrong with the bytes for which the library got a U+FFFF; empty so far without one.
  const std::string& Fault() const { return fault_; }

 private:
  ByteReader& reader_;
  std::string begin_;
  std::string encoding_;  // that is decoded here; empty for those that the library decodes
  mutable std::string fault_;
};

#endif
