#include "default_platform/xml/full_scanner/XercesScanner.h"

#include <algorithm>
#include <new>
#include <string_view>
#include <xercesc/framework/XMLErrorCodes.hpp>
#include <xercesc/internal/XMLScanner.hpp>
#include <xercesc/sax/InputSource.hpp>
#include <xercesc/sax/Locator.hpp>
#include <xercesc/util/BinInputStream.hpp>
#include <xercesc/util/OutOfMemoryException.hpp>
#include <xercesc/util/PlatformUtils.hpp>
#include <xercesc/util/XMLUniDefs.hpp>

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

bool IsSameIgnoringCase(std::string_view inA, std::string_view inLower) {
  return std::equal(
      inA.begin(), inA.end(), inLower.begin(), inLower.end(),
      [](char inUnit, char inSmall) { return inUnit == inSmall || (inUnit | 0x20) == inSmall; });
}

/// Whether a document that begins so is in UTF-8.
bool IsUtf8(std::string_view inBegin) {
  constexpr std::string_view kMark = "\xEF\xBB\xBF";
  if (inBegin.starts_with(kMark)) inBegin.remove_prefix(kMark.size());
  if (inBegin.empty() || std::string_view("< \t\r\n").find(inBegin[0]) == std::string_view::npos ||
      (inBegin.size() > 1 && inBegin[1] == '\0'))
    return false;
  if (!inBegin.starts_with("<?xml")) return true;
  const std::string_view declaration = inBegin.substr(0, inBegin.find("?>"));
  const std::size_t encoding = declaration.find("encoding");
  if (encoding == std::string_view::npos) return true;
  const std::size_t quote = declaration.find_first_of("'\"", encoding);
  if (quote == std::string_view::npos) return true;
  const std::size_t end = declaration.find(declaration[quote], quote + 1);
  const std::string_view name = declaration.substr(quote + 1, end - quote - 1);
  return IsSameIgnoringCase(name, "utf-8") || IsSameIgnoringCase(name, "utf8");
}

/// Whether a byte begins a sequence of UTF-8 beyond Unicode, as far as its bytes are there.
bool IsBeyondUnicode(const XMLByte* inPlace, const XMLByte* inEnd) {
  if (*inPlace < 0xF5 || *inPlace > 0xF7) return false;
  const XMLByte* const end = std::min(inPlace + 4, inEnd);
  return std::all_of(inPlace + 1, end, [](XMLByte inByte) { return (inByte & 0xC0) == 0x80; });
}

/// Hands bytes to the library. In UTF-8 it drops sequences that begin with F5 to F7, which are beyond
/// Unicode: it gets a byte instead that it refuses.
class ReaderStream : public xercesc::BinInputStream {
 public:
  explicit ReaderStream(ByteReader& ioReader) : reader_(ioReader) {}
  XMLFilePos curPos() const override { return reader_.BytesRead(); }
  XMLSize_t readBytes(XMLByte* const outBytes, const XMLSize_t inMax) override {
    const bool isFirst = reader_.BytesRead() == 0;
    const std::size_t kept = held_.size();
    std::copy(held_.begin(), held_.end(), outBytes);
    held_.clear();
    const std::size_t added = reader_.Read(outBytes + kept, inMax - kept);
    XMLByte* const end = outBytes + kept + added;
    if (isFirst) isUtf8_ = IsUtf8({reinterpret_cast<const char*>(outBytes), added});
    if (!isUtf8_) return kept + added;
    for (XMLByte* at = outBytes; at != end; ++at) {
      if (!IsBeyondUnicode(at, end)) continue;
      if (end - at < 4 && added != 0 && at != outBytes) {  // the rest of it comes next
        held_.assign(at, end);
        return static_cast<XMLSize_t>(at - outBytes);
      }
      if (end - at >= 4) *at = 0xFF;
    }
    return kept + added;
  }
  const XMLCh* getContentType() const override { return nullptr; }

 private:
  ByteReader& reader_;
  bool isUtf8_ = false;
  std::vector<XMLByte> held_;
};

/// Gives a reader to the library as its one and only entity.
class ReaderEntity : public xercesc::InputSource {
 public:
  ReaderEntity(ByteReader& ioReader, const std::string& inName) : reader_(ioReader) {
    std::u16string name(inName.size(), u'\0');
    name.resize(ZORFoundation::DecodeUtf8(inName, name.data()));
    setSystemId(name.c_str());
  }
  xercesc::BinInputStream* makeStream() const override { return new ReaderStream(reader_); }

 private:
  ByteReader& reader_;
};

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
    parse(ReaderEntity(reader_, inName));
  } catch (const ScannerMemoryExhausted& failure) {
    throw ScanFailure{failure.line, failure.column, failure.reason};
  } catch (const xercesc::OutOfMemoryException&) {
    throw ScanFailure{0, 0, "out of memory"};
  } catch (const std::bad_alloc&) {
    throw ScanFailure{0, 0, "out of memory"};
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
  throw ScanFailure{inLine, inColumn, OneLineReason(inText)};
}

xercesc::InputSource* XercesScanner::resolveEntity(xercesc::XMLResourceIdentifier*) {
  FailHere("external entities are not opened");
}

// ---- the library's entry

namespace {

// Never ended: documents may be read while the process ends.
bool PrepareLibrary() {
  static const bool isReady = [] {
    try {
      xercesc::XMLPlatformUtils::Initialize();
      return true;
    } catch (const xercesc::XMLException&) {
      return false;
    }
  }();
  return isReady;
}

}  // namespace

extern "C" __attribute__((visibility("default"))) bool ZORScanAnyDocument(ByteReader& ioReader,
                                                                          const char* inName,
                                                                          ScanSink& ioSink,
                                                                          ScanFailure& outFailure) {
  try {
    if (!PrepareLibrary()) throw ScanFailure{0, 0, "the XML library cannot be prepared"};
    ScannerMemory memory;
    XercesScanner(memory, ioReader, ioSink).Scan(inName);
    return true;
  } catch (const ScanFailure& failure) {
    outFailure = failure;
    return false;
  }
}
