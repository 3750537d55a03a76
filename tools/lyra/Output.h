// Where results go: a standard stream, with what is known about the terminal behind it.
#ifndef ZOR_TOOLS_LYRA_OUTPUT_H
#define ZOR_TOOLS_LYRA_OUTPUT_H

#include <cstdio>
#include <string_view>

namespace lyra {

/// The reader of the output has gone, so there is nobody to work for any more.
struct ReaderGone {};

/// A standard stream. A failed write raises InputError, or ReaderGone when nobody reads any more.
class Output {
 public:
  explicit Output(std::FILE* inStream);
  Output(const Output&) = delete;
  Output& operator=(const Output&) = delete;

  void Write(std::string_view inBytes);
  /// Hands everything over to the system; only then is a write known to have succeeded.
  void Finish();

  bool IsTerminal() const { return isTerminal_; }
  /// Whether text may be set in bold: a terminal, and NO_COLOR is not set.
  bool IsStyled() const { return isStyled_; }
  /// Columns of the terminal; 0 for as many as the text needs.
  int Width() const;

 private:
  [[noreturn]] void Fail(int inErrorNumber);

  std::FILE* stream_;
  bool isTerminal_;
  bool isStyled_;
};

}  // namespace lyra

#endif
