// What the system keeps of this process: its environment, and what it used. Texts are UTF-8.
#ifndef ZOR_FOUNDATION_PROCESS_H
#define ZOR_FOUNDATION_PROCESS_H

#include "ZORFoundationExport.h"

namespace ZORFoundation {

/// @return the value that a variable of the environment has now, null without one; not to be kept
/// beyond a change of it.
ZOR_FOUNDATION_EXPORT const char* ReadEnvironment(const char* inName);

/// @param inValue null removes the variable.
ZOR_FOUNDATION_EXPORT void WriteEnvironment(const char* inName, const char* inValue);

/// @return in megabytes, the largest amount of memory that this process has had so far, plus that of
/// the largest process that it started and that has ended, where the system counts those.
ZOR_FOUNDATION_EXPORT double MegabytesUsed();

/// @return the processor time, in seconds, of all threads of this process since it was started.
ZOR_FOUNDATION_EXPORT double ProcessorSeconds();

}  // namespace ZORFoundation

#endif
