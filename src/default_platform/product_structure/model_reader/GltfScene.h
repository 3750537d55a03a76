// The text of a glTF scene.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_GLTFSCENE_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_GLTFSCENE_H

#include <string>

namespace ZORDefault {

/// @return the JSON text of a glTF or GLB file: the whole file, or the first chunk of a binary one.
std::string ReadGltfScene(const std::string& inPath);

}  // namespace ZORDefault

#endif
