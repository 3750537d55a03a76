#include <stdexcept>

#include "foundation/WindowsCalls.h"
#include "tools/RunProgram.h"

using ZORFoundation::WideText;

namespace {

/// A word as CommandLineToArgvW takes it apart again.
std::wstring Quoted(const std::wstring& inWord) {
  std::wstring quoted = L"\"";
  std::size_t backslashes = 0;
  for (const wchar_t character : inWord) {
    if (character == L'"') quoted.append(backslashes + 1, L'\\');
    backslashes = character == L'\\' ? backslashes + 1 : 0;
    quoted += character;
  }
  return quoted.append(backslashes, L'\\') + L'"';
}

/// Open for the program to inherit, while this lives.
class StreamFile {
 public:
  StreamFile(const std::string& inPath, DWORD inAccess, DWORD inDisposition) {
    SECURITY_ATTRIBUTES inherited{sizeof(SECURITY_ATTRIBUTES), nullptr, TRUE};
    handle_ =
        CreateFileW(ZORFoundation::WidePath(inPath).c_str(), inAccess,
                    FILE_SHARE_READ | FILE_SHARE_WRITE, &inherited, inDisposition, 0, nullptr);
    if (handle_ == INVALID_HANDLE_VALUE) throw std::runtime_error("cannot open " + inPath);
  }
  ~StreamFile() { CloseHandle(handle_); }
  StreamFile(const StreamFile&) = delete;
  StreamFile& operator=(const StreamFile&) = delete;
  HANDLE Get() const { return handle_; }

 private:
  HANDLE handle_;
};

}  // namespace

int RunProgram(std::vector<std::string> inWords, const std::string& inFolder,
               const ProgramStreams& inStreams) {
  std::wstring line;
  for (const std::string& word : inWords) line += Quoted(WideText(word)) + L" ";
  const StreamFile in(inStreams.in, GENERIC_READ, OPEN_EXISTING);
  const StreamFile out(inStreams.out, GENERIC_WRITE, CREATE_ALWAYS);
  const StreamFile error(inStreams.error, GENERIC_WRITE, CREATE_ALWAYS);
  STARTUPINFOW start{};
  start.cb = sizeof start;
  start.dwFlags = STARTF_USESTDHANDLES;
  start.hStdInput = in.Get();
  start.hStdOutput = out.Get();
  start.hStdError = error.Get();
  PROCESS_INFORMATION process{};
  if (CreateProcessW(nullptr, line.data(), nullptr, nullptr, TRUE, 0, nullptr,
                     WideText(inFolder).c_str(), &start, &process) == FALSE)
    throw std::runtime_error("cannot run " + inWords[0]);
  CloseHandle(process.hThread);
  WaitForSingleObject(process.hProcess, INFINITE);
  DWORD code = 0;
  GetExitCodeProcess(process.hProcess, &code);
  CloseHandle(process.hProcess);
  return static_cast<int>(code);
}
