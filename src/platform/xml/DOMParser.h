// The parser that builds documents.
#ifndef ZOR_PLATFORM_XML_DOMPARSER_H
#define ZOR_PLATFORM_XML_DOMPARSER_H

#include "ZORPlatformExport.h"
#include "platform/xml/DOM_Document.h"
#include "platform/xml/InputSource.h"

class XMLValidator;  // none exists: a parser is always built without one

/// Builds a document from a file or an input source. A malformed document raises ZORXMLParseError;
/// an empty one gives a document without root. A document type is read but never enforced; nothing
/// it refers to is ever opened. Entities declared inside the document are expanded up to a limit.
/// Every encoding of the XML library is read, with and without byte-order mark.
class ZOR_PLATFORM_EXPORT DOMParser {
 public:
  /// @param inValidator null.
  explicit DOMParser(XMLValidator* inValidator = nullptr);
  ~DOMParser();
  DOMParser(const DOMParser&) = delete;
  DOMParser& operator=(const DOMParser&) = delete;

  /// @param inValidate false; true is accepted and means the same, since there is no validator.
  void setDoValidation(bool inValidate);
  /// Parses a regular file. Raises ZORXMLParseError, also when the path cannot be opened or is not
  /// a regular file; then the document of an earlier parse stays.
  void parse(const char* inPath);
  void parse(const InputSource& inSource);
  /// The document of the last successful parse; null before any.
  DOM_Document getDocument() const;

 private:
  DOM_Document document_;
};

#endif
