#include <signal.h>

#include <atomic>
#include <cstdlib>
#include <new>
#include <thread>

#include "default_platform/ReaderProgram.h"
#include "default_platform/product_structure/model_reader/ReaderSystem.h"
#include "foundation/Process.h"
#include "foundation/WindowsCalls.h"

namespace ZORDefault {
namespace {

std::atomic<double>& SecondsLeft() {
  static std::atomic<double> seconds(0);
  return seconds;
}

[[noreturn]] void EndNow(DWORD inCode) {
  TerminateProcess(GetCurrentProcess(), inCode);
  std::abort();
}

/// No signal ends a process whose time is used up: a thread looks now and then.
void WatchTime() {
  constexpr DWORD kStep = 100;  // milliseconds
  for (;;) {
    Sleep(kStep);
    const double limit = SecondsLeft();
    if (limit > 0 && ZORFoundation::ProcessorSeconds() > limit)
      EndNow(ModelReaderProtocol::kExitOverTime);
  }
}

/// Its memory is limited by a job of its own inside that of its parent.
void LimitMemory(std::uint64_t inBytes) {
  const HANDLE job = CreateJobObjectW(nullptr, nullptr);
  JOBOBJECT_EXTENDED_LIMIT_INFORMATION limits{};
  limits.BasicLimitInformation.LimitFlags = JOB_OBJECT_LIMIT_PROCESS_MEMORY;
  limits.ProcessMemoryLimit = static_cast<SIZE_T>(inBytes);
  if (job != nullptr && SetInformationJobObject(job, JobObjectExtendedLimitInformation, &limits,
                                                sizeof limits) != FALSE)
    AssignProcessToJobObject(job, GetCurrentProcess());
  // The handle is kept: the limit holds as long as this process.
}

LONG WINAPI EndByException(EXCEPTION_POINTERS* inException) {
  EndNow(inException->ExceptionRecord->ExceptionCode);
}

}  // namespace

void SetProcessLimits(const ModelLimits& inLimits) {
  // Without windows that tell of a crash and wait for somebody to close them.
  SetErrorMode(SEM_FAILCRITICALERRORS | SEM_NOGPFAULTERRORBOX | SEM_NOOPENFILEERRORBOX);
  SetUnhandledExceptionFilter(EndByException);
  signal(SIGABRT, [](int) { EndNow(ModelReaderProtocol::kExitAborted); });
  LimitMemory(inLimits.memory);
  SecondsLeft() = inLimits.seconds;
  std::thread(WatchTime).detach();
}

void LiftTimeLimit() { SecondsLeft() = 0; }

}  // namespace ZORDefault

// The program's own functions come before those of the C library, for the CAD kernel, which is linked
// in. They may be called before anything is built.
namespace {

template <class Function>
Function* Found(std::atomic<Function*>& ioFunction, const char* inName) {
  Function* function = ioFunction;
  if (function == nullptr) {
    function = reinterpret_cast<Function*>(
        reinterpret_cast<void*>(GetProcAddress(GetModuleHandleW(L"msvcrt.dll"), inName)));
    ioFunction = function;
  }
  return function;
}

constinit std::atomic<void* (*)(std::size_t)> systemMalloc;
constinit std::atomic<void* (*)(std::size_t, std::size_t)> systemCalloc;
constinit std::atomic<void* (*)(void*, std::size_t)> systemRealloc;

void* Checked(void* inBlock) {
  if (inBlock == nullptr) ZORDefault::EndNow(ZORDefault::ModelReaderProtocol::kExitOutOfMemory);
  return inBlock;
}

}  // namespace

extern "C" {

void* ReaderMalloc(std::size_t inSize) asm("malloc");
void* ReaderMalloc(std::size_t inSize) { return Checked(Found(systemMalloc, "malloc")(inSize)); }

void* ReaderCalloc(std::size_t inCount, std::size_t inSize) asm("calloc");
void* ReaderCalloc(std::size_t inCount, std::size_t inSize) {
  return Checked(Found(systemCalloc, "calloc")(inCount, inSize));
}

void* ReaderRealloc(void* inOld, std::size_t inSize) asm("realloc");
void* ReaderRealloc(void* inOld, std::size_t inSize) {
  void* const block = Found(systemRealloc, "realloc")(inOld, inSize);
  return inSize == 0 ? block : Checked(block);
}
}
