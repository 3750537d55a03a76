// What the loader and the library do with each other. This program is linked to the platform but not
// to the library.
#include <cxxabi.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstring>
#include <set>
#include <thread>

#include "windows/LoadedFile.h"

using namespace support;

namespace {

constexpr wchar_t kLibrary[] = L"ZORLyra.dll";

// ---- replaced exports

/// A jump to a function, in memory near enough to a loaded file to be among its exports.
char* JumpNear(char* inBase, const void* inFunction) {
  for (std::size_t offset = 0x1000000; offset < 0x70000000; offset += 0x1000000) {
    auto* const code = static_cast<char*>(
        VirtualAlloc(inBase + offset, 4096, MEM_COMMIT | MEM_RESERVE, PAGE_EXECUTE_READWRITE));
    if (code == nullptr) continue;
    std::memcpy(code, JumpTo(inFunction).data(), sizeof(Jump));
    return code;
  }
  return nullptr;
}

// ---- the string's constructors and destructor, as the library sees them

std::vector<std::pair<const void*, std::string>> built;
std::vector<const void*> destroyed;

bool IsOfLibrary(const void* inObject) {
  HMODULE module = nullptr;
  GetModuleHandleExW(
      GET_MODULE_HANDLE_EX_FLAG_FROM_ADDRESS | GET_MODULE_HANDLE_EX_FLAG_UNCHANGED_REFCOUNT,
      static_cast<LPCWSTR>(inObject), &module);
  return module != nullptr && module == GetModuleHandleW(kLibrary);
}

void* originalText = nullptr;
void* originalEmpty = nullptr;
void* originalEnd = nullptr;

void BuildFromText(void* outString, const char* inText) {
  reinterpret_cast<void (*)(void*, const char*)>(originalText)(outString, inText);
  if (IsOfLibrary(outString)) built.emplace_back(outString, inText);
}
void BuildEmpty(void* outString) {
  reinterpret_cast<void (*)(void*)>(originalEmpty)(outString);
  if (IsOfLibrary(outString)) built.emplace_back(outString, "");
}
void Destroy(void* ioString) {
  if (IsOfLibrary(ioString)) destroyed.push_back(ioString);
  reinterpret_cast<void (*)(void*)>(originalEnd)(ioString);
}

/// Whoever is loaded from now on gets another function in the place of an exported one.
void ReplaceExport(HMODULE inModule, const char* inName, const void* inFunction,
                   void*& outOriginal) {
  const Exports exports(inModule);
  for (const auto& [name, address] : exports.entries) {
    if (name != inName) continue;
    outOriginal = exports.base + *address;
    char* const jump = JumpNear(exports.base, inFunction);
    ASSERT_NE(jump, nullptr);
    const auto place = static_cast<DWORD>(jump - exports.base);
    WriteProtected(address, &place, sizeof place);
    return;
  }
  FAIL() << inName << " is not exported";
}

// ---- calls of an entry point

int entryCalls = 0;
BOOL WINAPI CountCall(HINSTANCE, DWORD, LPVOID) {
  ++entryCalls;
  return TRUE;
}

/// How often a thread's start and end reach a loaded file's entry point.
int CallsForAThread(HMODULE inModule) {
  char* const entry =
      reinterpret_cast<char*>(inModule) + HeadersOf(inModule).OptionalHeader.AddressOfEntryPoint;
  Jump former{};
  std::memcpy(former.data(), entry, sizeof former);
  const Jump jump = JumpTo(reinterpret_cast<const void*>(&CountCall));
  WriteProtected(entry, jump.data(), sizeof jump);
  entryCalls = 0;
  std::thread([] {}).join();
  WriteProtected(entry, former.data(), sizeof former);
  return entryCalls;
}

std::size_t BlocksInUse() {
  HANDLE heaps[64];
  const DWORD count = GetProcessHeaps(64, heaps);
  std::size_t blocks = 0;
  for (DWORD i = 0; i < count; ++i) {
    PROCESS_HEAP_ENTRY entry{};
    while (HeapWalk(heaps[i], &entry) != FALSE)
      blocks += (entry.wFlags & PROCESS_HEAP_ENTRY_BUSY) != 0 ? 1 : 0;
  }
  return blocks;
}

}  // namespace

TEST(LoadAndUnload, ExportsTheFiveClassesAlone) {
  const HMODULE library = LoadLibraryW(kLibrary);
  ASSERT_NE(library, nullptr);
  std::set<std::string> classes;
  for (const auto& [name, address] : Exports(library).entries) {
    int status = 0;
    char* const demangled = abi::__cxa_demangle(name.c_str(), nullptr, nullptr, &status);
    const std::string text = demangled == nullptr ? name : demangled;
    std::free(demangled);
    std::string found;
    for (const char* const of : {"ZORClashParsing", "ZORLyraXMLServices", "BuildPath",
                                 "ZORLyraGeneralServices", "PrintPictures"})
      for (const char* const before : {"", "vtable for ", "typeinfo for ", "typeinfo name for "})
        if (text == before + std::string(of) || text.starts_with(before + std::string(of) + "::"))
          found = of;
    EXPECT_NE(found, "") << text;
    classes.insert(found);
  }
  EXPECT_EQ(classes.size(), 5u);
  FreeLibrary(library);
}

TEST(LoadAndUnload, NoThreadReachesTheEntryPoint) {
  const HMODULE library = LoadLibraryW(kLibrary);
  ASSERT_NE(library, nullptr);
  EXPECT_EQ(CallsForAThread(library), 0);
  FreeLibrary(library);
  // One that says nothing about threads is called at the start and at the end of each.
  EXPECT_EQ(CallsForAThread(LoadLibraryW(L"ZORFoundation.dll")), 2);
}

TEST(LoadAndUnload, HundredTimesBuildsInOrderDestroysInReverseAndLeaksNothing) {
  const HMODULE platform = LoadLibraryW(L"ZORDefaultPlatform.dll");
  ASSERT_NE(platform, nullptr);
  ReplaceExport(platform, "_ZN16ZORUnicodeStringC1EPKc",
                reinterpret_cast<const void*>(&BuildFromText), originalText);
  ReplaceExport(platform, "_ZN16ZORUnicodeStringC1Ev", reinterpret_cast<const void*>(&BuildEmpty),
                originalEmpty);
  ReplaceExport(platform, "_ZN16ZORUnicodeStringD1Ev", reinterpret_cast<const void*>(&Destroy),
                originalEnd);
  std::size_t blocksBefore = 0;
  for (int i = 0; i < 100; ++i) {
    built.clear();
    destroyed.clear();
    const HMODULE library = LoadLibraryW(kLibrary);
    ASSERT_NE(library, nullptr) << GetLastError();
    EXPECT_TRUE(destroyed.empty());
    // Seen while the file is still there: what is in no file any more is not the library's.
    const auto builtAtLoad = built;
    ASSERT_NE(FreeLibrary(library), FALSE);
    ASSERT_EQ(GetModuleHandleW(kLibrary), nullptr) << "still loaded";
    std::vector<std::string> texts;
    std::vector<const void*> reversed;
    for (const auto& [object, text] : builtAtLoad) {
      texts.push_back(text);
      reversed.insert(reversed.begin(), object);
    }
    ASSERT_THAT(texts,
                testing::ElementsAre("Name", "AttrType", "AttrValue", "Component", "Components",
                                     "Alias", "Alien", "ComponentAttribute", "ComponentAttributes",
                                     "DocumentVersionUUID", "ComponentUuid", "PartNumber",
                                     "ShapePosition", "ComponentShape", "ComponentShapes",
                                     "ComponentType", "ZORDocument", "Rx", "Ry", "Rz", "T", "Ux",
                                     "Uy", "Uz", "PRCName", "ServerMarker", "ShapeId", "ShapeName",
                                     "ShapeOnDisk", "ShapeType", "Transaction", "", "", ""));
    ASSERT_EQ(destroyed, reversed);
    if (i == 9) blocksBefore = BlocksInUse();
  }
  // One block lost at each of the ninety loads since would show.
  EXPECT_LT(BlocksInUse(), blocksBefore + 45);
}
