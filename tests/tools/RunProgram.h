// Starting a program, as each kind of system does it.
#ifndef ZOR_TESTS_TOOLS_RUNPROGRAM_H
#define ZOR_TESTS_TOOLS_RUNPROGRAM_H

#include <string>
#include <vector>

/// Files that stand for a program's streams.
struct ProgramStreams {
  std::string in, out, error;
};

/// Runs a program in a folder and waits for its end.
/// @return its exit code, or minus the signal that ended it.
int RunProgram(std::vector<std::string> inWords, const std::string& inFolder,
               const ProgramStreams& inStreams);

#endif
