#include "lyra/terminal/Progress.h"

#include <algorithm>
#include <cstdio>

#include "lyra/terminal/SafeText.h"
#include "lyra/terminal/Terminal.h"

namespace lyra {
namespace {

constexpr int kWidest = 70;  // a line that wrapped could not be taken back

std::string Duration(double inSeconds) {
  const long long seconds = static_cast<long long>(inSeconds + 0.5);
  if (seconds < 100) return std::to_string(seconds) + " s";
  if (seconds < 6000) return std::to_string((seconds + 30) / 60) + " min";
  return std::to_string((seconds + 1800) / 3600) + " h";
}

}  // namespace

ProgressLine::ProgressLine(const std::string& inWork)
    : work_(Fitted(Printable(inWork), kWidest, Cut::kStart)), isTerminal_(IsTerminal(stderr)) {}

ProgressLine::~ProgressLine() { Clear(); }

void ProgressLine::Show(double inDone, const std::string& inRemark) {
  const int percent = static_cast<int>(inDone * 100);
  if (!isTerminal_ || percent == percent_) return;
  percent_ = percent;
  const int width = DisplayWidth(work_) + 5 + DisplayWidth(inRemark);
  char number[16];
  std::snprintf(number, sizeof number, " %3d%%", percent);
  const auto blanks = static_cast<std::size_t>(std::max(width_ - width, 0));
  WriteError("\r" + work_ + number + inRemark + std::string(blanks, ' '));
  width_ = std::max(width_, width);
}

// Without terminal sequences, which not every terminal knows.
void ProgressLine::Clear() {
  if (width_ != 0) std::fprintf(stderr, "\r%*s\r", width_, "");
  width_ = 0;
  percent_ = -1;
}

void ProgressLine::Warn(const std::string& inWarning) {
  Clear();
  WriteError("lyra: warning: " + Printable(inWarning) + "\n");
}

std::string RateText(std::size_t inDone, std::size_t inAll, double inSeconds) {
  if (inDone == 0 || !(inSeconds > 0)) return "";
  const double rate = static_cast<double>(inDone) / inSeconds;
  char perSecond[32];
  std::snprintf(perSecond, sizeof perSecond, "%.1f", rate);
  return std::string(", ") + perSecond + " a second, " +
         Duration(static_cast<double>(inAll - inDone) / rate) + " left";
}

std::string DrawingText(std::size_t inDone, std::size_t inAll, double inSeconds) {
  return "drawing " + std::to_string(inDone) + " of " + std::to_string(inAll) + " interferences" +
         RateText(inDone, inAll, inSeconds);
}

DrawingProgress::DrawingProgress() : isTerminal_(IsTerminal(stderr)) {}

DrawingProgress::~DrawingProgress() { Clear(); }

void DrawingProgress::Clear() {
  if (width_ != 0) std::fprintf(stderr, "\r%*s\r", static_cast<int>(width_), "");
  width_ = 0;
}

void DrawingProgress::Show(std::size_t inDone, std::size_t inAll) {
  if (inDone == inAll) return Clear();
  const Clock::time_point now = Clock::now();
  if (!isTerminal_ || now - shown_ < std::chrono::milliseconds(100)) return;
  shown_ = now;
  const std::string text =
      DrawingText(inDone, inAll, std::chrono::duration<double>(now - start_).count());
  std::fprintf(stderr, "\r%-*s", static_cast<int>(width_), text.c_str());
  width_ = text.size();
}

}  // namespace lyra
