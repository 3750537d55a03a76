// What a program that reads models asks of the system that it runs on.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_READERSYSTEM_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_READERSYSTEM_H

#include "default_platform/product_structure/ModelReader.h"

namespace ZORDefault {

/// Limits this process's processor time and memory, and ends it with its parent. An allocation that
/// fails ends it too: the kernel would go on and leave out what it had no memory for.
void SetProcessLimits(const ModelLimits& inLimits);

}  // namespace ZORDefault

#endif
