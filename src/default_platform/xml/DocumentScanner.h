// From the XML library's scanner to a tree.
#ifndef ZOR_DEFAULT_PLATFORM_XML_DOCUMENTSCANNER_H
#define ZOR_DEFAULT_PLATFORM_XML_DOCUMENTSCANNER_H

#include <array>
#include <string>
#include <unordered_map>
#include <vector>
#include <xercesc/parsers/SAXParser.hpp>
#include <xercesc/sax/HandlerBase.hpp>
#include <xercesc/util/SecurityManager.hpp>

#include "default_platform/xml/ByteSource.h"
#include "default_platform/xml/DOM_HandleAccess.h"
#include "default_platform/xml/DoctypeRecorder.h"
#include "default_platform/xml/ScannerMemory.h"
#include "default_platform/xml/Utf8FastPath.h"

/// Where and why a scan ended; the line is 0 when there is no place.
struct ScanFailure {
  std::uint64_t line;
  std::uint64_t column;
  std::string reason;
};

/// Listens to the XML library's scanner and fills a tree with what it reports: the library's own
/// tree takes five times the time and the memory. One object reads one document.
class DocumentScanner : private xercesc::SAXParser {
 public:
  /// kUtf8: only UTF-8 without a document type, for which the library has a faster scanner. Both give
  /// the same tree of such documents.
  enum Kind { kUtf8, kAny };

  DocumentScanner(ScannerMemory& ioMemory, ByteReader& ioReader, Kind inKind);
  ~DocumentScanner() override;

  /// @param inName what the library's messages may call the text by.
  /// @return the document; without root when the text is empty. Raises ScanFailure; NeedsFullScanner for a
  /// document of another kind; ZORXMLParseError when the bytes cannot be read.
  DOM_Document Scan(const std::string& inName);

 private:
  using AttributeList = xercesc::RefVectorOf<xercesc::XMLAttr>;

  struct AttributeShape {
    DOM_Tree::Name name = 0;
    TextSeries values;
  };
  // The attributes of the last element of a kind: the next one very likely has the same ones in the
  // same order.
  struct ElementShape {
    DOM_Tree::Name name = 0;
    std::vector<AttributeShape> attributes;
  };
  struct RecentShape {
    const xercesc::XMLElementDecl* kind = nullptr;
    ElementShape* shape = nullptr;
  };

  // What the scanner reports
  void startElement(const xercesc::XMLElementDecl& inElement, const unsigned int inUri,
                    const XMLCh* const inPrefix, const AttributeList& inAttributes,
                    const XMLSize_t inCount, const bool inIsEmpty, const bool inIsRoot) override;
  void endElement(const xercesc::XMLElementDecl& inElement, const unsigned int inUri,
                  const bool inIsRoot, const XMLCh* const inPrefix) override;
  void docCharacters(const XMLCh* const inText, const XMLSize_t inCount,
                     const bool inIsSection) override;
  void ignorableWhitespace(const XMLCh* const inText, const XMLSize_t inCount,
                           const bool inIsSection) override;
  void docComment(const XMLCh* const inText) override;
  void docPI(const XMLCh* const inTarget, const XMLCh* const inData) override;
  void XMLDecl(const XMLCh* const inVersion, const XMLCh* const inEncoding,
               const XMLCh* const inStandalone, const XMLCh* const inActualEncoding) override;
  void startDocument() override {}
  void endDocument() override {}
  void startEntityReference(const xercesc::XMLEntityDecl&) override {}
  void endEntityReference(const xercesc::XMLEntityDecl&) override {}

  void doctypeDecl(const xercesc::DTDElementDecl& inElement, const XMLCh* const inPublicId,
                   const XMLCh* const inSystemId, const bool inHasSubset,
                   const bool inHasExternalSubset) override;
  void doctypeComment(const XMLCh* const inText) override;
  void doctypePI(const XMLCh* const inTarget, const XMLCh* const inData) override;
  void doctypeWhitespace(const XMLCh* const inText, const XMLSize_t inCount) override;
  void elementDecl(const xercesc::DTDElementDecl& inElement, const bool inIsIgnored) override;
  void startAttList(const xercesc::DTDElementDecl& inElement) override;
  void attDef(const xercesc::DTDElementDecl& inElement, const xercesc::DTDAttDef& inAttribute,
              const bool inIsIgnored) override;
  void endAttList(const xercesc::DTDElementDecl& inElement) override;
  void entityDecl(const xercesc::DTDEntityDecl& inEntity, const bool inIsParameter,
                  const bool inIsIgnored) override;
  void notationDecl(const xercesc::XMLNotationDecl& inNotation, const bool inIsIgnored) override;
  void startIntSubset() override {}
  void endIntSubset() override;

  void error(const unsigned int inCode, const XMLCh* const inDomain, const ErrTypes inType,
             const XMLCh* const inText, const XMLCh* const inSystemId,
             const XMLCh* const inPublicId, const XMLFileLoc inLine,
             const XMLFileLoc inColumn) override;
  xercesc::InputSource* resolveEntity(xercesc::XMLResourceIdentifier* inResource) override;

  // Filling the tree
  void CheckProlog() const;
  void AddAttributes(DOM_Tree::Node inElement, ElementShape& ioShape,
                     const AttributeList& inAttributes, XMLSize_t inCount);
  ElementShape& ShapeOf(const xercesc::XMLElementDecl& inElement);
  void FlushText();
  void Charge(std::uint64_t inUnits);
  void RunScanner(const std::string& inName);
  [[noreturn]] void FailHere(const std::string& inReason) const;

  ByteReader& reader_;
  const Kind kind_;
  Utf8FastPath utf8Text_;
  xercesc::HandlerBase unused_;
  xercesc::SecurityManager limits_;

  DOM_Document document_;
  DOM_Tree* tree_;
  DOM_Tree::Node current_ = DOM_Tree::kDocument;
  std::uint32_t depth_ = 0;
  std::u16string text_;  // of the text node that is being read
  std::uint64_t charged_ = 0;
  std::unordered_map<const xercesc::XMLElementDecl*, ElementShape> shapes_;
  std::array<RecentShape, 64> recent_;  // of shapes_, found without a search

  DocumentType doctype_;
  DoctypeRecorder subset_;
};

#endif
