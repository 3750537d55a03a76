#include "default_platform/product_structure/ModelReader.h"

#include <algorithm>
#include <cctype>
#include <chrono>
#include <cstdlib>
#include <optional>
#include <system_error>
#include <utility>

#include "default_platform/product_structure/ReaderProcess.h"
#include "foundation/PluginLoader.h"

namespace ZORDefault {
namespace {

typedef std::chrono::steady_clock Clock;

/// Parses the status lines of the reader.
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
bool FollowUntilEnd(Clock::time_point inDeadline, ReaderProcess& ioReader, StatusLines& ioLines) {
  for (;;) {
    std::optional<std::chrono::milliseconds> left;
    if (!ioLines.IsModelRead()) {
      left = std::chrono::duration_cast<std::chrono::milliseconds>(inDeadline - Clock::now());
      if (left->count() <= 0) return false;
    }
    const std::optional<std::string> text = ioReader.ReadStatus(left);
    if (!text) continue;  // the time is over, or a signal came
    if (text->empty()) return true;
    if (!ioLines.Add(*text)) ioReader.AskToEnd();
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
void CheckEnd(const ReaderEnd& inEnd, const ModelLimits& inLimits, const StatusLines& inLines) {
  if (inEnd.isOverTime) RaiseExcess(ModelErrorKind::kTimeLimit, Seconds(inLimits.seconds), inLines);
  if (!inEnd.crash.empty())
    throw ModelReaderError{
        ModelErrorKind::kCrash,
        std::string("cannot be ") + (inLines.IsModelRead() ? "worked on" : "read") +
            ": the CAD kernel crashed (" + inEnd.crash + ") while " + inLines.Stage()};
  if (inEnd.code == ModelReaderProtocol::kExitOutOfMemory)
    RaiseExcess(ModelErrorKind::kMemoryLimit, Bytes(inLimits.memory), inLines);
  if (inEnd.code != ModelReaderProtocol::kExitRead &&
      inEnd.code != ModelReaderProtocol::kExitRefused)
    throw ModelReaderError{ModelErrorKind::kCrash,
                           "cannot be read: the model reader ended with exit code " +
                               std::to_string(inEnd.code) + " while " + inLines.Stage()};
}

}  // namespace

void RaiseReaderError(const std::string& inWhat, int inErrorNumber) {
  throw ModelReaderError{
      ModelErrorKind::kNoReader,
      "cannot be read: " + inWhat + ": " + std::generic_category().message(inErrorNumber)};
}

std::string ReadModelInChild(const ModelRequest& inRequest, std::string_view inBytes,
                             const ModelLimits& inLimits, const ModelProgram& inProgram) {
  char deflection[32];
  std::snprintf(deflection, sizeof deflection, "%.17g", inRequest.deflection);
  ReaderProcess reader(
      {ZORFoundation::LibraryDirectory() + inProgram.path,
       {std::to_string(static_cast<int>(inRequest.format)), deflection,
        std::to_string(inLimits.memory), std::to_string(inLimits.seconds), inRequest.path},
       inBytes,
       inProgram.task,
       inProgram.kept});
  StatusLines lines(inRequest.progress, inProgram.tell);
  // Processor time is what is limited, so that a busy machine changes nothing; a reader that waits
  // for ever is stopped all the same.
  const auto deadline = Clock::now() + std::chrono::milliseconds(static_cast<std::int64_t>(
                                           1000 * (5 + 10 * std::min(inLimits.seconds, 1e6))));
  if (!FollowUntilEnd(deadline, reader, lines)) {
    reader.Kill();
    RaiseExcess(ModelErrorKind::kTimeLimit, Seconds(inLimits.seconds), lines);
  }
  const ReaderEnd end = reader.Wait();
  CheckEnd(end, inLimits, lines);
  std::string answer = reader.TakeResult();
  if (end.code == ModelReaderProtocol::kExitRefused)
    throw ModelReaderError{ModelErrorKind::kUnreadable, std::move(answer)};
  return answer;
}

}  // namespace ZORDefault
