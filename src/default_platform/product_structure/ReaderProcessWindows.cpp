#include <fcntl.h>
#include <io.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstring>
#include <utility>

#include "default_platform/product_structure/ReaderProcess.h"
#include "foundation/PluginLoader.h"
#include "foundation/ReadWholeFile.h"
#include "foundation/TemporaryFile.h"
#include "foundation/WindowsCalls.h"

namespace ZORDefault {
namespace {

using ZORFoundation::Descriptor;
using ZORFoundation::ErrorNumberOf;

[[noreturn]] void RaiseLastError(const char* inWhat) {
  RaiseReaderError(inWhat, ErrorNumberOf(GetLastError()));
}

/// A handle of the system, closed when the scope ends.
class SystemHandle {
 public:
  explicit SystemHandle(HANDLE inHandle = nullptr) : handle_(inHandle) {}
  SystemHandle(SystemHandle&& ioOther) noexcept
      : handle_(std::exchange(ioOther.handle_, nullptr)) {}
  SystemHandle& operator=(SystemHandle&& ioOther) noexcept {
    std::swap(handle_, ioOther.handle_);
    return *this;
  }
  ~SystemHandle() { Close(); }
  void Close() {
    if (HANDLE handle = std::exchange(handle_, nullptr)) CloseHandle(handle);
  }
  HANDLE Get() const { return handle_; }

 private:
  HANDLE handle_;
};

/// A copy that a process which is started can be given.
SystemHandle InheritableCopy(HANDLE inHandle) {
  HANDLE copy = nullptr;
  if (DuplicateHandle(GetCurrentProcess(), inHandle, GetCurrentProcess(), &copy, 0, TRUE,
                      DUPLICATE_SAME_ACCESS) == FALSE)
    RaiseLastError("no file can be given");
  return SystemHandle(copy);
}

Descriptor MemoryFile(std::string_view inBytes) try {
  return ZORFoundation::NewMemoryFile(inBytes);
} catch (const ZORFoundation::FileError& error) {
  RaiseReaderError("no temporary file can be made", error.Code());
}

/// The words of a command line, as the C library of the program that is started takes them apart.
std::wstring QuotedWord(const std::string& inWord) {
  std::wstring quoted = L"\"";
  std::size_t backslashes = 0;
  for (const wchar_t letter : ZORFoundation::WideText(inWord)) {
    if (letter == L'"') quoted.append(backslashes + 1, L'\\');
    backslashes = letter == L'\\' ? backslashes + 1 : 0;
    quoted += letter;
  }
  return quoted.append(backslashes, L'\\') += L'"';
}

std::wstring CommandLineOf(const std::string& inProgram, const ReaderStart& inStart) {
  std::wstring line = QuotedWord(inProgram);
  for (const std::string& argument : inStart.arguments) (line += L' ') += QuotedWord(argument);
  return line;
}

/// On Windows programs lie beside our libraries, since they find them there alone.
std::string PathOfProgram(const std::string& inProgram) {
  const std::size_t slash = inProgram.rfind('/');
  return ZORFoundation::LibraryDirectory() + '\\' + inProgram.substr(slash + 1) + ".exe";
}

/// What a process is given, as descriptors from ModelReaderProtocol::kModel on. The C library hands
/// its descriptors over in a block: their number, a byte of flags for each, a handle for each.
class GivenDescriptors {
 public:
  void Give(HANDLE inHandle, int inNumber, bool inIsPipe) {
    constexpr unsigned char kOpen = 1, kPipe = 8;
    handles_[static_cast<std::size_t>(inNumber)] = InheritableCopy(inHandle);
    flags_[static_cast<std::size_t>(inNumber)] = inIsPipe ? kOpen | kPipe : kOpen;
  }

  std::string Block() const {
    const int count = static_cast<int>(handles_.size());
    std::string block(reinterpret_cast<const char*>(&count), sizeof count);
    block.append(flags_.begin(), flags_.end());
    for (const SystemHandle& given : handles_) {
      const HANDLE handle = given.Get() ? given.Get() : INVALID_HANDLE_VALUE;
      block.append(reinterpret_cast<const char*>(&handle), sizeof handle);
    }
    return block;
  }

  std::vector<HANDLE> Handles() const {
    std::vector<HANDLE> handles;
    for (const SystemHandle& given : handles_)
      if (given.Get()) handles.push_back(given.Get());
    return handles;
  }

 private:
  static constexpr std::size_t kCount = ModelReaderProtocol::kKept + 1;

  std::array<SystemHandle, kCount> handles_;
  std::array<unsigned char, kCount> flags_{};
};

/// A list of the handles that a new process inherits, so that it gets no others.
class InheritedHandles {
 public:
  explicit InheritedHandles(std::vector<HANDLE> inHandles) : handles_(std::move(inHandles)) {
    SIZE_T size = 0;
    InitializeProcThreadAttributeList(nullptr, 1, 0, &size);
    bytes_.resize(size);
    if (InitializeProcThreadAttributeList(List(), 1, 0, &size) == FALSE ||
        UpdateProcThreadAttribute(List(), 0, PROC_THREAD_ATTRIBUTE_HANDLE_LIST, handles_.data(),
                                  handles_.size() * sizeof handles_[0], nullptr, nullptr) == FALSE)
      RaiseLastError("no process can be prepared");
  }
  ~InheritedHandles() { DeleteProcThreadAttributeList(List()); }
  InheritedHandles(const InheritedHandles&) = delete;
  InheritedHandles& operator=(const InheritedHandles&) = delete;

  LPPROC_THREAD_ATTRIBUTE_LIST List() {
    return reinterpret_cast<LPPROC_THREAD_ATTRIBUTE_LIST>(bytes_.data());
  }

 private:
  std::vector<HANDLE> handles_;
  std::vector<char> bytes_;
};

/// A group of processes that ends with its last handle, which the system closes when this process
/// ends, however that happens.
SystemHandle NewJob() {
  SystemHandle job(CreateJobObjectW(nullptr, nullptr));
  JOBOBJECT_EXTENDED_LIMIT_INFORMATION limits{};
  limits.BasicLimitInformation.LimitFlags =
      JOB_OBJECT_LIMIT_KILL_ON_JOB_CLOSE | JOB_OBJECT_LIMIT_DIE_ON_UNHANDLED_EXCEPTION;
  if (!job.Get() || SetInformationJobObject(job.Get(), JobObjectExtendedLimitInformation, &limits,
                                            sizeof limits) == FALSE)
    RaiseLastError("no process can be limited");
  return job;
}

SystemHandle NullDevice() {
  SECURITY_ATTRIBUTES inherited{sizeof inherited, nullptr, TRUE};
  return SystemHandle(CreateFileW(L"NUL", GENERIC_READ | GENERIC_WRITE,
                                  FILE_SHARE_READ | FILE_SHARE_WRITE, &inherited, OPEN_EXISTING, 0,
                                  nullptr));
}

/// @return the process, which is in the job. The kernel prints: its standard streams are the null
///         device.
SystemHandle Spawn(const ReaderStart& inStart, const GivenDescriptors& inGiven, HANDLE inJob) {
  const std::string program = PathOfProgram(inStart.program);
  const SystemHandle null = NullDevice();
  std::vector<HANDLE> handles = inGiven.Handles();
  handles.push_back(null.Get());
  InheritedHandles inherited(std::move(handles));
  std::string block = inGiven.Block();
  STARTUPINFOEXW start{};
  start.StartupInfo.cb = sizeof start;
  start.StartupInfo.dwFlags = STARTF_USESTDHANDLES;
  start.StartupInfo.hStdInput = start.StartupInfo.hStdOutput = start.StartupInfo.hStdError =
      null.Get();
  start.StartupInfo.cbReserved2 = static_cast<WORD>(block.size());
  start.StartupInfo.lpReserved2 = reinterpret_cast<BYTE*>(block.data());
  start.lpAttributeList = inherited.List();
  std::wstring line = CommandLineOf(program, inStart);
  PROCESS_INFORMATION process{};
  if (CreateProcessW(ZORFoundation::WidePath(program).c_str(), line.data(), nullptr, nullptr, TRUE,
                     CREATE_SUSPENDED | CREATE_NO_WINDOW | EXTENDED_STARTUPINFO_PRESENT, nullptr,
                     nullptr, &start.StartupInfo, &process) == FALSE)
    RaiseReaderError("the model reader " + program, ErrorNumberOf(GetLastError()));
  SystemHandle started(process.hProcess);
  const SystemHandle thread(process.hThread);
  // Where this process is in a job that allows none inside, the reader outlives a killed one.
  AssignProcessToJobObject(inJob, started.Get());
  ResumeThread(thread.Get());
  return started;
}

std::string NameOfCrash(DWORD inCode) {
  switch (inCode) {
    case EXCEPTION_ACCESS_VIOLATION:
      return "access violation";
    case EXCEPTION_STACK_OVERFLOW:
      return "stack overflow";
    case EXCEPTION_INT_DIVIDE_BY_ZERO:
      return "division by zero";
    case ModelReaderProtocol::kExitAborted:
      return "abort";
    default:
      break;
  }
  char text[16];
  std::snprintf(text, sizeof text, "0x%08lX", inCode);
  return text;
}

}  // namespace

struct ReaderProcess::System {
  Descriptor result = MemoryFile({});
  SystemHandle status, job = NewJob(), process;
};

ReaderProcess::ReaderProcess(const ReaderStart& inStart) : system_(std::make_unique<System>()) {
  const Descriptor model = MemoryFile(inStart.model);
  const Descriptor task = MemoryFile(inStart.task);
  HANDLE ends[2];
  if (CreatePipe(&ends[0], &ends[1], nullptr, 0) == FALSE) RaiseLastError("no pipe can be made");
  system_->status = SystemHandle(ends[0]);
  const SystemHandle writer(ends[1]);
  GivenDescriptors given;
  const auto give = [&given](const Descriptor& file, int number) {
    given.Give(ZORFoundation::HandleOf(file.Get()), number, false);
  };
  give(model, ModelReaderProtocol::kModel);
  give(system_->result, ModelReaderProtocol::kResult);
  give(task, ModelReaderProtocol::kTask);
  given.Give(writer.Get(), ModelReaderProtocol::kStatus, true);
  if (inStart.kept >= 0)
    given.Give(ZORFoundation::HandleOf(inStart.kept), ModelReaderProtocol::kKept, false);
  system_->process = Spawn(inStart, given, system_->job.Get());
}

ReaderProcess::~ReaderProcess() {
  if (system_->process.Get()) Kill();
}

// A pipe cannot be waited for: the process is, and the pipe looked into now and then.
std::optional<std::string> ReaderProcess::ReadStatus(
    std::optional<std::chrono::milliseconds> inTimeout) {
  constexpr DWORD kStep = 10;  // milliseconds
  const ULONGLONG start = GetTickCount64();
  for (;;) {
    const bool hasEnded = WaitForSingleObject(system_->process.Get(), 0) == WAIT_OBJECT_0;
    DWORD available = 0;
    if (PeekNamedPipe(system_->status.Get(), nullptr, 0, nullptr, &available, nullptr) == FALSE ||
        (available == 0 && hasEnded))
      return std::string();
    if (available > 0) {
      std::string text(std::min<DWORD>(available, 4096), '\0');
      DWORD count = 0;
      if (ReadFile(system_->status.Get(), text.data(), static_cast<DWORD>(text.size()), &count,
                   nullptr) == FALSE)
        return std::string();
      text.resize(count);
      return text;
    }
    if (inTimeout && GetTickCount64() - start >=
                         static_cast<ULONGLONG>(std::max<std::int64_t>(0, inTimeout->count())))
      return std::nullopt;
    WaitForSingleObject(system_->process.Get(), kStep);
  }
}

// No request reaches a process without a window or a console of its own.
void ReaderProcess::AskToEnd() {
  TerminateProcess(system_->process.Get(), ModelReaderProtocol::kExitRead);
}

void ReaderProcess::Kill() {
  TerminateProcess(system_->process.Get(), 1);
  Wait();
}

ReaderEnd ReaderProcess::Wait() {
  constexpr DWORD kLeastCrash = 0xC0000000;  // codes from here on are those of exceptions
  const SystemHandle process = std::move(system_->process);
  WaitForSingleObject(process.Get(), INFINITE);
  DWORD code = 0;
  GetExitCodeProcess(process.Get(), &code);
  ReaderEnd end;
  end.isOverTime = code == ModelReaderProtocol::kExitOverTime;
  if (code >= kLeastCrash || code == ModelReaderProtocol::kExitAborted)
    end.crash = NameOfCrash(code);
  else
    end.code = static_cast<int>(code);
  return end;
}

std::string ReaderProcess::TakeResult() const {
  ZORFoundation::Rewind(system_->result.Get(), "result");
  return ZORFoundation::ReadToEnd(system_->result.Get(), "result");
}

}  // namespace ZORDefault
