#include "default_platform/product_structure/ModelReader.h"

#include <fcntl.h>
#include <poll.h>
#include <signal.h>
#include <spawn.h>
#include <sys/mman.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cctype>
#include <cerrno>
#include <chrono>
#include <cstdlib>
#include <cstring>
#include <optional>
#include <system_error>
#include <utility>

#include "foundation/Descriptor.h"
#include "foundation/PluginLoader.h"
#include "foundation/ReadWholeFile.h"

namespace ZORDefault {
namespace {

using ZORFoundation::Descriptor;
typedef std::chrono::steady_clock Clock;

[[noreturn]] void RaiseSystemError(const char* inWhat, int inCode) {
  throw ModelReaderError{
      ModelErrorKind::kNoReader,
      std::string("cannot be read: ") + inWhat + ": " + std::generic_category().message(inCode)};
}

/// Above the descriptors that the reader is given, so that none is overwritten while they are put
/// in their places.
Descriptor RaisedCopy(int inDescriptor) {
  constexpr int kMinDescriptor = 16;
  Descriptor raised(fcntl(inDescriptor, F_DUPFD_CLOEXEC, kMinDescriptor));
  if (!raised.IsOpen()) RaiseSystemError("no file can be opened", errno);
  return raised;
}

Descriptor Raised(int inDescriptor) {
  const Descriptor original(inDescriptor);
  return RaisedCopy(inDescriptor);
}

Descriptor MemoryFile(std::string_view inBytes) {
  const int descriptor = memfd_create("model", MFD_CLOEXEC);
  if (descriptor < 0) RaiseSystemError("no memory file can be made", errno);
  Descriptor file = Raised(descriptor);
  std::size_t written = 0;
  if (const int error = ZORFoundation::WriteAll(file.Get(), inBytes, written); error != 0)
    RaiseSystemError("no memory file can be written", error);
  return file;
}

struct Pipe {
  Descriptor read, write;
};

Pipe MakePipe() {
  int ends[2];
  if (pipe2(ends, O_CLOEXEC) != 0) RaiseSystemError("no pipe can be made", errno);
  Descriptor read(ends[0]);
  return {std::move(read), Raised(ends[1])};
}

/// The arguments and the descriptors of a new process.
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
  /// device, since the kernel prints. @return the process, or a negative errno value.
  pid_t Spawn(const std::vector<std::string>& inArguments) {
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
    arguments.reserve(inArguments.size() + 1);
    for (const std::string& argument : inArguments)
      arguments.push_back(const_cast<char*>(argument.c_str()));
    arguments.push_back(nullptr);
    pid_t process = 0;
    const int error =
        posix_spawn(&process, arguments[0], &actions_, &attributes_, arguments.data(), environ);
    return error == 0 ? process : -error;
  }

 private:
  posix_spawn_file_actions_t actions_;
  posix_spawnattr_t attributes_;
  int next_ = 3;  // the first descriptor that is not given
};

/// A process that never outlives this object.
class Child {
 public:
  explicit Child(pid_t inProcess) : process_(inProcess) {}
  ~Child() {
    if (process_ > 0) Kill();
  }
  Child(const Child&) = delete;
  Child& operator=(const Child&) = delete;

  void AskToEnd() { kill(process_, SIGTERM); }
  void Kill() {
    kill(process_, SIGKILL);
    Wait();
  }
  /// @return its status; that of a success when the host reaps all its children itself.
  int Wait() {
    int status = 0;
    while (waitpid(process_, &status, 0) < 0 && errno == EINTR) {
    }
    process_ = -1;
    return status;
  }

 private:
  pid_t process_;
};

/// Follows the lines by which the reader reports how far it is.
class StatusLines {
 public:
  StatusLines(const std::function<void(double)>& inProgress,
              const std::function<bool(std::string_view)>& inTell)
      : progress_(inProgress), tell_(inTell) {}

  /// @return false when the reader is to end.
  bool Add(std::string_view inText) {
    bool goesOn = true;
    for (const char byte : inText) {
      if (byte != '\n')
        line_ += byte;
      else
        goesOn = AddLine() && goesOn;
    }
    return goesOn;
  }
  const std::string& Stage() const { return stage_; }
  bool IsModelRead() const { return isModelRead_; }

 private:
  bool AddLine() {
    const std::string line = std::exchange(line_, {});
    if (line.starts_with('=')) {
      isModelRead_ = true;
      return !tell_ || tell_(std::string_view(line).substr(1));
    }
    if (std::isdigit(static_cast<unsigned char>(line.front())) == 0)
      stage_ = line;
    else if (progress_)
      progress_(std::atoi(line.c_str()) / 100.0);
    return true;
  }

  const std::function<void(double)>& progress_;
  const std::function<bool(std::string_view)>& tell_;
  std::string line_;
  std::string stage_ = "starting";
  bool isModelRead_ = false;
};

/// @return false when the time is over before the reader has ended.
bool FollowUntilEnd(const Descriptor& inStatus, Clock::time_point inDeadline, Child& ioChild,
                    StatusLines& ioLines) {
  for (;;) {
    const auto left =
        std::chrono::duration_cast<std::chrono::milliseconds>(inDeadline - Clock::now()).count();
    if (left <= 0 && !ioLines.IsModelRead()) return false;
    pollfd waiting{inStatus.Get(), POLLIN, 0};
    const bool isForEver = ioLines.IsModelRead();
    const int ready =
        poll(&waiting, 1, isForEver ? -1 : static_cast<int>(std::min<long>(left, 1 << 30)));
    if (ready <= 0) continue;  // the time is over, or a signal came
    char buffer[4096];
    const ssize_t count = read(inStatus.Get(), buffer, sizeof buffer);
    if (count == 0) return true;
    if (count > 0 && !ioLines.Add({buffer, static_cast<std::size_t>(count)})) ioChild.AskToEnd();
  }
}

std::string Bytes(std::uint64_t inCount) {
  return std::to_string((inCount + (1 << 20) - 1) >> 20) + " MB";
}

std::string Seconds(double inSeconds) {
  char text[32];
  std::snprintf(text, sizeof text, "%.3g s", inSeconds);
  return text;
}

[[noreturn]] void RaiseExcess(ModelErrorKind inKind, const std::string& inLimit,
                              const StatusLines& inLines) {
  throw ModelReaderError{inKind, "takes more than " + inLimit +
                                     (inLines.IsModelRead() ? " to work on" : " to read") +
                                     "; stopped while " + inLines.Stage()};
}

/// Raises why the reader ended without an answer.
void CheckEnd(int inStatus, const ModelLimits& inLimits, const StatusLines& inLines) {
  if (WIFSIGNALED(inStatus)) {
    const int signal = WTERMSIG(inStatus);
    if (signal == SIGXCPU)
      RaiseExcess(ModelErrorKind::kTimeLimit, Seconds(inLimits.seconds), inLines);
    throw ModelReaderError{
        ModelErrorKind::kCrash,
        std::string("cannot be ") + (inLines.IsModelRead() ? "worked on" : "read") +
            ": the CAD kernel crashed (" + sigabbrev_np(signal) + ") while " + inLines.Stage()};
  }
  const int code = WEXITSTATUS(inStatus);
  if (code == ModelReaderProtocol::kExitOutOfMemory)
    RaiseExcess(ModelErrorKind::kMemoryLimit, Bytes(inLimits.memory), inLines);
  if (code != ModelReaderProtocol::kExitRead && code != ModelReaderProtocol::kExitRefused)
    throw ModelReaderError{ModelErrorKind::kCrash,
                           "cannot be read: the model reader ended with exit code " +
                               std::to_string(code) + " while " + inLines.Stage()};
}

std::string TakeResult(const Descriptor& inResult) {
  if (lseek(inResult.Get(), 0, SEEK_SET) != 0) RaiseSystemError("no result", errno);
  return ZORFoundation::ReadToEnd(inResult.Get(), "result");
}

}  // namespace

std::string ReadModelInChild(const ModelRequest& inRequest, std::string_view inBytes,
                             const ModelLimits& inLimits, const ModelProgram& inProgram) {
  const std::string reader = ZORFoundation::LibraryDirectory() + inProgram.path;
  const Descriptor model = MemoryFile(inBytes);
  const Descriptor task = MemoryFile(inProgram.task);
  const Descriptor result = MemoryFile({});
  Pipe status = MakePipe();
  char deflection[32];
  std::snprintf(deflection, sizeof deflection, "%.17g", inRequest.deflection);
  SpawnRequest request;
  request.Give(model, ModelReaderProtocol::kModel);
  request.Give(result, ModelReaderProtocol::kResult);
  request.Give(status.write, ModelReaderProtocol::kStatus);
  request.Give(task, ModelReaderProtocol::kTask);
  const Descriptor kept = inProgram.kept < 0 ? Descriptor() : RaisedCopy(inProgram.kept);
  if (kept.IsOpen()) request.Give(kept, ModelReaderProtocol::kKept);
  const pid_t process = request.Spawn({reader, std::to_string(static_cast<int>(inRequest.format)),
                                       deflection, std::to_string(inLimits.memory),
                                       std::to_string(inLimits.seconds), inRequest.path});
  if (process < 0) RaiseSystemError(("the model reader " + reader).c_str(), -process);
  Child child(process);
  status.write.Close();
  StatusLines lines(inRequest.progress, inProgram.tell);
  // Processor time is what is limited, so that a busy machine changes nothing; a reader that waits
  // for ever is stopped all the same.
  const auto deadline = Clock::now() + std::chrono::milliseconds(static_cast<std::int64_t>(
                                           1000 * (5 + 10 * std::min(inLimits.seconds, 1e6))));
  if (!FollowUntilEnd(status.read, deadline, child, lines)) {
    child.Kill();
    RaiseExcess(ModelErrorKind::kTimeLimit, Seconds(inLimits.seconds), lines);
  }
  const int end = child.Wait();
  CheckEnd(end, inLimits, lines);
  std::string answer = TakeResult(result);
  if (WEXITSTATUS(end) == ModelReaderProtocol::kExitRefused)
    throw ModelReaderError{ModelErrorKind::kUnreadable, std::move(answer)};
  return answer;
}

}  // namespace ZORDefault
