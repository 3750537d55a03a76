#include "toolkit/publishing/page/PageLibrary.h"

#include "foundation/PluginLoader.h"
#include "toolkit/Error.h"

namespace ZORToolkit {

const PageLibrary& LoadPageLibrary() {
  std::string reason;
  void* const function = ZORFoundation::FindPluginFunction("ZORPage", kPageLibraryName, reason);
  if (function == nullptr) throw Error("the library that makes pages cannot be loaded: " + reason);
  return *reinterpret_cast<PageLibraryFunction*>(function)();
}

std::string Sha256Text(std::string_view inBytes) {
  constexpr char kDigits[] = "0123456789abcdef";
  std::string text;
  for (const char byte : LoadPageLibrary().sha256(inBytes)) {
    const auto value = static_cast<unsigned char>(byte);
    text += kDigits[value >> 4];
    text += kDigits[value & 15];
  }
  return text;
}

}  // namespace ZORToolkit
