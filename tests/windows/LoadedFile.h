// What the loader made of a program or library.
#ifndef ZOR_TESTS_WINDOWS_LOADED_FILE_H
#define ZOR_TESTS_WINDOWS_LOADED_FILE_H

#include <array>
#include <cstring>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "foundation/WindowsCalls.h"

namespace support {

inline const IMAGE_NT_HEADERS& HeadersOf(HMODULE inModule) {
  const char* const base = reinterpret_cast<const char*>(inModule);
  const auto& dos = *reinterpret_cast<const IMAGE_DOS_HEADER*>(base);
  return *reinterpret_cast<const IMAGE_NT_HEADERS*>(base + dos.e_lfanew);
}

/// What a loaded file exports: names, with where the address of each stands, relative to its start.
struct Exports {
  explicit Exports(HMODULE inModule) : base(reinterpret_cast<char*>(inModule)) {
    const DWORD place = HeadersOf(inModule)
                            .OptionalHeader.DataDirectory[IMAGE_DIRECTORY_ENTRY_EXPORT]
                            .VirtualAddress;
    const auto& directory = *reinterpret_cast<const IMAGE_EXPORT_DIRECTORY*>(base + place);
    addresses = reinterpret_cast<DWORD*>(base + directory.AddressOfFunctions);
    const auto* const texts = reinterpret_cast<const DWORD*>(base + directory.AddressOfNames);
    const auto* const ordinals =
        reinterpret_cast<const WORD*>(base + directory.AddressOfNameOrdinals);
    for (DWORD i = 0; i < directory.NumberOfNames; ++i)
      entries.emplace_back(base + texts[i], addresses + ordinals[i]);
  }

  char* base;
  DWORD* addresses;
  std::vector<std::pair<std::string, DWORD*>> entries;
};

inline void WriteProtected(void* outPlace, const void* inBytes, std::size_t inCount) {
  DWORD former = 0;
  if (VirtualProtect(outPlace, inCount, PAGE_EXECUTE_READWRITE, &former) == FALSE)
    throw std::runtime_error("memory that cannot be written");
  std::memcpy(outPlace, inBytes, inCount);
  VirtualProtect(outPlace, inCount, former, &former);
  FlushInstructionCache(GetCurrentProcess(), outPlace, inCount);
}

using Jump = std::array<char, 12>;

/// mov rax, address; jmp rax
inline Jump JumpTo(const void* inFunction) {
  Jump jump = {'\x48', '\xB8', 0, 0, 0, 0, 0, 0, 0, 0, '\xFF', '\xE0'};
  std::memcpy(jump.data() + 2, &inFunction, sizeof inFunction);
  return jump;
}

}  // namespace support

#endif
