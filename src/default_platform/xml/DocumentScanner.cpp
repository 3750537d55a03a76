#include "default_platform/xml/DocumentScanner.h"

#include <new>
#include <string_view>
#include <xercesc/framework/XMLErrorCodes.hpp>
#include <xercesc/internal/XMLScanner.hpp>
#include <xercesc/sax/Locator.hpp>
#include <xercesc/util/OutOfMemoryException.hpp>
#include <xercesc/util/XMLUniDefs.hpp>

#include "platform/xml/ZORXMLParseError.h"

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

bool IsSame(std::u16string_view inKnown, const char16_t* inText) {
  for (const char16_t unit : inKnown)
    if (*inText++ != unit) return false;
  return *inText == 0;
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
  ZORUnicodeString reason;
  reason.BuildFromUTF16(text.data(), text.size());
  return reason.ConvertToChar();
}

}  // namespace

DocumentScanner::DocumentScanner(ScannerMemory& ioMemory, ByteReader& ioReader, Kind inKind)
    : xercesc::SAXParser(nullptr, &ioMemory),
      reader_(ioReader),
      kind_(inKind),
      utf8Text_(ioReader),
      document_(DOM_Document::createDocument()),
      tree_(DOM_HandleAccess::TreeOf(document_)) {
  if (kind_ == kUtf8) useScanner(xercesc::XMLUni::fgWFXMLScanner);
  setValidationScheme(Val_Never);
  setDoNamespaces(false);
  setDoSchema(false);
  setLoadExternalDTD(false);
  setLoadSchema(false);
  setDisableDefaultEntityResolution(true);
  setExitOnFirstFatalError(true);
  limits_.setEntityExpansionLimit(kMaxExpansions);
  // The scanner for well-formed text knows no entities but "&amp;" and its like, yet would count
  // them.
  if (kind_ == kAny) setSecurityManager(&limits_);
  // The handlers are never called, since this class answers first; they make the scanner report.
  setDocumentHandler(&unused_);
  setDTDHandler(&unused_);
  setErrorHandler(&unused_);
  setEntityResolver(&unused_);
  ioMemory.SetPlace(getScanner().getLocator());
}

DocumentScanner::~DocumentScanner() = default;

DOM_Document DocumentScanner::Scan(const std::string& inName) {
  if (reader_.IsEmpty()) return document_;
  try {
    RunScanner(inName);
  } catch (const EmptyDocument&) {
    return DOM_Document::createDocument();
  }
  return document_;
}

void DocumentScanner::RunScanner(const std::string& inName) {
  try {
    if (kind_ == kUtf8)
      parse(Utf8Entity(utf8Text_));
    else
      parse(ReaderEntity(reader_, inName));
  } catch (const ScannerMemoryExhausted& failure) {
    throw ScanFailure{failure.line, failure.column,
                      "a name, value or text is too large, or there are too many names"};
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

void DocumentScanner::FailHere(const std::string& inReason) const {
  const xercesc::Locator* const place = getScanner().getLocator();
  throw ScanFailure{place->getLineNumber(), place->getColumnNumber(), inReason};
}

void DocumentScanner::Charge(std::uint64_t inUnits) {
  charged_ += inUnits;
  if (charged_ > reader_.BytesRead() + kMaxMultiplied)
    FailHere("entities or default attributes expand to too much text");
}

// ---- content

// The scanner for well-formed text skips a document type.
void DocumentScanner::CheckProlog() const {
  if (kind_ == kUtf8 && utf8Text_.MayHaveDoctype()) throw NeedsFullScanner();
}

void DocumentScanner::startElement(const xercesc::XMLElementDecl& inElement, const unsigned int,
                                   const XMLCh* const, const AttributeList& inAttributes,
                                   const XMLSize_t inCount, const bool inIsEmpty,
                                   const bool inIsRoot) {
  if (inIsRoot) CheckProlog();
  FlushText();
  Charge(kUnitsOfNode);
  ElementShape& shape = ShapeOf(inElement);
  const DOM_Tree::Node element =
      tree_->AppendNew(current_, DOM_Node::ELEMENT_NODE, shape.name, nullptr);
  AddAttributes(element, shape, inAttributes, inCount);
  if (inIsEmpty) return;
  if (++depth_ > kMaxDepth) FailHere("elements are nested deeper than 1,000,000");
  current_ = element;
}

DocumentScanner::ElementShape& DocumentScanner::ShapeOf(const xercesc::XMLElementDecl& inElement) {
  // Declarations lie a few hundred bytes apart.
  const auto place = reinterpret_cast<std::uintptr_t>(&inElement);
  RecentShape& recent = recent_[((place >> 5) ^ (place >> 11)) % recent_.size()];
  if (recent.kind == &inElement) return *recent.shape;
  ElementShape& shape = shapes_[&inElement];
  if (shape.name == 0) shape.name = tree_->InternName(View(inElement.getFullName()));
  recent = {&inElement, &shape};
  return shape;
}

void DocumentScanner::AddAttributes(DOM_Tree::Node inElement, ElementShape& ioShape,
                                    const AttributeList& inAttributes, XMLSize_t inCount) {
  if (ioShape.attributes.size() < inCount) ioShape.attributes.resize(inCount);
  DOM_Tree::Attribute last = 0;
  for (XMLSize_t position = 0; position < inCount; ++position) {
    const xercesc::XMLAttr& attribute = *inAttributes.elementAt(position);
    AttributeShape& shape = ioShape.attributes[position];
    if (shape.name == 0 || !IsSame(tree_->NameText(shape.name)->View(), attribute.getName()))
      shape = {tree_->InternName(View(attribute.getName())), {}};
    const std::u16string_view value = View(attribute.getValue());
    Charge(kUnitsOfAttribute + value.size());
    last =
        tree_->AppendNewAttribute(inElement, last, shape.name, tree_->AddText(value, shape.values));
  }
}

void DocumentScanner::endElement(const xercesc::XMLElementDecl&, const unsigned int, const bool,
                                 const XMLCh* const) {
  FlushText();
  current_ = tree_->At(current_).parent;
  --depth_;
}

void DocumentScanner::docCharacters(const XMLCh* const inText, const XMLSize_t inCount,
                                    const bool inIsSection) {
  if (depth_ == 0) return;  // white space around the root
  Charge(inCount);
  if (inIsSection) {
    FlushText();
    tree_->AppendNew(current_, DOM_Node::CDATA_SECTION_NODE, 0, tree_->AddText({inText, inCount}));
    return;
  }
  if (text_.size() + inCount > kMaxTextUnits) FailHere("a text is too large");
  text_.append(inText, inCount);
}

void DocumentScanner::ignorableWhitespace(const XMLCh* const inText, const XMLSize_t inCount,
                                          const bool inIsSection) {
  docCharacters(inText, inCount, inIsSection);
}

void DocumentScanner::FlushText() {
  if (text_.empty()) return;
  tree_->AppendNew(current_, DOM_Node::TEXT_NODE, 0, tree_->AddText(text_));
  text_.clear();
}

void DocumentScanner::docComment(const XMLCh* const inText) {
  FlushText();
  const std::u16string_view text = View(inText);
  Charge(kUnitsOfNode + text.size());
  tree_->AppendNew(current_, DOM_Node::COMMENT_NODE, 0, tree_->AddText(text));
}

void DocumentScanner::docPI(const XMLCh* const inTarget, const XMLCh* const inData) {
  FlushText();
  const std::u16string_view data = View(inData);
  Charge(kUnitsOfNode + data.size());
  tree_->AppendNew(current_, DOM_Node::PROCESSING_INSTRUCTION_NODE,
                   tree_->InternName(View(inTarget)), tree_->AddText(data));
}

// The scanner accepts any version that begins with "1.".
void DocumentScanner::XMLDecl(const XMLCh* const inVersion, const XMLCh* const, const XMLCh* const,
                              const XMLCh* const) {
  const std::u16string_view version = View(inVersion);
  if (version.find_first_not_of(u"0123456789", 2) != std::u16string_view::npos || version == u"1.")
    FailHere("the XML version is not a number");
}

// ---- document type

void DocumentScanner::doctypeDecl(const xercesc::DTDElementDecl& inElement,
                                  const XMLCh* const inPublicId, const XMLCh* const inSystemId,
                                  const bool, const bool) {
  tree_->AppendNew(DOM_Tree::kDocument, DOM_Node::DOCUMENT_TYPE_NODE,
                   tree_->InternName(View(inElement.getFullName())), nullptr);
  if (!View(inPublicId).empty()) doctype_.publicId = tree_->AddText(View(inPublicId));
  if (inSystemId != nullptr) doctype_.systemId = tree_->AddText(View(inSystemId));
  tree_->SetDoctype(doctype_);
}

void DocumentScanner::doctypeComment(const XMLCh* const inText) { subset_.AddComment(inText); }

void DocumentScanner::doctypePI(const XMLCh* const inTarget, const XMLCh* const inData) {
  subset_.AddProcessingInstruction(inTarget, inData);
}

void DocumentScanner::doctypeWhitespace(const XMLCh* const inText, const XMLSize_t inCount) {
  subset_.AddWhitespace(inText, inCount);
}

void DocumentScanner::elementDecl(const xercesc::DTDElementDecl& inElement, const bool) {
  subset_.AddElement(inElement);
}

void DocumentScanner::startAttList(const xercesc::DTDElementDecl& inElement) {
  subset_.StartAttributes(inElement);
}

void DocumentScanner::attDef(const xercesc::DTDElementDecl&, const xercesc::DTDAttDef& inAttribute,
                             const bool) {
  subset_.AddAttribute(inAttribute);
}

void DocumentScanner::endAttList(const xercesc::DTDElementDecl&) { subset_.EndAttributes(); }

void DocumentScanner::entityDecl(const xercesc::DTDEntityDecl& inEntity, const bool inIsParameter,
                                 const bool) {
  subset_.AddEntity(inEntity, inIsParameter);
}

void DocumentScanner::notationDecl(const xercesc::XMLNotationDecl& inNotation, const bool) {
  subset_.AddNotation(inNotation);
}

void DocumentScanner::endIntSubset() {
  doctype_.internalSubset = tree_->AddText(subset_.Text());
  tree_->SetDoctype(doctype_);
}

// ---- failures

void DocumentScanner::error(const unsigned int inCode, const XMLCh* const inDomain,
                            const ErrTypes inType, const XMLCh* const inText, const XMLCh* const,
                            const XMLCh* const, const XMLFileLoc inLine,
                            const XMLFileLoc inColumn) {
  if (inType != ErrType_Fatal) return;  // a document type that is not enforced
  if (inCode == xercesc::XMLErrs::EmptyMainEntity &&
      View(inDomain) == View(xercesc::XMLUni::fgXMLErrDomain))
    throw EmptyDocument();
  throw ScanFailure{inLine, inColumn, OneLineReason(inText)};
}

xercesc::InputSource* DocumentScanner::resolveEntity(xercesc::XMLResourceIdentifier*) {
  FailHere("external entities are not opened");
}
