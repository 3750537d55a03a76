// Processor time, by which work is planned: whatever else a machine does makes no difference to it.
#ifndef ZOR_TOOLKIT_SHARDING_PROCESSORTIME_H
#define ZOR_TOOLKIT_SHARDING_PROCESSORTIME_H

#include <ctime>

namespace ZORToolkit {

/// Of this process with all its threads, since it was started, in seconds.
inline double ProcessorSeconds() { return static_cast<double>(std::clock()) / CLOCKS_PER_SEC; }

}  // namespace ZORToolkit

#endif
