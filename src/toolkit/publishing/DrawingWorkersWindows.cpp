// Windows starts no process as a copy of another: everything is drawn in this one.
#include "foundation/TerminationSignals.h"
#include "toolkit/publishing/DrawingWorkers.h"

namespace ZORToolkit {

void DrawInProcesses(int /*inProcesses*/, const DrawingWork& inWork) {
  const ZORFoundation::StopRequest stop;
  for (std::size_t i = 0; i < inWork.count; ++i) {
    inWork.draw(i);
    inWork.isDone(i + 1);
    stop.Check();
  }
}

}  // namespace ZORToolkit
