#include "default_platform/product_structure/ReaderProcess.h"

#include <fcntl.h>
#include <poll.h>
#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <utility>

#include "foundation/ReadWholeFile.h"
#include "foundation/TemporaryFile.h"

namespace ZORDefault {
namespace {

using ZORFoundation::Descriptor;

/// Above the descriptors that the reader is given, so that none is overwritten while they are put
/// in their places.
Descriptor RaisedCopy(int inDescriptor) {
  constexpr int kMinDescriptor = 16;
  Descriptor raised(fcntl(inDescriptor, F_DUPFD_CLOEXEC, kMinDescriptor));
  if (!raised.IsOpen()) RaiseReaderError("no file can be opened", errno);
  return raised;
}

Descriptor Raised(int inDescriptor) {
  const Descriptor original(inDescriptor);
  return RaisedCopy(inDescriptor);
}

Descriptor MemoryFile(std::string_view inBytes) try {
  return Raised(ZORFoundation::NewMemoryFile(inBytes).Release());
} catch (const ZORFoundation::FileError& error) {
  RaiseReaderError("no memory file can be made", error.Code());
}

struct Pipe {
  Descriptor read, write;
};

Pipe MakePipe() {
  int ends[2];
  if (pipe2(ends, O_CLOEXEC) != 0) RaiseReaderError("no pipe can be made", errno);
  Descriptor read(ends[0]);
  return {std::move(read), Raised(ends[1])};
}

/// The descriptors of a new process.
class SpawnRequest {
 public:
  SpawnRequest() {
    posix_spawn_file_actions_init(&actions_);
    posix_spawnattr_init(&attributes_);
  }
  ~SpawnRequest() {
    posix_spawn_file_actions_destroy(&actions_);
    posix_spawnattr_destroy(&attributes_);
  }
  SpawnRequest(const SpawnRequest&) = delete;
  SpawnRequest& operator=(const SpawnRequest&) = delete;

  void Give(const Descriptor& inDescriptor, int inNumber) {
    posix_spawn_file_actions_adddup2(&actions_, inDescriptor.Get(), inNumber);
    next_ = std::max(next_, inNumber + 1);
  }

  /// Signals as they are by default; all other descriptors closed; its standard ones on the null
  /// device, since the kernel prints.
  pid_t Spawn(const ReaderStart& inStart) {
    for (const int standard : {0, 1, 2})
      posix_spawn_file_actions_addopen(&actions_, standard, "/dev/null", O_RDWR, 0);
    posix_spawn_file_actions_addclosefrom_np(&actions_, next_);
    sigset_t signals;
    sigfillset(&signals);
    posix_spawnattr_setsigdefault(&attributes_, &signals);
    sigemptyset(&signals);
    posix_spawnattr_setsigmask(&attributes_, &signals);
    posix_spawnattr_setflags(&attributes_, POSIX_SPAWN_SETSIGDEF | POSIX_SPAWN_SETSIGMASK);
    std::vector<char*> arguments;
    arguments.reserve(inStart.arguments.size() + 2);
    arguments.push_back(const_cast<char*>(inStart.program.c_str()));
    for (const std::string& argument : inStart.arguments)
      arguments.push_back(const_cast<char*>(argument.c_str()));
    arguments.push_back(nullptr);
    pid_t process = 0;
    const int error =
        posix_spawn(&process, arguments[0], &actions_, &attributes_, arguments.data(), environ);
    if (error != 0) RaiseReaderError("the model reader " + inStart.program, error);
    return process;
  }

 private:
  posix_spawn_file_actions_t actions_;
  posix_spawnattr_t attributes_;
  int next_ = 3;  // the first descriptor that is not given
};

}  // namespace

struct ReaderProcess::System {
  Descriptor result = MemoryFile({});
  Descriptor status;
  pid_t process = -1;
};

ReaderProcess::ReaderProcess(const ReaderStart& inStart) : system_(std::make_unique<System>()) {
  const Descriptor model = MemoryFile(inStart.model);
  const Descriptor task = MemoryFile(inStart.task);
  const Descriptor kept = inStart.kept < 0 ? Descriptor() : RaisedCopy(inStart.kept);
  Pipe status = MakePipe();
  SpawnRequest request;
  request.Give(model, ModelReaderProtocol::kModel);
  request.Give(system_->result, ModelReaderProtocol::kResult);
  request.Give(status.write, ModelReaderProtocol::kStatus);
  request.Give(task, ModelReaderProtocol::kTask);
  if (kept.IsOpen()) request.Give(kept, ModelReaderProtocol::kKept);
  system_->status = std::move(status.read);
  system_->process = request.Spawn(inStart);
}

ReaderProcess::~ReaderProcess() {
  if (system_->process > 0) Kill();
}

std::optional<std::string> ReaderProcess::ReadStatus(
    std::optional<std::chrono::milliseconds> inTimeout) {
  constexpr std::chrono::milliseconds kMost(1 << 30);
  pollfd waiting{system_->status.Get(), POLLIN, 0};
  const int milliseconds =
      inTimeout
          ? static_cast<int>(std::clamp(*inTimeout, std::chrono::milliseconds(0), kMost).count())
          : -1;
  if (poll(&waiting, 1, milliseconds) <= 0) return std::nullopt;
  char buffer[4096];
  const ssize_t count = read(system_->status.Get(), buffer, sizeof buffer);
  if (count < 0) return std::nullopt;
  return std::string(buffer, static_cast<std::size_t>(count));
}

void ReaderProcess::AskToEnd() { kill(system_->process, SIGTERM); }

void ReaderProcess::Kill() {
  kill(system_->process, SIGKILL);
  Wait();
}

// When the host reaps all its children itself, the end is that of a success.
ReaderEnd ReaderProcess::Wait() {
  int status = 0;
  while (waitpid(system_->process, &status, 0) < 0 && errno == EINTR) {
  }
  system_->process = -1;
  ReaderEnd end;
  if (WIFSIGNALED(status)) {
    end.isOverTime = WTERMSIG(status) == SIGXCPU;
    end.crash = sigabbrev_np(WTERMSIG(status));
  } else {
    end.code = WEXITSTATUS(status);
  }
  return end;
}

std::string ReaderProcess::TakeResult() const {
  if (lseek(system_->result.Get(), 0, SEEK_SET) != 0) RaiseReaderError("no result", errno);
  return ZORFoundation::ReadToEnd(system_->result.Get(), "result");
}

}  // namespace ZORDefault
