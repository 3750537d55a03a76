#include "lyra/terminal/Output.h"

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <string>

#include "foundation/ReadWholeFile.h"
#include "lyra/CommandErrors.h"
#include "lyra/terminal/Terminal.h"
#include "platform/system/ZORGetEnv.h"
#include "toolkit/records/WrittenFile.h"

namespace lyra {

namespace {

bool IsSet(const char* inName) {
  const char* value = ZORGetEnv(inName);
  return value != nullptr && *value != '\0';
}

}  // namespace

Output::Output(std::FILE* inStream)
    : stream_(inStream),
      isTerminal_(lyra::IsTerminal(inStream)),
      isStyled_(isTerminal_ && !IsSet("NO_COLOR")) {}

void Output::Write(std::string_view inBytes) {
  const bool isWritten =
      isTerminal_ ? WriteText(stream_, inBytes)
                  : std::fwrite(inBytes.data(), 1, inBytes.size(), stream_) == inBytes.size();
  if (!isWritten) Fail(errno);
}

void Output::Finish() {
  if (std::fflush(stream_) != 0) Fail(errno);
}

void Output::Fail(int inErrorNumber) {
  if (inErrorNumber == EPIPE) throw ReaderGone();
  throw InputError(std::string("standard output: ") + std::strerror(inErrorNumber));
}

int Output::Width() const {
  if (!isTerminal_) return 0;
  if (const char* columns = ZORGetEnv("COLUMNS"); columns != nullptr) {
    const int width = std::atoi(columns);
    if (width > 0) return width;
  }
  return TerminalWidth(stream_);
}

OutputFile::OutputFile(const std::string& inPath) : path_(inPath) {
  constexpr unsigned int kOwnerOnly = 0600;
  if (inPath == "-")
    forStream_.emplace(std::filesystem::temp_directory_path().string(), kOwnerOnly, inPath);
  else
    file_.emplace(inPath);
}

void OutputFile::Check(HRESULT inResult) const { ZORToolkit::CheckWritten(inResult, path_); }

void OutputFile::Finish(Output& ioOutput) {
  if (file_)
    file_->Commit();
  else
    ioOutput.Write(ZORFoundation::ReadWholeFile(Temporary().Path()).bytes);
}

}  // namespace lyra
