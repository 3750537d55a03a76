// Our tree against the XML library's own one: the same kinds, names and values for every text.
#include <gtest/gtest.h>

#include <filesystem>
#include <random>
#include <xercesc/dom/DOM.hpp>
#include <xercesc/framework/MemBufInputSource.hpp>
#include <xercesc/parsers/XercesDOMParser.hpp>
#include <xercesc/sax/HandlerBase.hpp>
#include <xercesc/util/PlatformUtils.hpp>

#include "default_platform/xml/ScannerMemory.h"
#include "platform/xml/DOM_NamedNodeMap.h"
#include "support/PlatformFolder.h"
#include "support/XMLText.h"

namespace {

/// Parses with the library's own parser, set as ours is set.
class OwnParser {
 public:
  explicit OwnParser(const std::string& inText) {
    parser_.setValidationScheme(xercesc::XercesDOMParser::Val_Never);
    parser_.setDoNamespaces(false);
    parser_.setDoSchema(false);
    parser_.setLoadExternalDTD(false);
    parser_.setCreateEntityReferenceNodes(false);
    parser_.setDisableDefaultEntityResolution(true);
    parser_.setErrorHandler(&handler_);
    const xercesc::MemBufInputSource source(reinterpret_cast<const XMLByte*>(inText.data()),
                                            inText.size(), "text");
    try {
      parser_.parse(source);
      isRead_ = true;
    } catch (const xercesc::SAXException&) {
    } catch (const xercesc::XMLException&) {
    } catch (const xercesc::DOMException&) {
    }
  }
  bool IsRead() const { return isRead_; }
  const xercesc::DOMNode* Document() { return parser_.getDocument(); }

 private:
  xercesc::HandlerBase handler_;  // raises what is fatal
  ScannerMemory memory_;          // frees what the library forgets after errors
  xercesc::XercesDOMParser parser_{nullptr, &memory_};
  bool isRead_ = false;
};

bool IsSame(const DOMString& inOurs, const XMLCh* inTheirs) {
  return inOurs.equals(DOMString(
      inTheirs,
      inTheirs == nullptr ? 0 : static_cast<unsigned int>(std::u16string_view(inTheirs).size())));
}

// The library keeps attributes sorted in a map of its own; ours are in document order.
bool HasSameAttributes(const DOM_Node& inOurs, const xercesc::DOMNode& inTheirs) {
  const DOM_NamedNodeMap ours = inOurs.getAttributes();
  const xercesc::DOMNamedNodeMap* const theirs = inTheirs.getAttributes();
  if (ours.getLength() != (theirs == nullptr ? 0 : theirs->getLength())) return false;
  for (unsigned int i = 0; i < ours.getLength(); ++i) {
    const DOMString name = ours.item(i).getNodeName();
    const std::u16string terminated(name.rawBuffer(), name.length());
    const xercesc::DOMNode* const found = theirs->getNamedItem(terminated.c_str());
    if (found == nullptr || !IsSame(ours.item(i).getNodeValue(), found->getNodeValue()))
      return false;
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

/// Both read it alike, or both refuse it.
testing::AssertionResult ReadAlike(const std::string& inText, int* ioRead = nullptr) {
  if (FAILED(ZORXMLParser::Initialize())) return testing::AssertionFailure();
  OwnParser own(inText);
  const std::string error = support::ParseErrorOf(inText);
  if (own.IsRead() != error.empty())
    return testing::AssertionFailure() << "read by one only; ours: " << error << "\n" << inText;
  if (!own.IsRead()) return testing::AssertionSuccess();
  if (ioRead != nullptr) ++*ioRead;
  const std::string difference = Difference(support::ParseText(inText), own.Document());
  return difference.empty() ? testing::AssertionSuccess()
                            : testing::AssertionFailure() << difference << "\n"
                                                          << inText;
}

constexpr const char* kRich =
    "<?xml version=\"1.0\"?>\n<!-- c --><!DOCTYPE a PUBLIC \"p\" \"s\" [<!ELEMENT a (b,c?)+>"
    "<!ATTLIST b k (x|y) 'x' l NMTOKENS ' u  v '><!ENTITY e '<c/>t&#38;lt;'><!ENTITY % p "
    "'<!ELEMENT d ANY>'> %p;]>\n<?q?><a x=\"1&#10;\t\">t&e;<![CDATA[s]]>]<b k='y' l=' 1  2 '/>"
    "<![CDATA[]]><!-- d --><?q r?>&#233;&lt;<b>\r\n</b>\n</a><!--e-->";

}  // namespace

TEST(XercesDifferential, AllSamplesGiveTheSameTree) {
  int samples = 0;
  for (const auto& entry : std::filesystem::directory_iterator(ZOR_SOURCE_DIR "/samples")) {
    if (!entry.path().string().ends_with(".clash.xml")) continue;
    EXPECT_TRUE(ReadAlike(support::ReadFile(entry.path()), &samples)) << entry.path();
  }
  EXPECT_GT(samples, 0);
}

TEST(XercesDifferential, RichDocumentGivesTheSameTree) {
  int read = 0;
  EXPECT_TRUE(ReadAlike(kRich, &read));
  EXPECT_EQ(read, 1);
}

TEST(XercesDifferential, DamagedDocumentsAreReadOrRefusedAlike) {
  const std::string text = kRich;
  // The library's tree, unlike its scanner, refuses all versions but two.
  const std::size_t declared = text.find('\n');
  std::mt19937 random(4711);
  int read = 0;
  for (int step = 0; step < 6000; ++step) {
    std::string damaged = text;
    for (std::size_t i = 0; i <= random() % 2; ++i) {
      const std::size_t at = declared + random() % (damaged.size() - declared);
      switch (random() % 3) {
        case 0:
          damaged[at] = "<>&;'\"%![]()-?/ abckxy"[random() % 22];
          break;
        case 1:
          damaged.erase(at, 1 + random() % 4);
          break;
        default:
          damaged.insert(at, damaged.substr(random() % damaged.size(), random() % 12));
      }
    }
    if (damaged.find("SYSTEM") != std::string::npos) continue;  // entities are not opened here
    ASSERT_TRUE(ReadAlike(damaged, &read)) << "step " << step;
  }
  EXPECT_GT(read, 300);
}
