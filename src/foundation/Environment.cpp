#include "foundation/Environment.h"

#include <cstdlib>

namespace ZORFoundation {

const char* ReadEnvironment(const char* inName) { return std::getenv(inName); }

void WriteEnvironment(const char* inName, const char* inValue) {
  if (inValue == nullptr)
    unsetenv(inName);
  else
    setenv(inName, inValue, 1);
}

}  // namespace ZORFoundation
