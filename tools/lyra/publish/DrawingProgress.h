// How far the drawing of many pictures has come.
#ifndef ZOR_TOOLS_LYRA_PUBLISH_DRAWINGPROGRESS_H
#define ZOR_TOOLS_LYRA_PUBLISH_DRAWINGPROGRESS_H

#include <chrono>
#include <cstddef>
#include <string>

namespace lyra {

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
