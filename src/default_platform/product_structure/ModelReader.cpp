#include "default_platform/product_structure/ModelReader.h"

#include <mutex>

#include "foundation/PluginLoader.h"

namespace ZORDefault {
namespace {

ReadModelFunction* LoadReader(std::string& outReason) {
  std::string reason;
  void* const function =
      ZORFoundation::FindPluginFunction("libZORModelReader.so", kReadModelName, reason);
  if (function == nullptr) outReason = "cannot be read without the model reader: " + reason;
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
