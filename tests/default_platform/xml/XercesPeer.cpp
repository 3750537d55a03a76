#include "XercesPeer.h"

#include <cstdint>
#include <string_view>
#include <xercesc/dom/DOM.hpp>
#include <xercesc/framework/MemBufInputSource.hpp>
#include <xercesc/parsers/XercesDOMParser.hpp>
#include <xercesc/sax/HandlerBase.hpp>
#include <xercesc/sax/SAXParseException.hpp>
#include <xercesc/util/PlatformUtils.hpp>

#include "default_platform/xml/full_scanner/ScannerMemory.h"
#include "platform/xml/DOM_NamedNodeMap.h"
#include "support/XMLText.h"

namespace {

constexpr const char* kName = "text";
constexpr const char* kExternal = "external entities are not opened";

/// Where and why a text is refused; the line is 0 when there is no place.
struct Refusal {
  std::uint64_t line = 0;
  std::uint64_t column = 0;
  std::string reason;
};

std::ostream& operator<<(std::ostream& ioOut, const Refusal& inRefusal) {
  return ioOut << inRefusal.line << ":" << inRefusal.column << ": " << inRefusal.reason;
}

std::string Narrow(const XMLCh* inText) {
  const std::u16string_view text = inText == nullptr ? std::u16string_view() : inText;
  return support::Narrow(DOMString(text.data(), static_cast<unsigned int>(text.size())));
}

std::string InOneLine(const XMLCh* inText) {
  std::u16string text(inText == nullptr ? u"" : inText);
  for (XMLCh& unit : text)
    if (unit < u' ' || unit == 0x7F || unit == 0x85 || unit == 0x2028 || unit == 0x2029)
      unit = u' ';
  return Narrow(text.c_str());
}

/// Notes that something outside was asked for, and gives nothing; raises what is fatal.
class OwnHandler : public xercesc::HandlerBase {
 public:
  xercesc::InputSource* resolveEntity(const XMLCh* const, const XMLCh* const) override {
    asksForMore = true;
    return nullptr;
  }
  bool asksForMore = false;
};

/// Parses with the library's own parser, set as ours is set.
class OwnParser {
 public:
  enum Outcome { kRead, kRefused, kOtherVersion };

  explicit OwnParser(const std::string& inText) {
    parser_.setValidationScheme(xercesc::XercesDOMParser::Val_Never);
    parser_.setDoNamespaces(false);
    parser_.setDoSchema(false);
    parser_.setLoadExternalDTD(false);
    parser_.setCreateEntityReferenceNodes(false);
    parser_.setDisableDefaultEntityResolution(true);
    parser_.setErrorHandler(&handler_);
    parser_.setEntityResolver(&handler_);
    outcome_ = Parse(inText);
  }
  Outcome Result() const { return outcome_; }
  bool AsksForMore() const { return handler_.asksForMore; }
  const Refusal& Why() const { return refusal_; }
  const xercesc::DOMNode* Document() { return parser_.getDocument(); }

 private:
  Outcome Parse(const std::string& inText) {
    const xercesc::MemBufInputSource source(reinterpret_cast<const XMLByte*>(inText.data()),
                                            inText.size(), kName);
    try {
      parser_.parse(source);
      return kRead;
    } catch (const xercesc::SAXParseException& error) {
      refusal_ = {error.getLineNumber(), error.getColumnNumber(), InOneLine(error.getMessage())};
    } catch (const xercesc::XMLException& error) {
      refusal_ = {0, 0, InOneLine(error.getMessage())};
    } catch (const xercesc::DOMException&) {
      return kOtherVersion;
    }
    return kRefused;
  }

  OwnHandler handler_;
  ScannerMemory memory_;  // frees what the library forgets after errors
  xercesc::XercesDOMParser parser_{nullptr, &memory_};
  Outcome outcome_;
  Refusal refusal_;
};

bool IsSame(const DOMString& inOurs, const XMLCh* inTheirs) {
  const std::u16string_view theirs = inTheirs == nullptr ? std::u16string_view() : inTheirs;
  return std::u16string_view(inOurs.rawBuffer(), inOurs.length()) == theirs;
}

// The library sorts attributes by name; ours are in document order.
bool HasSameAttributes(const DOM_Node& inOurs, const xercesc::DOMNode& inTheirs) {
  const DOM_NamedNodeMap ours = inOurs.getAttributes();
  const xercesc::DOMNamedNodeMap* const theirs = inTheirs.getAttributes();
  const XMLSize_t count = theirs == nullptr ? 0 : theirs->getLength();
  if (ours.getLength() != count) return false;
  for (unsigned int i = 0; i < count; ++i) {
    const xercesc::DOMNode& attribute = *theirs->item(i);
    const std::u16string_view name = attribute.getNodeName();
    const DOM_Node found =
        ours.getNamedItem(DOMString(name.data(), static_cast<unsigned int>(name.size())));
    if (found.isNull() || !IsSame(found.getNodeValue(), attribute.getNodeValue())) return false;
  }
  return true;
}

/// "" when both trees say the same.
std::string Difference(const DOM_Node& inOurs, const xercesc::DOMNode* inTheirs) {
  if (inOurs.isNull() || inTheirs == nullptr)
    return inOurs.isNull() == (inTheirs == nullptr) ? "" : "one node is missing";
  const std::string name = support::Narrow(inOurs.getNodeName());
  if (inOurs.getNodeType() != inTheirs->getNodeType()) return name + ": other kind";
  if (!IsSame(inOurs.getNodeName(), inTheirs->getNodeName())) return name + ": other name";
  if (!IsSame(inOurs.getNodeValue(), inTheirs->getNodeValue()))
    return name + ": other value " + support::Narrow(inOurs.getNodeValue());
  if (!HasSameAttributes(inOurs, *inTheirs)) return name + ": other attributes";
  if (inOurs.getNodeType() == DOM_Node::DOCUMENT_TYPE_NODE) return "";
  DOM_Node ours = inOurs.getFirstChild();
  const xercesc::DOMNode* theirs = inTheirs->getFirstChild();
  while (!ours.isNull() || theirs != nullptr) {
    const std::string difference = Difference(ours, theirs);
    if (!difference.empty()) return name + " > " + difference;
    ours = ours.getNextSibling();
    theirs = theirs->getNextSibling();
  }
  return "";
}

/// What ours does with a text: a document, or why there is none.
struct Ours {
  DOM_Document document;
  bool isRead = false;
  Refusal refusal;
};

Ours ParseOurs(const std::string& inText) {
  Ours ours;
  try {
    ours.document = support::ParseText(inText, kName);
    ours.isRead = true;
  } catch (const ZORXMLParseError& error) {
    ours.refusal = {error.line, error.column, error.reason};
  }
  return ours;
}

// Ours leaves out the frame that the library puts around the messages of its own exceptions, and
// cuts off what is long.
bool IsSameReason(std::string_view inOurs, const std::string& inTheirs) {
  constexpr std::string_view kCut = "\xE2\x80\xA6";
  if (inOurs.empty()) return false;
  if (!inOurs.ends_with(kCut)) return inTheirs.ends_with(inOurs);
  inOurs.remove_suffix(kCut.size());
  return inTheirs.find(inOurs) != std::string::npos;
}

bool IsSameRefusal(const Refusal& inOurs, const Refusal& inTheirs) {
  return inOurs.line == inTheirs.line && inOurs.column == inTheirs.column &&
         IsSameReason(inOurs.reason, inTheirs.reason);
}

testing::AssertionResult Fail(const std::string& inWhat, const std::string& inText) {
  return testing::AssertionFailure() << inWhat << "\n" << inText;
}

testing::AssertionResult RefusedAlike(const Ours& inOurs, const Refusal& inTheirs,
                                      const std::string& inText) {
  if (inOurs.isRead) return Fail("read by ours only: " + testing::PrintToString(inTheirs), inText);
  if (!IsSameRefusal(inOurs.refusal, inTheirs))
    return Fail("refused otherwise\nours:   " + testing::PrintToString(inOurs.refusal) +
                    "\ntheirs: " + testing::PrintToString(inTheirs),
                inText);
  return testing::AssertionSuccess();
}

testing::AssertionResult SameTrees(const Ours& inOurs, const xercesc::DOMNode* inTheirs,
                                   const std::string& inText) {
  if (!inOurs.isRead)
    return Fail("read by theirs only: " + testing::PrintToString(inOurs.refusal), inText);
  const std::string difference = Difference(inOurs.document, inTheirs);
  return difference.empty() ? testing::AssertionSuccess() : Fail(difference, inText);
}

}  // namespace

testing::AssertionResult peer::ReadAlike(const std::string& inText, Tally& ioTally) {
  xercesc::XMLPlatformUtils::Initialize();  // counted
  OwnParser theirs(inText);
  const Ours ours = ParseOurs(inText);
  if (theirs.AsksForMore()) {
    ++ioTally.outside;
    return ours.refusal.reason == kExternal ? testing::AssertionSuccess()
                                            : Fail("opened something outside", inText);
  }
  switch (theirs.Result()) {
    case OwnParser::kOtherVersion:
      ++ioTally.otherwise;
      return testing::AssertionSuccess();
    case OwnParser::kRefused:
      ++ioTally.refused;
      return RefusedAlike(ours, theirs.Why(), inText);
    default:
      ++ioTally.read;
      return SameTrees(ours, theirs.Document(), inText);
  }
}

testing::AssertionResult peer::ReadByBoth(const std::string& inText) {
  Tally tally;
  const testing::AssertionResult result = ReadAlike(inText, tally);
  return !result || tally.read == 1 ? result : Fail("not read", inText);
}

testing::AssertionResult peer::RefusedByBoth(const std::string& inText) {
  Tally tally;
  const testing::AssertionResult result = ReadAlike(inText, tally);
  return !result || tally.refused == 1 ? result : Fail("not refused", inText);
}
