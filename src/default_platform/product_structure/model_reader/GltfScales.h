// Scales in a glTF scene, which the kernel passes over.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_GLTFSCALES_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_GLTFSCALES_H

#include <string>

namespace ZORDefault {

/// @return how many nodes of a glTF or GLB file stretch, shrink or mirror what they show.
std::size_t CountScaledNodes(const std::string& inPath);

}  // namespace ZORDefault

#endif
