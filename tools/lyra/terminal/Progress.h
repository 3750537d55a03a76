// How far a long work has come.
#ifndef ZOR_TOOLS_LYRA_TERMINAL_PROGRESS_H
#define ZOR_TOOLS_LYRA_TERMINAL_PROGRESS_H

#include <chrono>
#include <cstddef>
#include <string>

namespace lyra {

/// A line on standard error that grows with the work and is gone at its end; nothing when standard
/// error is no terminal.
class ProgressLine {
 public:
  /// @param inWork what is done, such as "reading a.step"; made printable here.
  explicit ProgressLine(const std::string& inWork);
  ~ProgressLine();
  ProgressLine(const ProgressLine&) = delete;
  ProgressLine& operator=(const ProgressLine&) = delete;

  /// @param inDone the share that is done, 0 to 1.
  /// @param inRemark follows the percentage.
  void Show(double inDone, const std::string& inRemark = {});
  /// Writes a warning on a line of its own, terminal or not.
  void Warn(const std::string& inWarning);

 private:
  void Clear();

  std::string work_;
  bool isTerminal_;
  int percent_ = -1;  // shown last
  int width_ = 0;     // of what stands on the line
};

/// ", 8.3 a second, 47 s left"; empty before anything is done.
/// @param inSeconds since the work began.
std::string RateText(std::size_t inDone, std::size_t inAll, double inSeconds);

/// "drawing 12 of 400, 8.3 a second, 47 s left".
/// @param inSeconds since the work began.
std::string DrawingText(std::size_t inDone, std::size_t inAll, double inSeconds);

/// A line on standard error that is gone at the end; nothing when that is no terminal.
class DrawingProgress {
 public:
  DrawingProgress();
  ~DrawingProgress();
  DrawingProgress(const DrawingProgress&) = delete;
  DrawingProgress& operator=(const DrawingProgress&) = delete;

  /// The line is gone once all is done.
  void Show(std::size_t inDone, std::size_t inAll);

 private:
  void Clear();

  using Clock = std::chrono::steady_clock;

  bool isTerminal_;
  Clock::time_point start_ = Clock::now(), shown_;
  std::size_t width_ = 0;  // of what stands on the line
};

}  // namespace lyra

#endif
