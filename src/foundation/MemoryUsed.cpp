#include "foundation/MemoryUsed.h"

#include <sys/resource.h>

namespace ZORFoundation {

double MegabytesUsed() {
  rusage own{}, started{};
  getrusage(RUSAGE_SELF, &own);
  getrusage(RUSAGE_CHILDREN, &started);
  return static_cast<double>(own.ru_maxrss + started.ru_maxrss) / 1024;
}

}  // namespace ZORFoundation
