// Running a command.
#ifndef ZOR_BENCH_CHILD_PROCESS_H
#define ZOR_BENCH_CHILD_PROCESS_H

#include <string>
#include <vector>

struct ChildOutcome {
  int exitCode;         ///< 128 and the signal's number when one ended the command
  std::string output;   ///< what it wrote to its standard output
  double milliseconds;  ///< from before its start until its end was known
  double processorMilliseconds;
  double peakMegabytes;
};

/// Runs a command (its path and arguments, no shell) with an empty standard input and waits for its
/// end. Its standard error is ours. Raises std::runtime_error when it cannot be started.
ChildOutcome RunChild(const std::vector<std::string>& inCommand);

#endif
