// Memory that is lost by contract.
#ifndef ZOR_TESTS_SUPPORT_ABANDONED_MEMORY_H
#define ZOR_TESTS_SUPPORT_ABANDONED_MEMORY_H

#if defined(__SANITIZE_ADDRESS__)
#include <sanitizer/lsan_interface.h>
#endif

namespace support {

/// While it lives, nothing that is allocated is reported as a leak: rebuilding a session abandons
/// the arrays of all result sets but the last, and is meant to.
class AbandonedMemory {
 public:
#if defined(__SANITIZE_ADDRESS__)
  AbandonedMemory() { __lsan_disable(); }
  ~AbandonedMemory() { __lsan_enable(); }
#else
  AbandonedMemory() {}
  ~AbandonedMemory() {}
#endif
  AbandonedMemory(const AbandonedMemory&) = delete;
  AbandonedMemory& operator=(const AbandonedMemory&) = delete;
};

}  // namespace support

#endif
