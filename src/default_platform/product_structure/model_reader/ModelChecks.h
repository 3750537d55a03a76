// What is wrong with a model's bytes that the kernel's readers would not notice, or not survive.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_MODELCHECKS_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_MODELCHECKS_H

#include <string>
#include <string_view>

#include "default_platform/product_structure/ModelReader.h"

namespace ZORDefault {

/// Looks for counts that the file cannot hold and for nodes that are their own descendants.
/// @return why the model cannot be read, one line; "" when nothing was found.
std::string FindFault(const ModelRequest& inRequest, std::string_view inBytes);

/// @return how many nodes of a glTF or GLB scene stretch, shrink or mirror what they show, which
/// the
///         kernel ignores.
std::size_t CountScaledNodes(std::string_view inBytes);

}  // namespace ZORDefault

#endif
