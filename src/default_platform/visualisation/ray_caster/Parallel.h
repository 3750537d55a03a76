// Sharing work among threads.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_PARALLEL_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_PARALLEL_H

#include <functional>

namespace ZORRayCaster {

/// Calls inWork for 0 to inCount - 1, each once, in no particular order. The caller's thread takes
/// part; with one thread no other is made. What the work raises is raised here.
void ForEach(int inThreadCount, int inCount, const std::function<void(int)>& inWork);

}  // namespace ZORRayCaster

#endif
