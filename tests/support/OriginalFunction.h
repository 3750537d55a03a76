// What a test program put a function of its own in the place of; see REPLACES in tests/CMakeLists.txt.
#ifndef ZOR_TESTS_SUPPORT_ORIGINAL_FUNCTION_H
#define ZOR_TESTS_SUPPORT_ORIGINAL_FUNCTION_H

#ifdef _WIN32
#include "windows/ReplacedFunctions.h"
#else
#include <dlfcn.h>
#endif

namespace support {

/// Calls the platform's own function of a name as the linker knows it. On Windows what that one
/// calls under the same name is the platform's too.
template <class Result, class... Argument>
Result CallOriginal(const char* inName, Argument... inArguments) {
  using Function = Result(Argument...);
#ifdef _WIN32
  const OriginalInPlace original(inName);
  return reinterpret_cast<Function*>(original.Address())(inArguments...);
#else
  static auto* const original = reinterpret_cast<Function*>(dlsym(RTLD_NEXT, inName));
  return original(inArguments...);
#endif
}

}  // namespace support

#endif
