#include "foundation/PluginLoader.h"

#include <dlfcn.h>

namespace ZORFoundation {

std::string LibraryDirectory() {
  Dl_info info;
  if (!dladdr(reinterpret_cast<const void*>(&LibraryDirectory), &info) || !info.dli_fname)
    return std::string();
  const std::string file = info.dli_fname;
  const std::size_t slash = file.rfind('/');
  return slash == std::string::npos ? std::string(".") : file.substr(0, slash);
}

std::string PluginPath(const char* inName) { return LibraryDirectory() + "/lib" + inName + ".so"; }

// By its path, since not every loader looks where the library that asks was found.
void* FindPluginFunction(const char* inName, const char* inFunction, std::string& outReason) {
  const std::string path = PluginPath(inName);
  void* const library = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL);
  void* const function = library == nullptr ? nullptr : dlsym(library, inFunction);
  if (function == nullptr) {
    const char* const error = dlerror();
    outReason = error == nullptr ? path + ": nothing at " + inFunction : error;
  }
  return function;
}

}  // namespace ZORFoundation
