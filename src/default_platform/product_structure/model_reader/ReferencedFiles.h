// Other files that a model names.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_REFERENCEDFILES_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_REFERENCEDFILES_H

#include <string>

#include "default_platform/product_structure/ModelReader.h"

namespace ZORDefault {

/// The kernel reads whatever file a model names, and would wait for a pipe or read a device for ever.
/// @return the first name of one that is there and is neither a file nor a folder, also of those
///         that named STEP files name; "" when there is none.
std::string FindNonRegularFile(const ModelRequest& inRequest);

/// @return how many nodes of a glTF or GLB file stretch, shrink or mirror what they show.
std::size_t CountScaledNodes(const std::string& inPath);

}  // namespace ZORDefault

#endif
