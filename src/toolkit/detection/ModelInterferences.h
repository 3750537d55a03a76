// The plugin that finds interferences in a model's exact geometry, loaded when it is first needed.
#ifndef ZOR_TOOLKIT_DETECTION_MODELINTERFERENCES_H
#define ZOR_TOOLKIT_DETECTION_MODELINTERFERENCES_H

#include <string>
#include <vector>

#include "toolkit/detection/FindInterferences.h"

namespace ZORDetection {

/// Like FindInterferences, between products of a model file. Raises nothing.
/// @param inProducts their parts are the model's, by ProductInfo::part.
/// @param outReason  why nothing could be looked at, one line; untouched on success.
typedef bool FindInModelFunction(const std::string& inModel, const std::vector<Product>& inProducts,
                                 const Options& inOptions, Findings& outFindings,
                                 std::string& outReason);

inline constexpr char kDetectionLibrary[] = "libZORClashDetection.so";
inline constexpr char kFindInModelName[] = "ZORFindInterferencesInModel";

}  // namespace ZORDetection

#endif
