// What a console shows and what its keys do. The consoles are those that terminals make, without a
// window.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <csignal>
#include <filesystem>

#include "foundation/TemporaryFile.h"
#include "foundation/TerminationSignals.h"
#include "foundation/WindowsCalls.h"
#include "support/PlatformFolder.h"
#include "tools/Command.h"

using support::TemporaryFolder;
using testing::HasSubstr;
using testing::Not;
using ZORFoundation::WideText;

namespace {

struct Pipe {
  Pipe() { EXPECT_NE(CreatePipe(&reading, &writing, nullptr, 0), FALSE); }
  ~Pipe() {
    CloseHandle(reading);
    CloseHandle(writing);
  }
  HANDLE reading = nullptr, writing = nullptr;
};

/// A program on a console of 60 columns.
class OnConsole {
 public:
  explicit OnConsole(const std::string& inLine) {
    Pipe keys, screen;
    EXPECT_EQ(CreatePseudoConsole({60, 20}, keys.reading, screen.writing, 0, &console_), S_OK);
    keys_ = std::exchange(keys.writing, nullptr);  // none are typed
    screen_ = std::exchange(screen.reading, nullptr);
    Start(inLine);
  }
  ~OnConsole() {
    ClosePseudoConsole(console_);
    for (const HANDLE handle : {keys_, screen_, process_}) CloseHandle(handle);
  }
  OnConsole(const OnConsole&) = delete;
  OnConsole& operator=(const OnConsole&) = delete;

  /// Reads what is shown until a text has been, or to the end without one.
  const std::string& ReadUntil(const std::string& inText) {
    char bytes[4096];
    DWORD count = 0;
    while (shown_.find(inText) == std::string::npos &&
           ReadFile(screen_, bytes, sizeof bytes, &count, nullptr) != FALSE && count > 0)
      shown_.append(bytes, count);
    return shown_;
  }
  DWORD ExitCode() const {
    DWORD code = 0;
    EXPECT_EQ(WaitForSingleObject(process_, 60'000), WAIT_OBJECT_0);
    GetExitCodeProcess(process_, &code);
    return code;
  }

 private:
  void Start(const std::string& inLine) {
    SIZE_T size = 0;
    InitializeProcThreadAttributeList(nullptr, 1, 0, &size);
    std::vector<char> memory(size);
    STARTUPINFOEXW start{};
    start.StartupInfo.cb = sizeof start;
    start.StartupInfo.dwFlags = STARTF_USESTDHANDLES;  // none of this program's, but the console's
    start.lpAttributeList = reinterpret_cast<LPPROC_THREAD_ATTRIBUTE_LIST>(memory.data());
    InitializeProcThreadAttributeList(start.lpAttributeList, 1, 0, &size);
    UpdateProcThreadAttribute(start.lpAttributeList, 0, PROC_THREAD_ATTRIBUTE_PSEUDOCONSOLE,
                              console_, sizeof console_, nullptr, nullptr);
    std::wstring line = WideText(inLine);
    PROCESS_INFORMATION process{};
    ASSERT_NE(
        CreateProcessW(nullptr, line.data(), nullptr, nullptr, FALSE, EXTENDED_STARTUPINFO_PRESENT,
                       nullptr, WideText(ZOR_SOURCE_DIR).c_str(), &start.StartupInfo, &process),
        FALSE);
    DeleteProcThreadAttributeList(start.lpAttributeList);
    CloseHandle(process.hThread);
    process_ = process.hProcess;
  }

  HPCON console_ = nullptr;
  HANDLE keys_ = nullptr, screen_ = nullptr, process_ = nullptr;
  std::string shown_;
};

constexpr char kFolderVariable[] = "ZOR_TEST_FOLDER", kLineVariable[] = "ZOR_TEST_LINE";

/// One of the cases of Child, on a console.
std::string Child(const std::string& inCase) {
  std::wstring path(32'768, L'\0');
  path.resize(GetModuleFileNameW(nullptr, path.data(), static_cast<DWORD>(path.size())));
  return "\"" + ZORFoundation::Utf8Text(path) +
         "\" --gtest_also_run_disabled_tests --gtest_filter=Child.DISABLED_" + inCase;
}

/// The command on a console, with words that need no quotes.
class CommandOnConsole {
 public:
  explicit CommandOnConsole(const std::string& inWords)
      : line_(kLineVariable, "\"" + kLyraProgram + "\" " + inWords) {}

 private:
  support::ScopedVariable line_;

 public:
  OnConsole console{Child("RunsTheCommand")};
};

HANDLE OpenForChild(const wchar_t* inName) {
  SECURITY_ATTRIBUTES inherited{sizeof(SECURITY_ATTRIBUTES), nullptr, TRUE};
  return CreateFileW(inName, GENERIC_READ | GENERIC_WRITE, FILE_SHARE_READ | FILE_SHARE_WRITE,
                     &inherited, OPEN_EXISTING, 0, nullptr);
}

/// As the console does for the keys; that of Wine ends at them when it has no window.
void PressCtrlC() { EXPECT_NE(GenerateConsoleCtrlEvent(CTRL_C_EVENT, 0), FALSE); }

void Say(const std::string& inText) {
  DWORD count = 0;
  const HANDLE screen = OpenForChild(L"CONOUT$");
  WriteFile(screen, inText.data(), static_cast<DWORD>(inText.size()), &count, nullptr);
  CloseHandle(screen);
}

}  // namespace

// What the tests below run on a console. Wine gives a program there no standard streams.

TEST(Child, DISABLED_RunsTheCommand) {
  STARTUPINFOW start{};
  start.cb = sizeof start;
  start.dwFlags = STARTF_USESTDHANDLES;
  start.hStdInput = OpenForChild(L"CONIN$");
  start.hStdOutput = start.hStdError = OpenForChild(L"CONOUT$");
  std::wstring line = WideText(std::getenv(kLineVariable));
  PROCESS_INFORMATION process{};
  ASSERT_NE(CreateProcessW(nullptr, line.data(), nullptr, nullptr, TRUE, 0, nullptr, nullptr,
                           &start, &process),
            FALSE);
  WaitForSingleObject(process.hProcess, INFINITE);
  DWORD code = 0;
  GetExitCodeProcess(process.hProcess, &code);
  std::_Exit(static_cast<int>(code));
}

TEST(Child, DISABLED_WaitsWithAnUnfinishedFile) {
  ZORFoundation::HandleTerminationSignals();
  const std::string folder = std::getenv(kFolderVariable);
  const ZORFoundation::TemporaryFile file(folder, 0600, "file");
  Say(std::filesystem::is_empty(folder) ? "no file" : "one file");
  PressCtrlC();
  Sleep(60'000);
}

TEST(Child, DISABLED_WaitsForARequestToStop) {
  const ZORFoundation::StopRequest request;
  PressCtrlC();
  for (int i = 0; i < 6000 && request.Recorded() == 0; ++i) Sleep(10);
  Say("stopped by " + std::to_string(request.Recorded()));
}

TEST(Console, TextsAreShownAsTheyAre) {
  CommandOnConsole list("list samples/as1.clash.xml");
  const std::string& shown = list.console.ReadUntil("plate_1");
  EXPECT_THAT(shown, HasSubstr("\u2026"));  // cut to the columns
  EXPECT_THAT(shown, Not(HasSubstr("\uFFFD")));
  EXPECT_EQ(list.console.ExitCode(), 0u);
}

TEST(Console, NamesOfFilesAreShownInAReason) {
  CommandOnConsole list("list no/\u5E72\u6E09.xml");
  EXPECT_THAT(list.console.ReadUntil("directory"),
              HasSubstr("lyra: no/\u5E72\u6E09.xml: No such file"));
  EXPECT_EQ(list.console.ExitCode(), 1u);
}

TEST(Console, CtrlCRemovesUnfinishedFilesAndEnds) {
  const TemporaryFolder folder;
  const support::ScopedVariable variable(kFolderVariable, folder.path.string());
  OnConsole console(Child("WaitsWithAnUnfinishedFile"));
  EXPECT_THAT(console.ReadUntil("file"), HasSubstr("one file"));
  EXPECT_EQ(console.ExitCode(), 128u + SIGINT);
  EXPECT_TRUE(std::filesystem::is_empty(folder.path));
}

TEST(Console, CtrlCIsARequestToStopWhereOneIsAskedFor) {
  OnConsole console(Child("WaitsForARequestToStop"));
  EXPECT_THAT(console.ReadUntil("stopped by"), HasSubstr("stopped by 2"));
  EXPECT_EQ(console.ExitCode(), 0u);
}
