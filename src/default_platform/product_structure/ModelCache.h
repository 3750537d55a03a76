// Models that were read before.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELCACHE_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELCACHE_H

#include <string>
#include <string_view>

#include "default_platform/product_structure/ModelData.h"
#include "default_platform/product_structure/ModelReader.h"

namespace ZORDefault {

/// The place of one model in the user's cache directory. Its name is a 128-bit hash of the model's
/// bytes and of all that decides what is read from them; its content ends in a checksum.
class ModelCache {
 public:
  enum class Finding { kNone, kFound, kDamaged };

  ModelCache(std::string_view inBytes, const ModelRequest& inRequest);

  /// @param outModel set when it is found; files that it was also read from must be as they were.
  Finding Load(ModelData& outModel) const;

  /// Keeps an encoded model; the old entry stays whole until the new one is. Nothing is said where it
  /// cannot be written.
  void Store(std::string_view inEncodedModel) const;

 private:
  std::string folder_;  ///< of the model: other files lie relative to it
  std::string path_;    ///< of the entry; empty when there is no cache directory
};

}  // namespace ZORDefault

#endif
