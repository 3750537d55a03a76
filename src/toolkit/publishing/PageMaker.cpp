#include "toolkit/publishing/PageMaker.h"

#include <libxml/parser.h>
#include <libxml/xmlIO.h>
#include <libxslt/documents.h>
#include <libxslt/security.h>
#include <libxslt/transform.h>
#include <libxslt/xsltInternals.h>
#include <libxslt/xsltutils.h>

#include <cstdarg>
#include <cstdio>
#include <memory>
#include <new>
#include <string_view>
#include <utility>

#include "toolkit/publishing/ShippedTexts.h"

namespace ZORToolkit {
namespace {

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

// Both libraries report in pieces of a line.
void Collect(void* ioText, const char* inFormat, ...) __attribute__((format(printf, 2, 3)));
void Collect(void* ioText, const char* inFormat, ...) {
  constexpr std::size_t kMaxText = 1 << 16;
  std::string& text = *static_cast<std::string*>(ioText);
  char piece[4096];
  va_list arguments;
  va_start(arguments, inFormat);
  const int length = std::vsnprintf(piece, sizeof piece, inFormat, arguments);
  va_end(arguments);
  if (length <= 0 || text.size() >= kMaxText) return;
  try {
    text += piece;
  } catch (const std::bad_alloc&) {
    // Nothing may be thrown through a library of C.
  }
}

/// Notices when memory is lacking: the libraries then leave out a part of the page and say nothing.
/// From the first page on, memory comes through here from where it came from before; this library
/// is never unloaded.
class AllocationWatch {
 public:
  /// Forgets what failed in this thread so far.
  static void Start() {
    static const Former once;
    hasFailed_ = false;
  }
  static bool HasFailed() { return hasFailed_; }

 private:
  struct Former {
    Former() {
      xmlMemGet(&free, &allocate, &reallocate, &duplicate);
      former_ = this;
      xmlMemSetup(free, Allocate, Reallocate, Duplicate);
    }
    xmlFreeFunc free = nullptr;
    xmlMallocFunc allocate = nullptr;
    xmlReallocFunc reallocate = nullptr;
    xmlStrdupFunc duplicate = nullptr;
  };
  static void* Noted(void* inBlock, std::size_t inSize) {
    if (inBlock == nullptr && inSize > 0) hasFailed_ = true;
    return inBlock;
  }
  static void* Allocate(std::size_t inSize) { return Noted(former_->allocate(inSize), inSize); }
  static void* Reallocate(void* inBlock, std::size_t inSize) {
    return Noted(former_->reallocate(inBlock, inSize), inSize);
  }
  static char* Duplicate(const char* inText) {
    return static_cast<char*>(Noted(former_->duplicate(inText), 1));
  }

  static inline thread_local bool hasFailed_ = false;
  static inline const Former* former_ = nullptr;
};

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

StyleSheet ParseStyleSheet(const PageRequest& inRequest) {
  const std::string own = inRequest.styleSheet.empty() ? kPageStyleSheet : inRequest.styleSheet;
  XmlDocument document(Parse(own, inRequest.styleSheetName.c_str(), XML_PARSE_NOENT));
  if (!document) return nullptr;
  StyleSheet sheet(xsltParseStylesheetDoc(document.get()));
  if (!sheet) return nullptr;
  static_cast<void>(document.release());  // the style sheet's now
  return sheet->errors == 0 ? std::move(sheet) : nullptr;
}

bool Apply(xsltStylesheet& inSheet, xmlDoc& inDocument, xsltSecurityPrefs& inSecurity,
           std::string& outBytes) {
  const Context context(xsltNewTransformContext(&inSheet, &inDocument));
  if (!context || xsltSetCtxtSecurityPrefs(&inSecurity, context.get()) != 0) return false;
  const XmlDocument page(
      xsltApplyStylesheetUser(&inSheet, &inDocument, nullptr, nullptr, nullptr, context.get()));
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
  if (!sheet || inRequest.document.empty()) return sheet != nullptr;
  const XmlDocument document(
      Parse(WithVisibleDirections(inRequest.document), "report.xml", XML_PARSE_HUGE));
  return document && Apply(*sheet, *document, *security, outPage.bytes);
}

}  // namespace
}  // namespace ZORToolkit

#define ZOR_PAGE_EXPORT extern "C" __attribute__((visibility("default")))

ZOR_PAGE_EXPORT bool ZORMakePage(const ZORToolkit::PageRequest& inRequest,
                                 ZORToolkit::Page& outPage) {
  ZORToolkit::AllocationWatch::Start();
  const bool isMade = ZORToolkit::MakePage(inRequest, outPage);
  xmlSetGenericErrorFunc(nullptr, nullptr);
  xsltSetGenericErrorFunc(nullptr, nullptr);
  if (ZORToolkit::AllocationWatch::HasFailed()) throw std::bad_alloc();
  if (!isMade) {
    outPage.reason = ZORToolkit::FirstLine(outPage.messages);
    if (outPage.reason.empty()) outPage.reason = "the style sheet makes no page";
  }
  return isMade;
}

ZOR_PAGE_EXPORT const char* ZORReportStyleSheet() { return ZORToolkit::kReportStyleSheet; }
ZOR_PAGE_EXPORT const char* ZORReportType() { return ZORToolkit::kReportType; }
