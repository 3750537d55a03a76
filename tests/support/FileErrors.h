// Expected failures of file operations.
#ifndef ZOR_TESTS_SUPPORT_FILE_ERRORS_H
#define ZOR_TESTS_SUPPORT_FILE_ERRORS_H

#include <functional>

#include "foundation/Descriptor.h"

namespace support {
/// The errno value with which something fails; 0 when it does not.
inline int CodeOf(const std::function<void()>& inAct) {
  try {
    inAct();
    return 0;
  } catch (const ZORFoundation::FileError& error) {
    return error.Code();
  }
}
}  // namespace support

#endif
