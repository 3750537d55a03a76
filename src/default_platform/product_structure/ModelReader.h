// Reading a model in a process of its own: damaged files crash the CAD kernel, or have no end.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELREADER_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELREADER_H

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>

#include "default_platform/OpenModel.h"
#include "default_platform/product_structure/ModelFormat.h"

namespace ZORDefault {

struct ModelRequest {
  std::string path;  ///< absolute: references to other files are resolved against its folder
  ModelFormat format = ModelFormat::kUnknown;
  double deflection = 0;  ///< of curves and surfaces, as a share of a part's diagonal
  std::function<void(double)> progress;  ///< may be empty
};

/// What a reading may use. See ModelOptions.
struct ModelLimits {
  double seconds = 0;        ///< of processor time
  std::uint64_t memory = 0;  ///< in bytes
};

/// The limits of the options; where they have none, those for a file of this size.
ModelLimits LimitsFor(const ModelOptions& inOptions, std::size_t inFileSize);

/// The reader, a program that lies in this folder beside our libraries. Its arguments are the
/// format's number, the deflection, the memory in bytes and the model's path. What it opens by
/// itself it may read from the model's folder alone.
inline constexpr char kModelReaderPath[] = "/ZORLyra/zor-model-reader";

/// The descriptors that the reader is given, and its exit codes.
struct ModelReaderProtocol {
  static constexpr int kModel = 3;   ///< the model's bytes
  static constexpr int kResult = 4;  ///< takes an encoded model, or why there is none
  static constexpr int kStatus = 5;  ///< takes lines: a percentage, or what is done from then on
  static constexpr int kExitRead = 0;
  static constexpr int kExitRefused = 2;
  static constexpr int kExitOutOfMemory = 3;
};

/// Why the reader has no model.
struct ModelReaderError {
  ModelErrorKind kind;
  std::string reason;  ///< one line
};

/// Reads a model from its bytes. Several may be read at a time.
/// @return the model, encoded. Raises ModelReaderError, and what the progress function raises.
std::string ReadModelInChild(const ModelRequest& inRequest, std::string_view inBytes,
                             const ModelLimits& inLimits);

}  // namespace ZORDefault

#endif
