#include "platform/xml/DOMParser.h"

#include <memory>

#include "default_platform/xml/ByteSource.h"
#include "default_platform/xml/DocumentScanner.h"
#include "platform/xml/ZORXMLParseError.h"
#include "platform/xml/ZORXMLParser.h"

namespace {

DOM_Document ScanDocument(ByteReader& ioReader, const std::string& inName) {
  if (FAILED(ZORXMLParser::Initialize()))
    throw ZORXMLParseError(inName, 0, 0, "the XML library cannot be prepared");
  try {
    ScannerMemory memory;
    return DocumentScanner(memory, ioReader).Scan();
  } catch (const ScanFailure& failure) {
    throw ZORXMLParseError(inName, failure.line, failure.column, failure.reason);
  }
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
