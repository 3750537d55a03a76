// Windows starts no process as a copy of another: everything is drawn in this one.
#include "foundation/Process.h"
#include "foundation/TerminationSignals.h"
#include "toolkit/publishing/pictures/DrawingWorkers.h"

namespace ZORToolkit {

void DrawInProcesses(int /*inProcesses*/, const DrawingWork& inWork) {
  const ZORFoundation::StopRequest stop;
  const double start = ZORFoundation::ProcessorSeconds();
  for (std::size_t i = 0; i < inWork.count; ++i) {
    inWork.draw(i);
    inWork.isDone(i + 1, ZORFoundation::ProcessorSeconds() - start);
    stop.Check();
  }
}

}  // namespace ZORToolkit
