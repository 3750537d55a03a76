// Drawing in several processes.
#ifndef ZOR_TOOLKIT_PUBLISHING_PICTURES_DRAWINGWORKERS_H
#define ZOR_TOOLKIT_PUBLISHING_PICTURES_DRAWINGWORKERS_H

#include <cstddef>
#include <functional>

namespace ZORToolkit {

/// A number of independent drawings.
struct DrawingWork {
  std::size_t count = 0;
  std::function<void(std::size_t)> draw;  ///< called in one of the processes for each index
  /// Called in this process, with the number drawn so far and the processor time of all these in
  /// seconds.
  std::function<void(std::size_t, double)> isDone;
};

/// Shares the work among processes that start as copies of this one, which should have drawn
/// nothing yet and run no other thread. Nothing is drawn here, so that a drawing that crashes is
/// the only one that is lost. After a termination signal the drawings that were begun are finished,
/// then ZORFoundation::Interrupted is raised. Raises Error when no process can be started.
void DrawInProcesses(int inProcesses, const DrawingWork& inWork);

}  // namespace ZORToolkit

#endif
