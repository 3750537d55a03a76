// The signals by which a user or the system ends a program: SIGINT, SIGTERM and SIGHUP. One that is
// ignored from the start, as under nohup, stays ignored.
#ifndef ZOR_FOUNDATION_TERMINATIONSIGNALS_H
#define ZOR_FOUNDATION_TERMINATIONSIGNALS_H

#include <cstddef>

#include "ZORFoundationExport.h"

namespace ZORFoundation {

/// Makes these signals remove unfinished files before they end the process. For programs to call; a
/// library leaves its host's signals alone.
ZOR_FOUNDATION_EXPORT void HandleTerminationSignals();

/// While this lives, a termination signal removes a file or a folder that is empty by then, if the
/// program handles such signals.
class ZOR_FOUNDATION_EXPORT RemoveOnSignal {
 public:
  /// @param inPath lives as long as this; it need not exist yet.
  explicit RemoveOnSignal(const char* inPath) noexcept;
  ~RemoveOnSignal();
  RemoveOnSignal(const RemoveOnSignal&) = delete;
  RemoveOnSignal& operator=(const RemoveOnSignal&) = delete;

 private:
  std::size_t slot_;
};

/// What the handlers do before they end the process; async-signal-safe. For whoever ends it without
/// destructors.
ZOR_FOUNDATION_EXPORT void RemoveUnfinishedFiles() noexcept;

/// While this lives the first termination signal is only recorded, so that work can stop cleanly;
/// the next one ends the process. One at a time; inherited by forked processes.
class ZOR_FOUNDATION_EXPORT StopRequest {
 public:
  StopRequest();
  /// Restores the previous handling.
  ~StopRequest();
  StopRequest(const StopRequest&) = delete;
  StopRequest& operator=(const StopRequest&) = delete;

  /// @return the signal; 0 before one came.
  int Recorded() const;
  bool IsMade() const { return Recorded() != 0; }
  /// Raises Interrupted once a signal was recorded.
  void Check() const;
};

/// Work was stopped because of a signal.
struct Interrupted {
  int signal;
};

/// Ends the process as the uncaught signal would.
[[noreturn]] ZOR_FOUNDATION_EXPORT void EndBySignal(int inSignal);

}  // namespace ZORFoundation

#endif
