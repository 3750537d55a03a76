// A mesh library's collision and distance, on the triangles that the detection uses.
#ifndef ZOR_BENCH_DETECTION_MESHPEER_H
#define ZOR_BENCH_DETECTION_MESHPEER_H

#include <utility>
#include <vector>

#include "toolkit/detection/Assembly.h"

namespace ZORDetection {

using NearPairs = std::vector<std::pair<std::uint32_t, std::uint32_t>>;

/// Processor time for all pairs, without that for building the hierarchies; 0 without the library.
double MeshPeerSeconds(const Assembly& inAssembly, const NearPairs& inPairs);

}  // namespace ZORDetection

#endif
