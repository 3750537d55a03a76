#include "toolkit/publishing/page/PageMaker.h"

#include <libxml/parser.h>
#include <libxml/xmlIO.h>
#include <libxslt/documents.h>
#include <libxslt/security.h>
#include <libxslt/transform.h>
#include <libxslt/xsltInternals.h>
#include <libxslt/xsltutils.h>

#include <csetjmp>
#include <cstdarg>
#include <cstdio>
#include <memory>
#include <new>
#include <string_view>
#include <utility>

#include "foundation/PluginFunction.h"

namespace ZORToolkit {
namespace {

// Both libraries report messages in pieces of a line.
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
    // No exception may pass through a C library.
  }
}

/// Lack of memory ends a call of the libraries where it is noticed, with std::bad_alloc: they
/// themselves go on with half a page, or crash. What such a call has built stays behind. From the
/// first page on memory comes through here from where it came from before; this library is never
/// unloaded.
class MemoryGuard {
 public:
  /// @param inCall must need no destructor.
  template <class Call>
  static auto Run(const Call& inCall) {
    Install();
    std::jmp_buf start;
    if (setjmp(start) != 0) {  // NOLINT(cert-err52-cpp): an exception may not pass through C
      start_ = nullptr;
      isBroken_ = true;
      throw std::bad_alloc();
    }
    start_ = &start;
    const auto result = inCall();
    start_ = nullptr;
    return result;
  }

  /// Whether what belongs to the libraries may be half built, so that it must not be taken apart.
  static bool IsBroken() { return isBroken_; }
  static void Start() { isBroken_ = false; }

 private:
  struct Former {
    Former() {
      xmlInitParser();  // holds a lock meanwhile
      xmlMemGet(&free, &allocate, &reallocate, &duplicate);
      former_ = this;
      xmlMemSetup(free, Allocate, Reallocate, Duplicate);
    }
    xmlFreeFunc free = nullptr;
    xmlMallocFunc allocate = nullptr;
    xmlReallocFunc reallocate = nullptr;
    xmlStrdupFunc duplicate = nullptr;
  };
  static void Install() { static const Former once; }
  static void* Checked(void* inBlock, std::size_t inSize) {
    if (inBlock == nullptr && inSize > 0 && start_ != nullptr)
      std::longjmp(*start_, 1);  // NOLINT(cert-err52-cpp)
    return inBlock;
  }
  static void* Allocate(std::size_t inSize) { return Checked(former_->allocate(inSize), inSize); }
  static void* Reallocate(void* inBlock, std::size_t inSize) {
    return Checked(former_->reallocate(inBlock, inSize), inSize);
  }
  static char* Duplicate(const char* inText) {
    return static_cast<char*>(Checked(former_->duplicate(inText), 1));
  }

  // There from the start: the dynamic loader would allocate them at first use, and end the process
  // where it cannot.
  [[gnu::tls_model("initial-exec")]] static inline thread_local std::jmp_buf* start_ = nullptr;
  [[gnu::tls_model("initial-exec")]] static inline thread_local bool isBroken_ = false;
  static inline const Former* former_ = nullptr;
};

template <auto Free>
struct Freer {
  template <class Item>
  void operator()(Item* inItem) const {
    if (!MemoryGuard::IsBroken()) Free(inItem);
  }
};
using XmlDocument = std::unique_ptr<xmlDoc, Freer<xmlFreeDoc>>;
using StyleSheet = std::unique_ptr<xsltStylesheet, Freer<xsltFreeStylesheet>>;
using Security = std::unique_ptr<xsltSecurityPrefs, Freer<xsltFreeSecurityPrefs>>;
using Context = std::unique_ptr<xsltTransformContext, Freer<xsltFreeTransformContext>>;

/// Collects the libraries' messages while this lives.
class MessagesTo {
 public:
  explicit MessagesTo(std::string& ioText) {
    xmlSetGenericErrorFunc(&ioText, Collect);
    xsltSetGenericErrorFunc(&ioText, Collect);
  }
  ~MessagesTo() {
    xmlSetGenericErrorFunc(nullptr, nullptr);
    xsltSetGenericErrorFunc(nullptr, nullptr);
  }
  MessagesTo(const MessagesTo&) = delete;
  MessagesTo& operator=(const MessagesTo&) = delete;
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
  return MemoryGuard::Run([&] {
    return xmlReadMemory(inBytes.data(), static_cast<int>(inBytes.size()), inName, nullptr,
                         XML_PARSE_NONET | inOptions);
  });
}

StyleSheet ParseStyleSheet(const PageRequest& inRequest) {
  const std::string own = inRequest.styleSheet.empty() ? kPageStyleSheet : inRequest.styleSheet;
  XmlDocument document(Parse(own, inRequest.styleSheetName.c_str(), XML_PARSE_NOENT));
  if (!document) return nullptr;
  StyleSheet sheet(MemoryGuard::Run([&] { return xsltParseStylesheetDoc(document.get()); }));
  if (!sheet) return nullptr;
  static_cast<void>(document.release());  // the style sheet's now
  return sheet->errors == 0 ? std::move(sheet) : nullptr;
}

bool Apply(xsltStylesheet& inSheet, xmlDoc& inDocument, xsltSecurityPrefs& inSecurity,
           std::string& outBytes) {
  const Context context(
      MemoryGuard::Run([&] { return xsltNewTransformContext(&inSheet, &inDocument); }));
  if (!context || xsltSetCtxtSecurityPrefs(&inSecurity, context.get()) != 0) return false;
  const XmlDocument page(MemoryGuard::Run([&] {
    return xsltApplyStylesheetUser(&inSheet, &inDocument, nullptr, nullptr, nullptr, context.get());
  }));
  if (!page || context->state != XSLT_STATE_OK) return false;
  xmlChar* bytes = nullptr;
  int length = 0;
  const int saved = MemoryGuard::Run(
      [&] { return xsltSaveResultToString(&bytes, &length, page.get(), &inSheet); });
  if (saved != 0 || bytes == nullptr) return false;
  outBytes.assign(reinterpret_cast<const char*>(bytes), static_cast<std::size_t>(length));
  xmlFree(bytes);
  return true;
}

bool TryMakePage(const PageRequest& inRequest, Page& outPage) {
  const Security security(MemoryGuard::Run([] { return xsltNewSecurityPrefs(); }));
  if (!security) return false;
  RefuseTheOutside(*security);
  const StyleSheet sheet = ParseStyleSheet(inRequest);
  if (!sheet || inRequest.document.empty()) return sheet != nullptr;
  const XmlDocument document(
      Parse(WithVisibleDirections(inRequest.document), "report.xml", XML_PARSE_HUGE));
  return document && Apply(*sheet, *document, *security, outPage.bytes);
}

}  // namespace

bool MakePage(const PageRequest& inRequest, Page& outPage) {
  MemoryGuard::Start();
  const MessagesTo messages(outPage.messages);
  const bool isMade = TryMakePage(inRequest, outPage);
  if (!isMade) {
    outPage.reason = FirstLine(outPage.messages);
    if (outPage.reason.empty()) outPage.reason = "the style sheet makes no page";
  }
  return isMade;
}

}  // namespace ZORToolkit

ZOR_PLUGIN_FUNCTION const ZORToolkit::PageLibrary* ZORPageLibrary() {
  using namespace ZORToolkit;
  static constexpr PageLibrary kLibrary = {
      MakePage,   kPageStyle, kPageScript, kReportStyleSheet, kReportType,      Sha256,      Base64,
      FromBase64, Gzip,       Gunzip,      WebpFromPng,       ReorderTriangles, SimplifyMesh};
  return &kLibrary;
}
