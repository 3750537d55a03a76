// How much memory a program took.
#ifndef ZOR_FOUNDATION_MEMORYUSED_H
#define ZOR_FOUNDATION_MEMORYUSED_H

#include "ZORFoundationExport.h"

namespace ZORFoundation {

/// @return in megabytes, the most that this process took so far, and with it the largest process that
/// it started and that has ended, where the system counts those.
ZOR_FOUNDATION_EXPORT double MegabytesUsed();

}  // namespace ZORFoundation

#endif
