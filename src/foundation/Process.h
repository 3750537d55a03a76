// What the system keeps of this process: its environment, and what it used. Texts are UTF-8.
#ifndef ZOR_FOUNDATION_PROCESS_H
#define ZOR_FOUNDATION_PROCESS_H

#include <string>
#include <vector>

#include "ZORFoundationExport.h"

namespace ZORFoundation {

/// @return the value that a variable of the environment has now, null without one; not to be kept
/// beyond a change of it.
ZOR_FOUNDATION_EXPORT const char* ReadEnvironment(const char* inName);

/// @param inValue null removes the variable.
ZOR_FOUNDATION_EXPORT void WriteEnvironment(const char* inName, const char* inValue);

/// @return the words of this process's command line.
/// @param inArguments those that main was given. On Windows they have lost what the ANSI code page
///        lacks, and the process is asked itself.
ZOR_FOUNDATION_EXPORT std::vector<std::string> WordsOfCommandLine(int inCount, char** inArguments);

/// @return in megabytes, the largest amount of memory that this process has had so far, plus that of
/// the largest process that it started and that has ended, where the system counts those.
ZOR_FOUNDATION_EXPORT double MegabytesUsed();

/// @return the processor time, in seconds, of all threads of this process since it was started.
ZOR_FOUNDATION_EXPORT double ProcessorSeconds();

}  // namespace ZORFoundation

#endif
