// Points that lie together; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_REVIEW_PLACE_CLUSTERS_H
#define ZOR_TOOLKIT_REVIEW_PLACE_CLUSTERS_H

#include <vector>

#include "toolkit/review/Frames.h"

namespace ZORToolkit {

/// Single linkage: points belong together that can be reached from one another by steps of at most
/// a distance. @return for each point the number of its cluster; clusters are numbered from 0 in
/// the order of their first points. n log n.
std::vector<int> ClusterPlaces(const std::vector<Point3>& inPoints, double inDistance);

}  // namespace ZORToolkit

#endif
