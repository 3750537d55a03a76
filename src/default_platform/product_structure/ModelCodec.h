// A model as bytes, for the cache.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELCODEC_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELCODEC_H

#include <string>
#include <string_view>

#include "default_platform/product_structure/ModelData.h"

namespace ZORDefault {

/// Counts up with every change of the bytes or of what a reading gives.
inline constexpr std::uint32_t kModelCodecVersion = 3;

/// In the machine's own byte order: entries are not moved between machines.
std::string EncodeModel(const ModelData& inModel);

/// @return false when the bytes are no model: too short, too long, or holding impossible positions.
bool DecodeModel(std::string_view inBytes, ModelData& outModel);

}  // namespace ZORDefault

#endif
