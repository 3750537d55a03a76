#include "default_platform/product_structure/ReaderLibrary.h"

#include <dlfcn.h>

#include <mutex>

#include "default_platform/system/SystemFiles.h"

namespace ZORDefault {
namespace {

constexpr char kLibraryName[] = "libZORModelReader.so";

/// Never unloaded: its own libraries keep state until the process ends.
ReadModelFunction* LoadReader(std::string& outReason) {
  const std::string path = LibraryDirectory() + '/' + kLibraryName;
  void* const library = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL);
  void* const function = library ? dlsym(library, kReadModelName) : nullptr;
  if (!function) {
    const char* const error = dlerror();
    outReason = std::string("cannot be read without the model reader: ") +
                (error ? error : "it has no entry");
  }
  return reinterpret_cast<ReadModelFunction*>(function);
}

}  // namespace

bool ReadModelWithLibrary(const ModelRequest& inRequest, ModelData& outModel,
                          std::string& outReason) {
  static std::mutex mutex;
  const std::lock_guard lock(mutex);
  static ReadModelFunction* reader = nullptr;
  if (!reader) reader = LoadReader(outReason);
  return reader && reader(inRequest, outModel, outReason);
}

}  // namespace ZORDefault
