#include "toolkit/publishing/pictures/DrawingWorkers.h"

#include <fcntl.h>
#include <signal.h>
#include <sys/mman.h>
#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <cstring>
#include <exception>
#include <new>
#include <numeric>
#include <string>
#include <utility>
#include <vector>

#include "foundation/Process.h"
#include "foundation/TerminationSignals.h"
#include "toolkit/Error.h"

namespace ZORToolkit {
namespace {

[[noreturn]] void FailToStart() {
  throw Error(std::string("no process can be started to draw: ") + std::strerror(errno));
}

/// A number that all processes count up together.
class SharedCounter {
 public:
  SharedCounter()
      : memory_(mmap(nullptr, sizeof(Number), PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS,
                     -1, 0)) {
    if (memory_ == MAP_FAILED) FailToStart();
    number_ = new (memory_) Number(0);
  }
  ~SharedCounter() { munmap(memory_, sizeof(Number)); }
  SharedCounter(const SharedCounter&) = delete;
  SharedCounter& operator=(const SharedCounter&) = delete;

  std::size_t Next() { return number_->fetch_add(1); }
  void Set(std::size_t inNumber) { *number_ = inNumber; }
  std::size_t Current() const { return *number_; }

 private:
  using Number = std::atomic<std::size_t>;
  static_assert(Number::is_always_lock_free);

  void* memory_;
  Number* number_ = nullptr;
};

/// Each process writes for each picture that it drew how long that took: as much at once as a pipe
/// never cuts.
struct Pipe {
  Pipe() {
    int ends[2];
    if (pipe2(ends, O_CLOEXEC) != 0) FailToStart();
    reader = ends[0];
    writer = ends[1];
  }
  ~Pipe() {
    close(reader);
    CloseWriter();
  }
  Pipe(const Pipe&) = delete;
  Pipe& operator=(const Pipe&) = delete;

  void CloseWriter() {
    if (writer >= 0) close(writer);
    writer = -1;
  }

  int reader, writer;
};

/// Lets this process end with its parent, however that ends.
void EndWith(pid_t inParent) {
  prctl(PR_SET_PDEATHSIG, SIGKILL);
  if (getppid() != inParent) _exit(1);  // ended before that took effect
}

[[noreturn]] void Work(const DrawingWork& inWork, const ZORFoundation::StopRequest& inStop,
                       SharedCounter& ioNext, const Pipe& inPipe) {
  int code = 0;
  try {
    close(inPipe.reader);
    double last = ZORFoundation::ProcessorSeconds();
    for (std::size_t i = ioNext.Next(); i < inWork.count; i = ioNext.Next()) {
      inWork.draw(i);
      const double now = ZORFoundation::ProcessorSeconds();
      const double seconds = now - std::exchange(last, now);
      if (write(inPipe.writer, &seconds, sizeof seconds) != sizeof seconds || inStop.IsMade())
        break;
    }
  } catch (const std::exception&) {
    code = 1;
  }
  _exit(code);  // what this process shares with its parent is the parent's to write and to remove
}

struct Progress {
  std::size_t done = 0;
  double seconds = 0;
};

void Follow(const DrawingWork& inWork, const ZORFoundation::StopRequest& inStop, const Pipe& inPipe,
            SharedCounter& ioNext, Progress& ioProgress) {
  double seconds[32];
  for (;;) {
    const ssize_t count = read(inPipe.reader, seconds, sizeof seconds);
    if (count < 0 && errno == EINTR) continue;
    if (count <= 0) return;
    const std::size_t drawn = static_cast<std::size_t>(count) / sizeof seconds[0];
    ioProgress.done += drawn;
    ioProgress.seconds = std::accumulate(seconds, seconds + drawn, ioProgress.seconds);
    inWork.isDone(ioProgress.done, ioProgress.seconds);
    if (inStop.IsMade()) ioNext.Set(inWork.count);  // so that no worker begins another
  }
}

bool EndedWell(pid_t inProcess) {
  int status = 0;
  while (waitpid(inProcess, &status, 0) < 0)
    if (errno != EINTR) return false;
  return WIFEXITED(status) && WEXITSTATUS(status) == 0;
}

/// @return how many of the processes failed.
int DrawOnce(int inProcesses, const DrawingWork& inWork, const ZORFoundation::StopRequest& inStop,
             SharedCounter& ioNext, Progress& ioProgress) {
  Pipe pipe;
  const pid_t self = getpid();
  std::vector<pid_t> processes;
  for (int i = 0; i < inProcesses; ++i) {
    const pid_t process = fork();
    if (process == 0) {
      EndWith(self);
      Work(inWork, inStop, ioNext, pipe);
    }
    if (process > 0) processes.push_back(process);
  }
  if (processes.empty()) FailToStart();
  pipe.CloseWriter();
  try {
    Follow(inWork, inStop, pipe, ioNext, ioProgress);
  } catch (...) {  // whoever is told how many are drawn has had enough
    ioNext.Set(inWork.count);
    for (const pid_t process : processes) EndedWell(process);
    throw;
  }
  int failures = 0;
  for (const pid_t process : processes) failures += EndedWell(process) ? 0 : 1;
  return failures;
}

}  // namespace

// What a process that crashed was drawing is given up; what was not begun yet is not.
void DrawInProcesses(int inProcesses, const DrawingWork& inWork) {
  const ZORFoundation::StopRequest stop;
  SharedCounter next;
  Progress progress;
  while (DrawOnce(inProcesses, inWork, stop, next, progress) > 0 && !stop.IsMade() &&
         next.Current() < inWork.count)
    continue;
  stop.Check();
}

}  // namespace ZORToolkit
