// Where results go: a standard stream, with what is known about the terminal behind it, or a file.
#ifndef ZOR_TOOLS_LYRA_TERMINAL_OUTPUT_H
#define ZOR_TOOLS_LYRA_TERMINAL_OUTPUT_H

#include <cstdio>
#include <optional>
#include <string>
#include <string_view>

#include "foundation/AtomicFile.h"
#include "platform/system/ZORResult.h"

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

/// The file that a user names for the result, replaced only once it is whole, or standard output
/// ("-"), which gets the bytes at the end. Raises FileError.
class OutputFile {
 public:
  explicit OutputFile(const std::string& inPath);

  /// Where the new file is to be written, in UTF-8 whatever the user's path is.
  std::string Path() { return Temporary().Utf8Path(); }
  /// Raises FileError for a code that says that writing failed.
  void Check(HRESULT inResult) const;
  void Finish(Output& ioOutput);

 private:
  ZORFoundation::TemporaryFile& Temporary() { return file_ ? file_->Temporary() : *forStream_; }

  std::string path_;  // as the user gave it
  std::optional<ZORFoundation::AtomicFile> file_;
  std::optional<ZORFoundation::TemporaryFile> forStream_;
};

}  // namespace lyra

#endif
