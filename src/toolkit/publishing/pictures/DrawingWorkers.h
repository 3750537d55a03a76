// Drawing in several processes.
#ifndef ZOR_TOOLKIT_PUBLISHING_PICTURES_DRAWINGWORKERS_H
#define ZOR_TOOLKIT_PUBLISHING_PICTURES_DRAWINGWORKERS_H

#include <cstddef>
#include <functional>

namespace ZORToolkit {

struct DrawingWork {
  std::size_t count = 0;
  std::function<void(std::size_t)> draw;  ///< in one of the processes, for each of the count
  /// Here, with how many are drawn and the seconds of processor time that all these took.
  std::function<void(std::size_t, double)> isDone;
};

/// Shares the work among processes that start as copies of this one, which should have drawn nothing
/// yet and run no other thread. Nothing is drawn here, so that a drawing that crashes is the only one
/// that is lost. A termination signal lets each drawing be finished that is begun, and is
/// then raised as ZORFoundation::Interrupted. Raises Error when no process can be started.
void DrawInProcesses(int inProcesses, const DrawingWork& inWork);

}  // namespace ZORToolkit

#endif
