// Work on a model's exact geometry, in a process of its own that damaged files cannot leave.
#ifndef ZOR_DEFAULT_PLATFORM_MODELPROGRAM_H
#define ZOR_DEFAULT_PLATFORM_MODELPROGRAM_H

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>

#include "default_platform/OpenModel.h"

namespace ZORDefault {

/// A program that lies with our libraries and reads models as the reader of OpenModel does.
struct ModelProgram {
  std::string path;          ///< from the libraries' folder on, such as "/ZORLyra/zor-model-reader"
  std::string task;          ///< what it is to do with the model
  std::uint64_t memory = 0;  ///< bytes that this takes besides reading, which has limits
  /// Told each line that it has for its caller; false: it is asked to end soon with what it has.
  std::function<bool(std::string_view)> tell;
  int kept = -1;  ///< an open file to which it appends what it has so far; -1: none
};

/// Runs a program on a model file. Reading has the limits of the options; the rest as much time as
/// it takes.
/// @param inPath in UTF-8 on Linux.
/// @param inOptions their deflection and cache are not used.
/// @return what the program answers. Raises as OpenModel does.
ZOR_PLATFORM_EXPORT std::string RunOnModel(const std::string& inPath, const ModelProgram& inProgram,
                                           const ModelOptions& inOptions = {});

}  // namespace ZORDefault

#endif
