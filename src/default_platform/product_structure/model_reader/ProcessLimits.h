// What this process may use.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_PROCESSLIMITS_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_PROCESSLIMITS_H

#include "default_platform/product_structure/ModelReader.h"

namespace ZORDefault {

/// Limits this process's processor time and memory, and ends it with its parent. An allocation that
/// fails ends it too, with ModelReaderProtocol::kExitOutOfMemory: the kernel would go on and leave
/// out what it had no memory for.
void SetProcessLimits(const ModelLimits& inLimits);

}  // namespace ZORDefault

#endif
