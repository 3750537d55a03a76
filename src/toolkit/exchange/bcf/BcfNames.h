// What the reader and the writer of BCF files call things; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_EXCHANGE_BCF_BCF_NAMES_H
#define ZOR_TOOLKIT_EXCHANGE_BCF_BCF_NAMES_H

#include <string>
#include <string_view>

namespace ZORToolkit {

/// Of each topic. Several tools look for nothing else.
inline constexpr char kFirstViewpoint[] = "viewpoint.bcfv", kFirstSnapshot[] = "snapshot.png";

/// The clash result that goes with a BCF file of ours: what BCF cannot carry is in it.
inline constexpr char kAttachedResult[] = "lyra-result.clash.xml";
/// Version 3.0 keeps documents under their GUIDs; those of ours begin so.
inline constexpr char kAttachedGuidStart[] = "6c797261-";

inline bool IsAttachedResult(std::string_view inName) {
  return inName.ends_with(kAttachedResult) ||
         inName.find(std::string("documents/").append(kAttachedGuidStart)) != std::string::npos;
}

}  // namespace ZORToolkit

#endif
