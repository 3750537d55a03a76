// The signals by which a user or the system ends a program: SIGINT, SIGTERM and SIGHUP. One that is
// ignored from the start, as under nohup, stays ignored.
#ifndef ZOR_FOUNDATION_TERMINATIONSIGNALS_H
#define ZOR_FOUNDATION_TERMINATIONSIGNALS_H

#include <cstddef>

#include "ZORFoundationExport.h"

namespace ZORFoundation {

/// From now on such a signal removes unfinished files before it ends the process. It is for the
/// program to call this; a library leaves its host's signals alone.
ZOR_FOUNDATION_EXPORT void HandleTerminationSignals();

/// While this lives, a termination signal that is handled removes a file of this process.
class ZOR_FOUNDATION_EXPORT RemoveOnSignal {
 public:
  /// @param inPath lives as long as this; the file need not exist yet.
  explicit RemoveOnSignal(const char* inPath) noexcept;
  ~RemoveOnSignal();
  RemoveOnSignal(const RemoveOnSignal&) = delete;
  RemoveOnSignal& operator=(const RemoveOnSignal&) = delete;

 private:
  std::size_t slot_;
};

/// While this lives the first termination signal is only noted, for work that is to stop in good
/// order; the next one ends the process. One at a time; forked processes have it too.
class ZOR_FOUNDATION_EXPORT StopRequest {
 public:
  StopRequest();
  /// The signals are handled as before.
  ~StopRequest();
  StopRequest(const StopRequest&) = delete;
  StopRequest& operator=(const StopRequest&) = delete;

  bool IsMade() const;
  /// Raises Interrupted when it is made.
  void Check() const;
};

/// Work was stopped because of a signal.
struct Interrupted {
  int signal;
};

/// Ends the process as the signal does that is not caught.
[[noreturn]] ZOR_FOUNDATION_EXPORT void EndBySignal(int inSignal);

}  // namespace ZORFoundation

#endif
