#include "lyra/ProgressLine.h"

#include <unistd.h>

#include <cstdio>

#include "lyra/SafeText.h"

namespace lyra {
namespace {
constexpr int kWidest = 70;  // a line that wrapped could not be taken back
}  // namespace

ProgressLine::ProgressLine(const std::string& inWork)
    : work_(Fitted(Printable(inWork), kWidest, Cut::kStart)),
      isTerminal_(isatty(STDERR_FILENO) == 1) {}

ProgressLine::~ProgressLine() { Clear(); }

void ProgressLine::Show(double inDone) {
  const int percent = static_cast<int>(inDone * 100);
  if (!isTerminal_ || percent == percent_) return;
  percent_ = percent;
  std::fprintf(stderr, "\r%s %3d%%", work_.c_str(), percent);
  width_ = DisplayWidth(work_) + 5;
}

// Without terminal sequences, which not every terminal knows.
void ProgressLine::Clear() {
  if (width_ != 0) std::fprintf(stderr, "\r%*s\r", width_, "");
  width_ = 0;
  percent_ = -1;
}

void ProgressLine::Warn(const std::string& inWarning) {
  Clear();
  std::fprintf(stderr, "lyra: warning: %s\n", Printable(inWarning).c_str());
}

}  // namespace lyra
