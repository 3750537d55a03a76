// Counts of the objects that the platform hands out, for tests and for finding leaks.
#ifndef ZOR_DEFAULT_PLATFORM_SYSTEM_OBJECTCOUNTERS_H
#define ZOR_DEFAULT_PLATFORM_SYSTEM_OBJECTCOUNTERS_H

#include <atomic>

#include "ZORPlatformExport.h"

namespace ZORDefault {

/// How many objects of a class were built and released since the process began.
struct ObjectCounts {
  long built = 0;
  long released = 0;
};

/// @param inClassName as given by the class's CountedName(); an unknown one gives zeros.
ZOR_PLATFORM_EXPORT ObjectCounts CountsOf(const char* inClassName);

struct ObjectCounter {
  std::atomic<long> built{0};
  std::atomic<long> released{0};
};

/// The counter of a class, made when it is first asked for; lives until the process ends.
ZOR_PLATFORM_EXPORT ObjectCounter& CounterOf(const char* inClassName);

/// The same for a given class, which has no base of ours.
template <class Class>
ObjectCounter& CounterOf(const char* inClassName) {
  static ObjectCounter& counter = CounterOf(inClassName);
  return counter;
}

/// Base of a class whose objects are counted:
///   class PrintImage : public ZORPrint3DRepImage, private CountedObject<PrintImage>
/// with a public `static const char* CountedName()`. A class derived from a counted class is
/// counted under that class's name.
template <class Class>
class CountedObject {
 protected:
  CountedObject() { ++Counter().built; }
  CountedObject(const CountedObject&) { ++Counter().built; }
  CountedObject& operator=(const CountedObject&) = default;
  ~CountedObject() { ++Counter().released; }

 private:
  static ObjectCounter& Counter() {
    static ObjectCounter& counter = CounterOf(Class::CountedName());
    return counter;
  }
};

}  // namespace ZORDefault

#endif
