// The plugin that reads models, loaded when the first one must be read.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELREADER_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELREADER_H

#include <functional>
#include <string>

#include "default_platform/product_structure/ModelData.h"
#include "default_platform/product_structure/ModelFormat.h"

namespace ZORDefault {

struct ModelRequest {
  std::string path;  ///< absolute: references to other files are resolved against its folder
  ModelFormat format = ModelFormat::kUnknown;
  double deflection = 0;  ///< of curves and surfaces, as a share of a part's diagonal
  std::function<void(double)> progress;  ///< may be empty
};

/// Reads a model. Raises nothing.
/// @param outReason why it could not be read, one line; untouched on success.
/// @return true when the model was read.
typedef bool ReadModelFunction(const ModelRequest& inRequest, ModelData& outModel,
                               std::string& outReason);

inline constexpr char kReadModelName[] = "ZORReadModel";

/// Reads a model with the reader library. One model is read at a time.
/// @param outReason why it could not be read, one line.
bool ReadModelWithLibrary(const ModelRequest& inRequest, ModelData& outModel,
                          std::string& outReason);

}  // namespace ZORDefault

#endif
