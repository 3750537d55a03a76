// The library that reads models, loaded when the first one must be read.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_READERLIBRARY_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_READERLIBRARY_H

#include <string>

#include "default_platform/product_structure/ModelReaderEntry.h"

namespace ZORDefault {

/// Reads a model with the reader library. One model is read at a time.
/// @param outReason why it could not be read, one line.
bool ReadModelWithLibrary(const ModelRequest& inRequest, ModelData& outModel,
                          std::string& outReason);

}  // namespace ZORDefault

#endif
