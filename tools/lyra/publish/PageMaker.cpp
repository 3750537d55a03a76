#include "lyra/publish/PageMaker.h"

#include <libxml/parser.h>
#include <libxml/xmlIO.h>
#include <libxslt/documents.h>
#include <libxslt/security.h>
#include <libxslt/transform.h>
#include <libxslt/xsltInternals.h>
#include <libxslt/xsltutils.h>

#include <algorithm>
#include <cstdarg>
#include <cstdio>
#include <map>
#include <memory>
#include <string_view>
#include <utility>

#include "lyra/publish/ShippedTexts.h"

namespace lyra {
namespace {

constexpr char kNamespace[] = "urn:zorlyra:page";

template <auto Free>
struct Freer {
  template <class Item>
  void operator()(Item* inItem) const {
    Free(inItem);
  }
};
using XmlDocument = std::unique_ptr<xmlDoc, Freer<xmlFreeDoc>>;
using StyleSheet = std::unique_ptr<xsltStylesheet, Freer<xsltFreeStylesheet>>;
using Security = std::unique_ptr<xsltSecurityPrefs, Freer<xsltFreeSecurityPrefs>>;
using Context = std::unique_ptr<xsltTransformContext, Freer<xsltFreeTransformContext>>;

const xmlChar* Xml(const std::string& inText) {
  return reinterpret_cast<const xmlChar*>(inText.c_str());
}
const xmlChar* Xml(const char* inText) { return reinterpret_cast<const xmlChar*>(inText); }

// Both libraries report in pieces of a line.
void Collect(void* ioText, const char* inFormat, ...) __attribute__((format(printf, 2, 3)));
void Collect(void* ioText, const char* inFormat, ...) {
  constexpr std::size_t kMost = 1 << 16;
  std::string& text = *static_cast<std::string*>(ioText);
  char piece[4096];
  va_list arguments;
  va_start(arguments, inFormat);
  const int length = std::vsnprintf(piece, sizeof piece, inFormat, arguments);
  va_end(arguments);
  if (length > 0 && text.size() < kMost) text += piece;
}

std::string FirstLine(const std::string& inText) { return inText.substr(0, inText.find('\n')); }

xmlParserInputPtr RefuseEntity(const char*, const char*, xmlParserCtxtPtr) { return nullptr; }

xmlDocPtr RefuseDocument(const xmlChar*, xmlDictPtr, int, void*, xsltLoadType) { return nullptr; }

/// What a style sheet may not do is refused in three places: entities of documents, documents that
/// it includes or opens, and whatever else it reads or writes.
void RefuseTheOutside(xsltSecurityPrefs& ioSecurity) {
  xmlSetExternalEntityLoader(RefuseEntity);
  xsltSetLoaderFunc(RefuseDocument);
  for (const xsltSecurityOption option :
       {XSLT_SECPREF_READ_FILE, XSLT_SECPREF_WRITE_FILE, XSLT_SECPREF_CREATE_DIRECTORY,
        XSLT_SECPREF_READ_NETWORK, XSLT_SECPREF_WRITE_NETWORK})
    xsltSetSecurityPrefs(&ioSecurity, option, xsltSecurityForbid);
}

/// Characters of the two ranges that embed, override or isolate directions, in UTF-8.
bool TurnsDirection(std::string_view inBytes) {
  if (inBytes.size() < 3 || inBytes[0] != '\xE2') return false;
  return (inBytes[1] == '\x80' && inBytes[2] >= '\xAA' && inBytes[2] <= '\xAE') ||
         (inBytes[1] == '\x81' && inBytes[2] >= '\xA6' && inBytes[2] <= '\xA9');
}

// They can stand in values only, so the text stays well-formed.
std::string WithVisibleDirections(const std::string& inText) {
  std::string visible;
  visible.reserve(inText.size());
  for (std::size_t i = 0; i < inText.size(); ++i) {
    if (!TurnsDirection(std::string_view(inText).substr(i, 3))) {
      visible += inText[i];
      continue;
    }
    const int code = 0x2000 + ((inText[i + 1] & 0x3F) << 6) + (inText[i + 2] & 0x3F);
    char escape[16];
    std::snprintf(escape, sizeof escape, "\\u{%X}", static_cast<unsigned>(code));
    visible += escape;
    i += 2;
  }
  return visible;
}

xmlDocPtr Parse(const std::string& inBytes, const char* inName, int inOptions) {
  return xmlReadMemory(inBytes.data(), static_cast<int>(inBytes.size()), inName, nullptr,
                       XML_PARSE_NONET | inOptions);
}

bool IsElement(const xmlNode* inNode, const char* inName) {
  return inNode->type == XML_ELEMENT_NODE && xmlStrEqual(inNode->name, Xml(inName));
}

template <class Visit>
void ForEachChild(xmlNode* inParent, const char* inName, const Visit& inVisit) {
  for (xmlNode* child = inParent->children; child != nullptr; child = child->next)
    if (IsElement(child, inName)) inVisit(child);
}

/// Adds what is known of the interferences to a report.
class FactWriter {
 public:
  explicit FactWriter(xmlNode* ioRoot)
      : root_(ioRoot), space_(xmlNewNs(ioRoot, Xml(kNamespace), Xml("page"))) {}

  void Add(const PageRequest& inRequest) {
    Set(root_, "model", inRequest.model);
    if (inRequest.isAsInModel) Set(root_, "asInModel", "yes");
    Count(inRequest, "Type", &PublishedInterference::type);
    Count(inRequest, "Status", &PublishedInterference::status);
    std::size_t next = 0;
    const auto add = [&](xmlNode* ioInterference) {
      if (next < inRequest.interferences.size())
        Add(ioInterference, inRequest.interferences[next++]);
    };
    ForEachChild(root_, "Interference", add);
    ForEachChild(root_, "ClashResult",
                 [&](xmlNode* ioSet) { ForEachChild(ioSet, "Interference", add); });
  }

 private:
  void Set(xmlNode* ioElement, const char* inName, const std::string& inValue) {
    if (!inValue.empty())
      xmlNewNsProp(ioElement, space_, Xml(inName), Xml(WithVisibleDirections(inValue)));
  }

  // Style sheets can count only slowly. The most frequent words first.
  void Count(const PageRequest& inRequest, const char* inName,
             std::string PublishedInterference::*inWord) {
    std::map<std::string, std::size_t> counts;
    for (const PublishedInterference& facts : inRequest.interferences) ++counts[facts.*inWord];
    std::vector<std::pair<std::string, std::size_t>> words(counts.begin(), counts.end());
    std::stable_sort(words.begin(), words.end(),
                     [](const auto& inA, const auto& inB) { return inA.second > inB.second; });
    for (const auto& [word, count] : words) {
      xmlNode* const element = xmlNewChild(root_, space_, Xml(inName), nullptr);
      Set(element, "word", word);
      Set(element, "count", std::to_string(count));
    }
  }

  void Add(xmlNode* ioInterference, const PublishedInterference& inFacts) {
    Set(ioInterference, "number", std::to_string(inFacts.number));
    Set(ioInterference, "type", inFacts.type);
    Set(ioInterference, "status", inFacts.status);
    Set(ioInterference, "picture", inFacts.picture);
    Set(ioInterference, "asInModel", inFacts.whyAsInModel);
    for (const std::string& thumbnail : inFacts.thumbnails)
      xmlNewProp(xmlNewChild(ioInterference, space_, Xml("Thumbnail"), nullptr), Xml("href"),
                 Xml(thumbnail));
    xmlNode* products[2] = {nullptr, nullptr};
    ForEachChild(ioInterference, "Product", [&](xmlNode* ioProduct) {
      (products[0] == nullptr ? products[0] : products[1]) = ioProduct;
    });
    for (std::size_t i = 0; i < 2; ++i)
      if (products[i] != nullptr) Add(products[i], inFacts.products[i]);
  }

  void Add(xmlNode* ioProduct, const PublishedProduct& inFacts) {
    Set(ioProduct, "colour", inFacts.colour);
    Set(ioProduct, "preview", inFacts.preview);
    if (inFacts.isMissing) Set(ioProduct, "missing", "yes");
  }

  xmlNode* root_;
  xmlNs* space_;
};

StyleSheet ParseStyleSheet(const PageRequest& inRequest) {
  const std::string own = inRequest.styleSheet.empty() ? kPageStyleSheet : inRequest.styleSheet;
  XmlDocument document(Parse(own, inRequest.styleSheetName.c_str(), XML_PARSE_NOENT));
  if (!document) return nullptr;
  StyleSheet sheet(xsltParseStylesheetDoc(document.get()));
  if (!sheet) return nullptr;
  static_cast<void>(document.release());  // the style sheet's now
  return sheet->errors == 0 ? std::move(sheet) : nullptr;
}

bool Apply(xsltStylesheet& inSheet, xmlDoc& inReport, xsltSecurityPrefs& inSecurity,
           std::string& outBytes) {
  const Context context(xsltNewTransformContext(&inSheet, &inReport));
  if (!context || xsltSetCtxtSecurityPrefs(&inSecurity, context.get()) != 0) return false;
  const XmlDocument page(
      xsltApplyStylesheetUser(&inSheet, &inReport, nullptr, nullptr, nullptr, context.get()));
  if (!page || context->state != XSLT_STATE_OK) return false;
  xmlChar* bytes = nullptr;
  int length = 0;
  if (xsltSaveResultToString(&bytes, &length, page.get(), &inSheet) != 0 || bytes == nullptr)
    return false;
  outBytes.assign(reinterpret_cast<const char*>(bytes), static_cast<std::size_t>(length));
  xmlFree(bytes);
  return true;
}

bool MakePage(const PageRequest& inRequest, Page& outPage) {
  xmlSetGenericErrorFunc(&outPage.messages, Collect);
  xsltSetGenericErrorFunc(&outPage.messages, Collect);
  const Security security(xsltNewSecurityPrefs());
  if (!security) return false;
  RefuseTheOutside(*security);
  const StyleSheet sheet = ParseStyleSheet(inRequest);
  if (!sheet || inRequest.report.empty()) return sheet != nullptr;
  const XmlDocument report(
      Parse(WithVisibleDirections(inRequest.report), "report.xml", XML_PARSE_HUGE));
  if (!report) return false;
  FactWriter(xmlDocGetRootElement(report.get())).Add(inRequest);
  return Apply(*sheet, *report, *security, outPage.bytes);
}

}  // namespace
}  // namespace lyra

#define LYRA_EXPORT extern "C" __attribute__((visibility("default")))

LYRA_EXPORT bool LyraMakePage(const lyra::PageRequest& inRequest, lyra::Page& outPage) {
  const bool isMade = lyra::MakePage(inRequest, outPage);
  xmlSetGenericErrorFunc(nullptr, nullptr);
  xsltSetGenericErrorFunc(nullptr, nullptr);
  if (!isMade) {
    outPage.reason = lyra::FirstLine(outPage.messages);
    if (outPage.reason.empty()) outPage.reason = "the style sheet makes no page";
  }
  return isMade;
}

LYRA_EXPORT const char* LyraReportStyleSheet() { return lyra::kReportStyleSheet; }
LYRA_EXPORT const char* LyraReportType() { return lyra::kReportType; }
