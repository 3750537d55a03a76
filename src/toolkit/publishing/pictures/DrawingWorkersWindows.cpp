// Windows starts no process as a copy of another: everything is drawn in this one.
#include <filesystem>

#include "foundation/Process.h"
#include "foundation/TerminationSignals.h"
#include "toolkit/publishing/pictures/DrawingWorkers.h"

namespace ZORToolkit {

// Drawings change the current folder, which is this process's here: relative paths of the caller go
// from the one that there was, and Windows removes no folder that is a process's current one.
void DrawInProcesses(int /*inProcesses*/, const DrawingWork& inWork) {
  const ZORFoundation::StopRequest stop;
  const std::filesystem::path folder = std::filesystem::current_path();
  const double start = ZORFoundation::ProcessorSeconds();
  for (std::size_t i = 0; i < inWork.count; ++i) {
    inWork.draw(i);
    std::filesystem::current_path(folder);
    inWork.isDone(i + 1, ZORFoundation::ProcessorSeconds() - start);
    stop.Check();
  }
}

}  // namespace ZORToolkit
