// The process that reads a model, as each kind of system starts, follows and ends it.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_READERPROCESS_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_READERPROCESS_H

#include <chrono>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "default_platform/product_structure/ModelReader.h"

namespace ZORDefault {

struct ReaderStart {
  std::string program;                 ///< its path
  std::vector<std::string> arguments;  ///< without the program itself
  std::string_view model;              ///< its bytes
  std::string_view task;               ///< see ModelProgram
  int kept = -1;                       ///< see ModelProgram
};

/// How a process ended.
struct ReaderEnd {
  int code = 0;             ///< without a crash: that of its exit
  std::string crash;        ///< its kind, such as SEGV; empty when there was none
  bool isOverTime = false;  ///< its processor time was used up
};

/// A process that never outlives this object. What fails raises ModelReaderError.
class ReaderProcess {
 public:
  explicit ReaderProcess(const ReaderStart& inStart);
  ~ReaderProcess();
  ReaderProcess(const ReaderProcess&) = delete;
  ReaderProcess& operator=(const ReaderProcess&) = delete;

  /// Waits for what the process says of its status.
  /// @param inTimeout without one, for as long as it takes.
  /// @return the text, which is empty when the process has closed its end; nothing when the time was
  ///         over, or a signal came.
  std::optional<std::string> ReadStatus(std::optional<std::chrono::milliseconds> inTimeout);

  void AskToEnd();
  void Kill();
  ReaderEnd Wait();

  /// @return what it wrote as its result. For a process that has ended.
  std::string TakeResult() const;

 private:
  struct System;
  std::unique_ptr<System> system_;
};

[[noreturn]] void RaiseReaderError(const std::string& inWhat, int inErrorNumber);

}  // namespace ZORDefault

#endif
