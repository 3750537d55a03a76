#include "platform/xml/DOMParser.h"

#include <memory>

#include "default_platform/xml/ByteSource.h"
#include "default_platform/xml/DocumentScanner.h"
#include "platform/xml/ZORXMLParseError.h"
#include "platform/xml/ZORXMLParser.h"

namespace {

// Null for a document that the full scanner must read, which alone says what is wrong with one, and
// where.
DOM_Document ScanUtf8(ByteReader& ioReader) {
  try {
    ScannerMemory memory;
    return DocumentScanner(memory, ioReader, DocumentScanner::kUtf8).Scan("");
  } catch (const NeedsFullScanner&) {
    return DOM_Document();
  } catch (const ScanFailure&) {
    return DOM_Document();
  }
}

DOM_Document ScanDocument(ByteReader& ioReader, const std::string& inName) {
  if (FAILED(ZORXMLParser::Initialize()))
    throw ZORXMLParseError(inName, 0, 0, "the XML library cannot be prepared");
  const DOM_Document document = ScanUtf8(ioReader);
  if (!document.isNull()) return document;
  try {
    ioReader.Rewind();
    ScannerMemory memory;
    return DocumentScanner(memory, ioReader, DocumentScanner::kAny).Scan(inName);
  } catch (const ScanFailure& failure) {
    throw ZORXMLParseError(inName, failure.line, failure.column, failure.reason);
  }
}

std::string Message(const std::string& inSource, std::uint64_t inLine, std::uint64_t inColumn,
                    const std::string& inReason) {
  std::string place = inSource;
  if (inLine != 0) place.append(":").append(std::to_string(inLine));
  if (inColumn != 0) place.append(":").append(std::to_string(inColumn));
  return place.append(": ").append(inReason);
}

}  // namespace

DOMParser::DOMParser(XMLValidator*) {}

DOMParser::~DOMParser() = default;

void DOMParser::setDoValidation(bool) {}

void DOMParser::parse(const char* inPath) {
  const std::unique_ptr<ByteReader> reader = OpenFile(inPath);
  document_ = ScanDocument(*reader, inPath);
}

void DOMParser::parse(const InputSource& inSource) {
  const auto* const source = dynamic_cast<const MemorySource*>(&inSource);
  if (source == nullptr) throw ZORXMLParseError("", 0, 0, "a source that this parser cannot read");
  document_ = ScanDocument(*OpenMemory(*source), source->Identifier().ConvertToChar());
}

DOM_Document DOMParser::getDocument() const { return document_; }

ZORXMLParseError::ZORXMLParseError(const std::string& inSource, std::uint64_t inLine,
                                   std::uint64_t inColumn, const std::string& inReason)
    : std::runtime_error(Message(inSource, inLine, inColumn, inReason)),
      source(inSource),
      line(inLine),
      column(inColumn),
      reason(inReason) {}

ZORXMLParseError::~ZORXMLParseError() = default;
