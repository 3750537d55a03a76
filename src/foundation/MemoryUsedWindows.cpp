#include "foundation/MemoryUsed.h"
#include "foundation/WindowsCalls.h"
// After the types that it needs.
#include <psapi.h>

namespace ZORFoundation {

double MegabytesUsed() {
  PROCESS_MEMORY_COUNTERS counters{};
  if (GetProcessMemoryInfo(GetCurrentProcess(), &counters, sizeof counters) == FALSE) return 0;
  return static_cast<double>(counters.PeakWorkingSetSize) / (1 << 20);
}

}  // namespace ZORFoundation
