// What the command and its page library say to each other.
#ifndef ZOR_TOOLS_LYRA_PUBLISH_PAGEMAKER_H
#define ZOR_TOOLS_LYRA_PUBLISH_PAGEMAKER_H

#include <string>
#include <vector>

#include "lyra/publish/PublishedInterference.h"

namespace lyra {

struct PageRequest {
  std::string report;          // an XML report; empty: the style sheet is only read
  std::string styleSheet;      // the text of a style sheet; empty: the page's own
  std::string styleSheetName;  // what errors call it
  std::string model;           // name of the model; empty for none
  bool isAsInModel = false;    // all pictures have the model's placements, as was asked for
  std::vector<PublishedInterference> interferences;  // of the report, in its order
};

struct Page {
  std::string bytes;
  std::string reason;    // in one line, why there is no page
  std::string messages;  // what the style sheet had to say
};

/// Applies a style sheet to a report to which the facts of its interferences are added (attributes
/// and elements of the namespace "urn:zorlyra:page"). A style sheet reads and writes no file and
/// reaches no network; it is all in one text. Characters that turn the direction of writing reach it
/// as \u{HEX}.
/// @return false, with a reason, when there is no page.
typedef bool MakePageFunction(const PageRequest& inRequest, Page& outPage);
inline constexpr char kMakePageName[] = "LyraMakePage";

/// The texts that lie beside a report: the style sheet and the document type that are shipped.
typedef const char* ShippedTextFunction();
inline constexpr char kReportStyleSheetName[] = "LyraReportStyleSheet";
inline constexpr char kReportTypeName[] = "LyraReportType";

}  // namespace lyra

#endif
