// A file that takes its place only once it is whole.
#ifndef ZOR_TOOLS_LYRA_REPLACED_FILE_H
#define ZOR_TOOLS_LYRA_REPLACED_FILE_H

#include <optional>
#include <string>

#include "lyra/EndingSignals.h"
#include "lyra/Output.h"
#include "platform/system/ZORResult.h"

namespace lyra {

/// A new file beside the place where it is to be. Whatever happens before Finish, what stands in
/// that place stays as it is, and nothing is left of the new file unless the process is killed. A
/// link is followed; a device or a pipe, which cannot be replaced, and
/// standard output ("-") get the bytes at the end. Raises InputError with the reason.
class ReplacedFile {
 public:
  explicit ReplacedFile(const std::string& inPath);
  ~ReplacedFile();
  ReplacedFile(const ReplacedFile&) = delete;
  ReplacedFile& operator=(const ReplacedFile&) = delete;

  /// Where the new file is to be written, by a path that is UTF-8 whatever the user's path is.
  const std::string& TemporaryPath() const { return writtenPath_; }
  /// Raises InputError for a code that says that writing failed.
  void Check(HRESULT inResult) const;
  /// Makes sure that the new file is on the disk and puts it in its place.
  void Finish(Output& ioOutput);

 private:
  [[noreturn]] void Fail(int inErrorNumber) const;
  void MakeTemporary(const std::string& inDirectory, unsigned int inMode);
  void Synchronise() const;
  void CopyInto(Output& ioOutput) const;

  std::string path_;       // as the user gave it
  std::string target_;     // what is replaced; empty when the bytes are copied
  std::string temporary_;  // empty when it is gone
  std::optional<RemovedAtSignal> removedAtSignal_;
  std::string writtenPath_;
  int descriptor_ = -1;  // of the temporary file, as long as this lives
};

}  // namespace lyra

#endif
