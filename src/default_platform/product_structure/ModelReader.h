// Reading a model in a process of its own: damaged files crash the CAD kernel, or have no end.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELREADER_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELREADER_H

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>

#include "default_platform/ModelProgram.h"
#include "default_platform/OpenModel.h"
#include "default_platform/product_structure/ModelFormat.h"

namespace ZORDefault {

struct ModelRequest {
  std::string path;  ///< absolute: references to other files are resolved against its folder
  ModelFormat format = ModelFormat::kUnknown;
  double deflection = 0;  ///< of curves and surfaces, as a share of a part's diagonal
  std::function<void(double)> progress;  ///< may be empty
};

/// The limits of a reading. See ModelOptions.
struct ModelLimits {
  double seconds = 0;        ///< of processor time
  std::uint64_t memory = 0;  ///< in bytes
};

/// The reader, a program that lies in this folder beside our libraries. Its arguments, and those of
/// others that read a model, are the format's number, the deflection, the memory in bytes, the
/// seconds and the model's path. What it opens by itself it may read from the model's folder alone.
inline constexpr char kModelReaderPath[] = "/ZORLyra/zor-model-reader";

/// The descriptors that such a program is given, and its exit codes.
struct ModelReaderProtocol {
  static constexpr int kModel = 3;   ///< the model's bytes
  static constexpr int kResult = 4;  ///< takes an encoded model, or why there is none
  /// Takes lines: a percentage, what is done from then on, or "=" and what the caller is told.
  /// After one of these the model is read and time has no limit.
  static constexpr int kStatus = 5;
  static constexpr int kTask = 6;  ///< what is to be done with the model, if anything
  static constexpr int kKept = 7;  ///< where the task says so: takes what is done so far
  static constexpr int kExitRead = 0;
  static constexpr int kExitRefused = 2;
  static constexpr int kExitOutOfMemory = 3;
  static constexpr int kExitOverTime = 4;  ///< on Windows, where no signal says so
  static constexpr int kExitAborted = 5;   ///< on Windows
};

/// Why the reader has no model.
struct ModelReaderError {
  ModelErrorKind kind;
  std::string reason;  ///< one line
};

/// Reads a model from its bytes. Several may be read at a time.
/// @param inProgram of which only the path is used for the reader.
/// @return the model, encoded, or what else the program answers. Raises ModelReaderError, and what
/// the
///         functions raise.
std::string ReadModelInChild(const ModelRequest& inRequest, std::string_view inBytes,
                             const ModelLimits& inLimits,
                             const ModelProgram& inProgram = {kModelReaderPath, {}, 0, {}});

}  // namespace ZORDefault

#endif
