// A detection that several machines share.
#ifndef ZOR_TOOLKIT_SHARDING_DETECTION_SHARE_H
#define ZOR_TOOLKIT_SHARDING_DETECTION_SHARE_H

#include <string>
#include <vector>

#include "toolkit/detection/Detect.h"
#include "toolkit/sharding/ShareFolder.h"

namespace ZORToolkit {

/// Finds one share of the verdicts into a folder. A termination signal ends it with what is found
/// so far, and is then raised as ZORFoundation::Interrupted. A run that resumes goes on from there,
/// also where the process was killed.
/// @param inManifest says where and of what: all but its plan and its files.
/// Raises what Detect does.
ZOR_TOOLKIT_EXPORT ShareSize DetectShare(const std::string& inModel, DetectionOptions inOptions,
                                         ShareManifest inManifest, bool inResumes);

/// What one machine would find, from all shares.
/// @param inShares as ReadAllShares gives them.
/// Raises what Detect does, and Error when a verdict is in no share or in two.
ZOR_TOOLKIT_EXPORT DetectionResult GatherDetection(const std::string& inModel,
                                                   DetectionOptions inOptions,
                                                   const std::vector<ShareManifest>& inShares);

/// Finds a few of the verdicts, for a plan.
ZOR_TOOLKIT_EXPORT WorkSample SampleDetection(const std::string& inModel,
                                              DetectionOptions inOptions);

}  // namespace ZORToolkit

#endif
