// The full scanner: a library of its own, which is loaded for the first document that needs it.
#ifndef ZOR_DEFAULT_PLATFORM_XML_FULLSCANNER_H
#define ZOR_DEFAULT_PLATFORM_XML_FULLSCANNER_H

#include <cstdint>
#include <string>
#include <string_view>

#include "default_platform/xml/ByteSource.h"

/// What a scanner reports of a document, in document order.
class ScanSink {
 public:
  using Name = std::uint32_t;

  /// A document type; null views for what it lacks.
  struct Doctype {
    Name name;
    std::u16string_view publicId, systemId, internalSubset;
  };

  virtual Name InternName(std::u16string_view inName) = 0;
  virtual void StartElement(Name inName) = 0;
  /// Of the element started last.
  virtual void AddAttribute(Name inName, std::u16string_view inValue) = 0;
  virtual void EndElement() = 0;
  /// @param inKind a DOM_Node::NodeType without children.
  virtual void AddLeaf(int inKind, Name inName, std::u16string_view inText) = 0;
  /// Again whenever more of it is known.
  virtual void SetDoctype(const Doctype& inDoctype) = 0;

 protected:
  ~ScanSink() = default;
};

/// Where and why a document is refused; the line is 0 when there is no place.
struct ScanFailure {
  std::uint64_t line = 0;
  std::uint64_t column = 0;
  std::string reason;
};

/// Reads a document of any kind. An empty one, or one of white space alone, has no root.
/// @param inName what the library's messages may call the document by.
/// @return false, with outFailure, for a document that is refused. Raises what the reader and the
/// sink raise.
using ScanAnyDocument = bool(ByteReader& ioReader, const char* inName, ScanSink& ioSink,
                             ScanFailure& outFailure);
inline constexpr const char* kFullScannerFile = "ZORXmlScanner";
inline constexpr const char* kFullScannerName = "ZORScanAnyDocument";

#endif
