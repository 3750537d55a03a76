// What the toolkit and its page library say to each other.
#ifndef ZOR_TOOLKIT_PUBLISHING_PAGE_MAKER_H
#define ZOR_TOOLKIT_PUBLISHING_PAGE_MAKER_H

#include <string>

namespace ZORToolkit {

struct PageRequest {
  std::string document;        // XML; empty: the style sheet is only read
  std::string styleSheet;      // the text of a style sheet; empty: the page's own
  std::string styleSheetName;  // what errors call it
};

struct Page {
  std::string bytes;
  std::string reason;    // in one line, why there is no page
  std::string messages;  // what the style sheet had to say
};

/// Applies a style sheet to a document. A style sheet reads and writes no file and reaches no
/// network; it is all in one text. Characters that turn the direction of writing reach it as
/// \u{HEX}.
/// @return false, with a reason, when there is no page.
typedef bool MakePageFunction(const PageRequest& inRequest, Page& outPage);
inline constexpr char kMakePageName[] = "ZORMakePage";

/// The texts that lie beside a report: the style sheet and the document type that are shipped.
typedef const char* ShippedTextFunction();
inline constexpr char kReportStyleSheetName[] = "ZORReportStyleSheet";
inline constexpr char kReportTypeName[] = "ZORReportType";

}  // namespace ZORToolkit

#endif
