#include "platform/xml/DOMParser.h"

#include <memory>

#include "default_platform/xml/ByteSource.h"
#include "default_platform/xml/DocumentScanner.h"
#include "platform/xml/ZORXMLParseError.h"
#include "platform/xml/ZORXMLParser.h"

namespace {

// The short way; null for a document that must go the long one. That one alone tells what is wrong
// with a document, and where.
DOM_Document ScanPlainDocument(ByteReader& ioReader) {
  try {
    ScannerMemory memory;
    return DocumentScanner(memory, ioReader, DocumentScanner::kPlain).Scan("");
  } catch (const NotPlain&) {
    return DOM_Document();
  } catch (const ScanFailure&) {
    return DOM_Document();
  }
}

DOM_Document ScanDocument(ByteReader& ioReader, const std::string& inName) {
  if (FAILED(ZORXMLParser::Initialize()))
    throw ZORXMLParseError(inName, 0, 0, "the XML library cannot be prepared");
  const DOM_Document plain = ScanPlainDocument(ioReader);
  if (!plain.isNull()) return plain;
  try {
    ioReader.Rewind();
    ScannerMemory memory;
    return DocumentScanner(memory, ioReader, DocumentScanner::kAny).Scan(inName);
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
