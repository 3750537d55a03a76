// Xerces-C as the full scanner.
#ifndef ZOR_DEFAULT_PLATFORM_XML_FULL_SCANNER_XERCESSCANNER_H
#define ZOR_DEFAULT_PLATFORM_XML_FULL_SCANNER_XERCESSCANNER_H

#include <array>
#include <optional>
#include <string>
#include <unordered_map>
#include <vector>
#include <xercesc/parsers/SAXParser.hpp>
#include <xercesc/sax/HandlerBase.hpp>
#include <xercesc/util/SecurityManager.hpp>

#include "default_platform/xml/FullScanner.h"
#include "default_platform/xml/full_scanner/DoctypeRecorder.h"
#include "default_platform/xml/full_scanner/DocumentEntity.h"
#include "default_platform/xml/full_scanner/ScannerMemory.h"

/// Raised where the library would end the process.
struct LibraryPanic {};

/// Listens to Xerces-C's scanner and passes on what it reports: the library's own tree would take
/// five times the time and the memory. One object reads one document.
class XercesScanner : private xercesc::SAXParser {
 public:
  XercesScanner(ScannerMemory& ioMemory, ByteReader& ioReader, ScanSink& ioSink);
  ~XercesScanner() override;

  /// @param inName what the library's messages may call the text by.
  /// Raises ScanFailure, and what the reader and the sink raise.
  void Scan(const std::string& inName);

 private:
  using AttributeList = xercesc::RefVectorOf<xercesc::XMLAttr>;

  using Name = ScanSink::Name;

  // An element's name, and those of the attributes of the last one of its kind: the next one very
  // likely has the same ones in the same order.
  struct AttributeName {
    std::u16string text;
    Name name = 0;
  };
  struct ElementShape {
    Name name = 0;
    std::vector<AttributeName> attributes;
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

  // Passing it on
  void AddAttributes(ElementShape& ioShape, const AttributeList& inAttributes, XMLSize_t inCount);
  ElementShape& ShapeOf(const xercesc::XMLElementDecl& inElement);
  void FlushText();
  void AddLeaf(int inKind, Name inName, std::u16string_view inText);
  void Charge(std::uint64_t inUnits);
  void ChargeSubset();
  void RunScanner(const std::string& inName);
  [[noreturn]] void FailHere(const std::string& inReason) const;

  ByteReader& reader_;
  std::optional<DocumentEntity> entity_;
  ScanSink& sink_;
  xercesc::HandlerBase unused_;
  xercesc::SecurityManager limits_;

  std::uint32_t depth_ = 0;
  std::u16string text_;  // of the text node that is being read
  std::uint64_t charged_ = 0;
  std::size_t chargedSubset_ = 0;  // units of subset_
  std::unordered_map<const xercesc::XMLElementDecl*, ElementShape> shapes_;
  std::array<RecentShape, 64> recent_;  // of shapes_, found without a search

  ScanSink::Doctype doctype_{};
  std::u16string publicId_;
  std::u16string systemId_;
  DoctypeRecorder subset_;
};

#endif
