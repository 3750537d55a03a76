#include "default_platform/system/ObjectCounters.h"

#include <map>
#include <mutex>
#include <string>

namespace ZORDefault {

ObjectCounter& CounterOf(const char* inClassName) {
  // Never destroyed: objects are released until the very end of the process.
  static auto* const counters = new std::map<std::string, ObjectCounter, std::less<>>();
  static std::mutex mutex;
  const std::lock_guard lock(mutex);
  return (*counters)[inClassName];
}

ObjectCounts CountsOf(const char* inClassName) {
  const ObjectCounter& counter = CounterOf(inClassName);
  return {counter.built, counter.released};
}

}  // namespace ZORDefault
