#include <cstdlib>
#include <mutex>
#include <set>
#include <string>

#include "foundation/Process.h"
#include "foundation/WindowsCalls.h"
// After the types that it needs.
#include <psapi.h>
#include <shellapi.h>

namespace ZORFoundation {

// The process's own environment, since a host may change it without the C library. Values are kept,
// as elsewhere a caller's pointer is good until the variable changes.
const char* ReadEnvironment(const char* inName) {
  static std::mutex mutex;
  static auto* const values = new std::set<std::string>();
  const std::wstring name = WideText(inName);
  std::wstring value(256, L'\0');
  for (;;) {
    SetLastError(ERROR_SUCCESS);
    const DWORD length =
        GetEnvironmentVariableW(name.c_str(), value.data(), static_cast<DWORD>(value.size()));
    if (length == 0 && GetLastError() != ERROR_SUCCESS) return nullptr;
    const bool isWhole = length < value.size();
    value.resize(length);
    if (isWhole) break;
  }
  const std::lock_guard lock(mutex);
  return values->insert(Utf8Text(value)).first->c_str();
}

// The C library's copy is for its own functions; there an empty value removes the variable.
void WriteEnvironment(const char* inName, const char* inValue) {
  const std::wstring name = WideText(inName);
  const std::wstring value = inValue == nullptr ? L"" : WideText(inValue);
  _wputenv((name + L"=" + value).c_str());
  SetEnvironmentVariableW(name.c_str(), inValue == nullptr ? nullptr : value.c_str());
}

std::vector<std::string> WordsOfCommandLine(int inCount, char** inArguments) {
  int count = 0;
  LPWSTR* const words = CommandLineToArgvW(GetCommandLineW(), &count);
  if (words == nullptr) return {inArguments, inArguments + inCount};
  std::vector<std::string> texts;
  for (int i = 0; i < count; ++i) texts.push_back(Utf8Text(words[i]));
  LocalFree(words);
  return texts;
}

double MegabytesUsed() {
  PROCESS_MEMORY_COUNTERS counters{};
  if (GetProcessMemoryInfo(GetCurrentProcess(), &counters, sizeof counters) == FALSE) return 0;
  return static_cast<double>(counters.PeakWorkingSetSize) / (1 << 20);
}

// Not clock(), which counts the time of day here.
double ProcessorSeconds() {
  FILETIME started{}, ended{}, kernel{}, user{};
  if (GetProcessTimes(GetCurrentProcess(), &started, &ended, &kernel, &user) == FALSE) return 0;
  double seconds = 0;
  for (const FILETIME& part : {kernel, user})
    seconds += 429.4967296 * part.dwHighDateTime + 1e-7 * part.dwLowDateTime;  // of 100 ns
  return seconds;
}

}  // namespace ZORFoundation
