// The signals by which a user or the system ends the command: SIGINT, SIGTERM and SIGHUP. One that
// is ignored from the start, as under nohup, stays ignored.
#ifndef ZOR_TOOLS_LYRA_ENDING_SIGNALS_H
#define ZOR_TOOLS_LYRA_ENDING_SIGNALS_H

#include <cstddef>

namespace lyra {

/// A file that is removed when such a signal ends the process while this lives.
class RemovedAtSignal {
 public:
  /// @param inPath lives as long as this.
  explicit RemovedAtSignal(const char* inPath);
  ~RemovedAtSignal();
  RemovedAtSignal(const RemovedAtSignal&) = delete;
  RemovedAtSignal& operator=(const RemovedAtSignal&) = delete;

 private:
  std::size_t place_;
};

/// While this lives the first such signal is only noted, for work that is to stop in good order;
/// the next one ends the process. One at a time; copies of the process have it too.
class StopRequest {
 public:
  StopRequest();
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
[[noreturn]] void EndBy(int inSignal);

}  // namespace lyra

#endif
