// Other files that a model names.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_NAMEDFILES_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_NAMEDFILES_H

#include <string>

#include "default_platform/product_structure/ModelReaderEntry.h"

namespace ZORDefault {

/// The kernel reads whatever file a model names, and would wait for a pipe or read a device for ever.
/// @return the first name of one that is there and is neither a file nor a folder, also of those
///         that named STEP files name; "" when there is none.
std::string FindEndlessFile(const ModelRequest& inRequest);

}  // namespace ZORDefault

#endif
