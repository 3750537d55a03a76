// The style sheets and the document type that are shipped, as texts.
#ifndef ZOR_TOOLS_LYRA_PUBLISH_SHIPPEDTEXTS_H
#define ZOR_TOOLS_LYRA_PUBLISH_SHIPPEDTEXTS_H

namespace lyra {
extern const char kPageStyleSheet[];
extern const char kReportStyleSheet[];
extern const char kReportType[];
}  // namespace lyra

#endif
