// On Unix a library finds a program's functions before those of other libraries. The loader of Windows
// binds each call to a library by name, so before the tests begin, the functions of the platform that
// the program has too, and the operators new and delete, become jumps to the program's.
#include "windows/ReplacedFunctions.h"

#include <map>

#include "windows/LoadedFile.h"

namespace support {

struct ReplacedFunction {
  char* address;
  Jump own, jump;
};

namespace {

bool IsCode(const void* inAddress) {
  constexpr DWORD kExecutable = PAGE_EXECUTE | PAGE_EXECUTE_READ | PAGE_EXECUTE_READWRITE;
  MEMORY_BASIC_INFORMATION memory{};
  return VirtualQuery(inAddress, &memory, sizeof memory) != 0 &&
         (memory.Protect & kExecutable) != 0;
}

bool IsNewOrDelete(const std::string& inName) {
  return inName.starts_with("_Zn") || inName.starts_with("_Zd");
}

std::map<std::string, ReplacedFunction> ReplaceAll() {
  std::map<std::string, ReplacedFunction> replaced;
  const HMODULE platform = GetModuleHandleW(L"ZORDefaultPlatform.dll");
  const HMODULE runtime = GetModuleHandleW(L"libstdc++-6.dll");
  const Exports exports(GetModuleHandleW(nullptr));
  for (const auto& [name, place] : exports.entries) {
    const HMODULE library = IsNewOrDelete(name) ? runtime : platform;
    char* const address = reinterpret_cast<char*>(GetProcAddress(library, name.c_str()));
    if (address == nullptr || !IsCode(address)) continue;
    ReplacedFunction function{address, {}, JumpTo(exports.base + *place)};
    std::memcpy(function.own.data(), address, sizeof function.own);
    WriteProtected(address, function.jump.data(), sizeof function.jump);
    replaced.emplace(name, function);
  }
  if (replaced.empty()) throw std::runtime_error("the program takes no function's place");
  return replaced;
}

const std::map<std::string, ReplacedFunction> replacedFunctions = ReplaceAll();

}  // namespace

OriginalInPlace::OriginalInPlace(const char* inName) : function_(replacedFunctions.at(inName)) {
  WriteProtected(function_.address, function_.own.data(), sizeof function_.own);
}
OriginalInPlace::~OriginalInPlace() {
  WriteProtected(function_.address, function_.jump.data(), sizeof function_.jump);
}
void* OriginalInPlace::Address() const { return function_.address; }

}  // namespace support
