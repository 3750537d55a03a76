#include "foundation/PluginLoader.h"
#include "foundation/WindowsCalls.h"

namespace ZORFoundation {
namespace {

std::wstring WideLibraryDirectory() {
  HMODULE library = nullptr;
  if (GetModuleHandleExW(
          GET_MODULE_HANDLE_EX_FLAG_FROM_ADDRESS | GET_MODULE_HANDLE_EX_FLAG_UNCHANGED_REFCOUNT,
          reinterpret_cast<LPCWSTR>(&LibraryDirectory), &library) == FALSE)
    return {};
  std::wstring file(MAX_PATH, L'\0');
  for (;;) {
    const DWORD length = GetModuleFileNameW(library, file.data(), static_cast<DWORD>(file.size()));
    if (length < file.size()) {
      file.resize(length);
      break;
    }
    file.resize(2 * file.size());
  }
  const std::size_t slash = file.find_last_of(L"\\/");
  return slash == std::wstring::npos ? L"." : file.substr(0, slash);
}

}  // namespace

std::string LibraryDirectory() { return Utf8Text(WideLibraryDirectory()); }

std::string PluginPath(const char* inName) { return LibraryDirectory() + '\\' + inName + ".dll"; }

// By its path, so that no other library of this name is taken; what it needs lies beside it.
void* FindPluginFunction(const char* inName, const char* inFunction, std::string& outReason) {
  const std::string path = PluginPath(inName);
  const HMODULE library =
      LoadLibraryExW(WidePath(path).c_str(), nullptr, LOAD_WITH_ALTERED_SEARCH_PATH);
  if (library == nullptr) {
    const unsigned long error = GetLastError();
    outReason = path + ": cannot be loaded (error " + std::to_string(error) + " of Windows)";
    return nullptr;
  }
  void* const function = reinterpret_cast<void*>(GetProcAddress(library, inFunction));
  if (function == nullptr) outReason = path + ": nothing at " + inFunction;
  return function;
}

}  // namespace ZORFoundation
