// The cache of models that were read before.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELCACHE_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELCACHE_H

#include <string>
#include <string_view>

#include "default_platform/product_structure/ModelData.h"
#include "default_platform/product_structure/ModelReader.h"

namespace ZORDefault {

/// One model's entry in the user's cache directory. Its name is a 128-bit hash of the model's bytes
/// and of everything else that decides what is read from them.
class ModelCache {
 public:
  enum class Lookup { kMiss, kHit, kDamaged };

  ModelCache(std::string_view inBytes, const ModelRequest& inRequest);

  /// @param outModel set when it is found and the files that it refers to have not changed.
  Lookup Load(ModelData& outModel) const;

  /// Stores an encoded model atomically. A failure is not reported.
  void Store(std::string_view inEncodedModel) const;

 private:
  std::string folder_;  ///< of the model: other files lie relative to it
  std::string path_;    ///< of the entry; empty when there is no cache directory
};

}  // namespace ZORDefault

#endif
