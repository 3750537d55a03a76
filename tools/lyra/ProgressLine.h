// How far a long work has come.
#ifndef ZOR_TOOLS_LYRA_PROGRESS_LINE_H
#define ZOR_TOOLS_LYRA_PROGRESS_LINE_H

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
  void Show(double inDone);
  /// Writes a warning on a line of its own, terminal or not.
  void Warn(const std::string& inWarning);

 private:
  void Clear();

  std::string work_;
  bool isTerminal_;
  int percent_ = -1;  // shown last
  int width_ = 0;     // of what stands on the line
};

}  // namespace lyra

#endif
