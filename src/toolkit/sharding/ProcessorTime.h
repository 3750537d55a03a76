// Processor time, by which work is planned: whatever else a machine does makes no difference to it.
#ifndef ZOR_TOOLKIT_SHARDING_PROCESSOR_TIME_H
#define ZOR_TOOLKIT_SHARDING_PROCESSOR_TIME_H

#include <time.h>

namespace ZORToolkit {

/// Of this process with all its threads, since it was started, in seconds.
inline double ProcessorSeconds() {
  timespec time{};
  clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &time);
  return static_cast<double>(time.tv_sec) + 1e-9 * static_cast<double>(time.tv_nsec);
}

}  // namespace ZORToolkit

#endif
