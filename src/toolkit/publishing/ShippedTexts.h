// The style sheets, the page's styles and scripts and the document type that are shipped, as texts.
#ifndef ZOR_TOOLKIT_PUBLISHING_SHIPPEDTEXTS_H
#define ZOR_TOOLKIT_PUBLISHING_SHIPPEDTEXTS_H

namespace ZORToolkit {
extern const char kPageStyleSheet[];
extern const char kPageStyle[];
extern const char kPageScript[];
extern const char kReportStyleSheet[];
extern const char kReportType[];
}  // namespace ZORToolkit

#endif
