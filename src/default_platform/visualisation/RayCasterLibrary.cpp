#include "default_platform/visualisation/RayCasterLibrary.h"

#include <dlfcn.h>

#include <mutex>

#include "default_platform/system/SystemFiles.h"

namespace ZORDefault {
namespace {

constexpr char kLibraryName[] = "libZORRayCaster.so";

/// Never unloaded: meshes hold structures that its code frees.
const RayCaster* LoadRayCaster() {
  const std::string path = LibraryDirectory() + '/' + kLibraryName;
  void* const library = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL);
  void* const function = library ? dlsym(library, kGetRayCasterName) : nullptr;
  return function ? reinterpret_cast<GetRayCasterFunction*>(function)() : nullptr;
}

}  // namespace

const RayCaster* LoadedRayCaster() {
  static std::mutex mutex;
  const std::lock_guard lock(mutex);
  static const RayCaster* rayCaster = nullptr;
  if (!rayCaster) rayCaster = LoadRayCaster();
  return rayCaster;
}

}  // namespace ZORDefault
