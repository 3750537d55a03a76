#include "default_platform/visualisation/RayCasterLibrary.h"

#include <mutex>

#include "default_platform/NeighbourLibrary.h"

namespace ZORDefault {
namespace {

const RayCaster* LoadRayCaster() {
  std::string reason;
  void* const function = FindInNeighbourLibrary("libZORRayCaster.so", kGetRayCasterName, reason);
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
