#include "default_platform/NeighbourLibrary.h"

#include <dlfcn.h>

#include "default_platform/system/SystemFiles.h"

namespace ZORDefault {

// By its path, since not every loader looks where the library that asks was found.
void* FindInNeighbourLibrary(const char* inFile, const char* inFunction, std::string& outReason) {
  const std::string path = LibraryDirectory() + '/' + inFile;
  void* const library = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL);
  void* const function = library == nullptr ? nullptr : dlsym(library, inFunction);
  if (function == nullptr) {
    const char* const error = dlerror();
    outReason = error == nullptr ? path + ": nothing at " + inFunction : error;
  }
  return function;
}

}  // namespace ZORDefault
