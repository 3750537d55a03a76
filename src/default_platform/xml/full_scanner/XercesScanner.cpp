#include "default_platform/xml/full_scanner/XercesScanner.h"

#include <new>
#include <string_view>
#include <xercesc/framework/XMLErrorCodes.hpp>
#include <xercesc/internal/XMLScanner.hpp>
#include <xercesc/sax/Locator.hpp>
#include <xercesc/util/OutOfMemoryException.hpp>
#include <xercesc/util/PlatformUtils.hpp>
#include <xercesc/util/XMLUniDefs.hpp>

#include "default_platform/xml/full_scanner/DocumentEntity.h"
#include "foundation/PluginFunction.h"
#include "foundation/Utf8.h"
#include "platform/xml/DOM_Node.h"

namespace {

constexpr std::uint32_t kMaxDepth = 1'000'000;
constexpr std::uint64_t kMaxTextUnits = std::uint64_t{128} * 1024 * 1024;
constexpr XMLSize_t kMaxExpansions = 50'000;

// Entities and default attributes may add so much to the text that the bytes hold.
constexpr std::uint64_t kMaxMultiplied = std::uint64_t{8} * 1024 * 1024;
constexpr std::uint64_t kUnitsOfNode = 4;  // "<a/>"
constexpr std::uint64_t kUnitsOfAttribute = 4;

constexpr std::size_t kMaxReason = 400;  // a name in a message may be as long as the document
constexpr std::u16string_view kWrapper = u"Message:";

struct EmptyDocument {};

std::u16string_view View(const char16_t* inText) {
  return inText == nullptr ? std::u16string_view() : std::u16string_view(inText);
}

/// A reason of the library as one line of narrow text.
std::string OneLineReason(const char16_t* inText) {
  std::u16string text = inText == nullptr ? u"" : inText;
  // The library wraps its own exceptions as "An exception occurred! Type:…, Message:…".
  const std::size_t wrapped = text.find(kWrapper);
  if (wrapped != std::u16string::npos && text.starts_with(u"An exception occurred"))
    text.erase(0, wrapped + kWrapper.size());
  if (text.size() > kMaxReason) text = text.substr(0, kMaxReason) + u"…";
  for (char16_t& unit : text)
    if (unit < u' ' || unit == 0x7F || unit == 0x85 || unit == 0x2028 || unit == 0x2029)
      unit = u' ';
  if (text.empty()) return "the XML library gives no reason";
  std::string reason(ZORFoundation::Utf8Length(text), '\0');
  ZORFoundation::EncodeUtf8(text, reason.data());
  return reason;
}

}  // namespace

XercesScanner::XercesScanner(ScannerMemory& ioMemory, ByteReader& ioReader, ScanSink& ioSink)
    : xercesc::SAXParser(nullptr, &ioMemory), reader_(ioReader), sink_(ioSink) {
  setValidationScheme(Val_Never);
  setDoNamespaces(false);
  setDoSchema(false);
  setLoadExternalDTD(false);
  setLoadSchema(false);
  setDisableDefaultEntityResolution(true);
  setExitOnFirstFatalError(true);
  limits_.setEntityExpansionLimit(kMaxExpansions);
  setSecurityManager(&limits_);
  // The handlers are never called, since this class answers first; they make the scanner report.
  setDocumentHandler(&unused_);
  setDTDHandler(&unused_);
  setErrorHandler(&unused_);
  setEntityResolver(&unused_);
  ioMemory.SetPlace(getScanner().getLocator());
}

XercesScanner::~XercesScanner() = default;

void XercesScanner::Scan(const std::string& inName) {
  try {
    RunScanner(inName);
  } catch (const EmptyDocument&) {
    return;  // nothing was reported
  }
}

void XercesScanner::RunScanner(const std::string& inName) {
  try {
    entity_.emplace(reader_, inName);
    parse(*entity_);
  } catch (const ScannerMemoryExhausted& failure) {
    throw ScanFailure{failure.line, failure.column, failure.reason};
  } catch (const xercesc::OutOfMemoryException&) {
    throw ScanFailure{0, 0, "out of memory"};
  } catch (const std::bad_alloc&) {
    throw ScanFailure{0, 0, "out of memory"};
  } catch (const LibraryPanic&) {
    throw ScanFailure{0, 0, "the XML library gave up"};
  } catch (const xercesc::XMLException& failure) {
    throw ScanFailure{0, 0, OneLineReason(failure.getMessage())};
  } catch (const xercesc::SAXException& failure) {
    throw ScanFailure{0, 0, OneLineReason(failure.getMessage())};
  } catch (const std::length_error& failure) {
    throw ScanFailure{0, 0, failure.what()};
  }
}

void XercesScanner::FailHere(const std::string& inReason) const {
  const xercesc::Locator* const place = getScanner().getLocator();
  throw ScanFailure{place->getLineNumber(), place->getColumnNumber(), inReason};
}

void XercesScanner::Charge(std::uint64_t inUnits) {
  charged_ += inUnits;
  if (charged_ > reader_.BytesRead() + kMaxMultiplied)
    FailHere("entities or default attributes expand to too much text");
}

// ---- content

void XercesScanner::startElement(const xercesc::XMLElementDecl& inElement, const unsigned int,
                                 const XMLCh* const, const AttributeList& inAttributes,
                                 const XMLSize_t inCount, const bool inIsEmpty, const bool) {
  FlushText();
  Charge(kUnitsOfNode);
  ElementShape& shape = ShapeOf(inElement);
  sink_.StartElement(shape.name);
  AddAttributes(shape, inAttributes, inCount);
  if (inIsEmpty) return sink_.EndElement();
  if (++depth_ > kMaxDepth) FailHere("elements are nested deeper than 1,000,000");
}

XercesScanner::ElementShape& XercesScanner::ShapeOf(const xercesc::XMLElementDecl& inElement) {
  // Declarations lie a few hundred bytes apart.
  const auto place = reinterpret_cast<std::uintptr_t>(&inElement);
  RecentShape& recent = recent_[((place >> 5) ^ (place >> 11)) % recent_.size()];
  if (recent.kind == &inElement) return *recent.shape;
  ElementShape& shape = shapes_[&inElement];
  if (shape.name == 0) shape.name = sink_.InternName(View(inElement.getFullName()));
  recent = {&inElement, &shape};
  return shape;
}

void XercesScanner::AddAttributes(ElementShape& ioShape, const AttributeList& inAttributes,
                                  XMLSize_t inCount) {
  if (ioShape.attributes.size() < inCount) ioShape.attributes.resize(inCount);
  for (XMLSize_t position = 0; position < inCount; ++position) {
    const xercesc::XMLAttr& attribute = *inAttributes.elementAt(position);
    AttributeName& known = ioShape.attributes[position];
    if (known.name == 0 || known.text != attribute.getName())
      known = {attribute.getName(), sink_.InternName(attribute.getName())};
    const std::u16string_view value = View(attribute.getValue());
    Charge(kUnitsOfAttribute + value.size());
    sink_.AddAttribute(known.name, value);
  }
}

void XercesScanner::endElement(const xercesc::XMLElementDecl&, const unsigned int, const bool,
                               const XMLCh* const) {
  FlushText();
  sink_.EndElement();
  --depth_;
}

void XercesScanner::docCharacters(const XMLCh* const inText, const XMLSize_t inCount,
                                  const bool inIsSection) {
  if (depth_ == 0) return;  // white space around the root
  Charge(inCount);
  if (inIsSection) {
    FlushText();
    return sink_.AddLeaf(DOM_Node::CDATA_SECTION_NODE, 0, {inText, inCount});
  }
  if (text_.size() + inCount > kMaxTextUnits) FailHere("a text is too large");
  text_.append(inText, inCount);
}

void XercesScanner::ignorableWhitespace(const XMLCh* const inText, const XMLSize_t inCount,
                                        const bool inIsSection) {
  docCharacters(inText, inCount, inIsSection);
}

void XercesScanner::FlushText() {
  if (text_.empty()) return;
  sink_.AddLeaf(DOM_Node::TEXT_NODE, 0, text_);
  text_.clear();
}

void XercesScanner::AddLeaf(int inKind, Name inName, std::u16string_view inText) {
  FlushText();
  Charge(kUnitsOfNode + inText.size());
  sink_.AddLeaf(inKind, inName, inText);
}

void XercesScanner::docComment(const XMLCh* const inText) {
  AddLeaf(DOM_Node::COMMENT_NODE, 0, View(inText));
}

void XercesScanner::docPI(const XMLCh* const inTarget, const XMLCh* const inData) {
  AddLeaf(DOM_Node::PROCESSING_INSTRUCTION_NODE, sink_.InternName(View(inTarget)), View(inData));
}

// The scanner accepts any version that begins with "1.".
void XercesScanner::XMLDecl(const XMLCh* const inVersion, const XMLCh* const, const XMLCh* const,
                            const XMLCh* const) {
  const std::u16string_view version = View(inVersion);
  if (version.find_first_not_of(u"0123456789", 2) != std::u16string_view::npos || version == u"1.")
    FailHere("the XML version is not a number");
}

// ---- document type

// Entities may multiply declarations too.
void XercesScanner::ChargeSubset() {
  const std::size_t units = subset_.Text().size();
  Charge(units - chargedSubset_);
  chargedSubset_ = units;
}

void XercesScanner::doctypeDecl(const xercesc::DTDElementDecl& inElement,
                                const XMLCh* const inPublicId, const XMLCh* const inSystemId,
                                const bool, const bool) {
  doctype_.name = sink_.InternName(View(inElement.getFullName()));
  publicId_ = View(inPublicId);
  if (!publicId_.empty()) doctype_.publicId = publicId_;
  systemId_ = View(inSystemId);
  if (inSystemId != nullptr) doctype_.systemId = systemId_;
  sink_.SetDoctype(doctype_);
}

void XercesScanner::doctypeComment(const XMLCh* const inText) {
  subset_.AddComment(inText);
  ChargeSubset();
}

void XercesScanner::doctypePI(const XMLCh* const inTarget, const XMLCh* const inData) {
  subset_.AddProcessingInstruction(inTarget, inData);
  ChargeSubset();
}

void XercesScanner::doctypeWhitespace(const XMLCh* const inText, const XMLSize_t inCount) {
  subset_.AddWhitespace(inText, inCount);
  ChargeSubset();
}

void XercesScanner::elementDecl(const xercesc::DTDElementDecl& inElement, const bool) {
  subset_.AddElement(inElement);
  ChargeSubset();
}

void XercesScanner::startAttList(const xercesc::DTDElementDecl& inElement) {
  subset_.StartAttributes(inElement);
}

void XercesScanner::attDef(const xercesc::DTDElementDecl&, const xercesc::DTDAttDef& inAttribute,
                           const bool) {
  subset_.AddAttribute(inAttribute);
  ChargeSubset();
}

void XercesScanner::endAttList(const xercesc::DTDElementDecl&) { subset_.EndAttributes(); }

void XercesScanner::entityDecl(const xercesc::DTDEntityDecl& inEntity, const bool inIsParameter,
                               const bool) {
  subset_.AddEntity(inEntity, inIsParameter);
  ChargeSubset();
}

void XercesScanner::notationDecl(const xercesc::XMLNotationDecl& inNotation, const bool) {
  subset_.AddNotation(inNotation);
  ChargeSubset();
}

void XercesScanner::endIntSubset() {
  doctype_.internalSubset = subset_.Text();
  sink_.SetDoctype(doctype_);
}

// ---- failures

void XercesScanner::error(const unsigned int inCode, const XMLCh* const inDomain,
                          const ErrTypes inType, const XMLCh* const inText, const XMLCh* const,
                          const XMLCh* const, const XMLFileLoc inLine, const XMLFileLoc inColumn) {
  if (inType != ErrType_Fatal) return;  // a document type that is not enforced
  if (inCode == xercesc::XMLErrs::EmptyMainEntity &&
      View(inDomain) == View(xercesc::XMLUni::fgXMLErrDomain))
    throw EmptyDocument();
  if (View(inText).find(u"FFFF") != std::u16string_view::npos && !entity_->Fault().empty())
    throw ScanFailure{inLine, inColumn, entity_->Fault()};
  throw ScanFailure{inLine, inColumn, OneLineReason(inText)};
}

xercesc::InputSource* XercesScanner::resolveEntity(xercesc::XMLResourceIdentifier*) {
  FailHere("external entities are not opened");
}

// ---- the library's entry

namespace {

// Unless told otherwise, the library ends the whole process.
class ThrowingPanicHandler final : public xercesc::PanicHandler {
  void panic(const PanicReasons) override { throw LibraryPanic(); }
};

// Never ended: documents may be read while the process ends. Never tried again: what a failure leaves
// behind is half prepared.
bool PrepareLibrary() {
  static const bool isReady = [] {
    try {
      static ThrowingPanicHandler panicHandler;
      xercesc::XMLPlatformUtils::Initialize(xercesc::XMLUni::fgXercescDefaultLocale, nullptr,
                                            &panicHandler);
      return true;
    } catch (...) {  // the library raises several types that have nothing in common
      return false;
    }
  }();
  return isReady;
}

}  // namespace

ZOR_PLUGIN_FUNCTION bool ZORScanAnyDocument(ByteReader& ioReader, const char* inName,
                                            ScanSink& ioSink, ScanFailure& outFailure) {
  try {
    if (!PrepareLibrary()) throw ScanFailure{0, 0, "the XML library cannot be prepared"};
    ScannerMemory memory;
    XercesScanner(memory, ioReader, ioSink).Scan(inName);
    return true;
  } catch (const ScanFailure& failure) {
    outFailure = failure;
  } catch (const xercesc::OutOfMemoryException&) {  // no std::exception, which hosts expect
    throw std::bad_alloc();
  } catch (const LibraryPanic&) {
    throw std::bad_alloc();  // the only reason left once the library is prepared
  }
  return false;
}
