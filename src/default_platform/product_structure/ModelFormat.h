// Which format a model file is in, and whether all of it is there.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELFORMAT_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELFORMAT_H

#include <string>
#include <string_view>

namespace ZORDefault {

enum class ModelFormat { kUnknown, kStep, kIges, kGltf, kGlb, kObj, kStl };

/// How people call the format; "" for the unknown one.
inline const char* NameOfFormat(ModelFormat inFormat) {
  switch (inFormat) {
    case ModelFormat::kStep:
      return "STEP";
    case ModelFormat::kIges:
      return "IGES";
    case ModelFormat::kGltf:
      return "glTF";
    case ModelFormat::kGlb:
      return "GLB";
    case ModelFormat::kObj:
      return "OBJ";
    case ModelFormat::kStl:
      return "STL";
    case ModelFormat::kUnknown:
      break;
  }
  return "";
}

/// The format that a file's ending promises, in any letter case.
ModelFormat FormatOfEnding(const std::string& inPath);

/// The format that the bytes themselves show. OBJ has no mark of its own and is never found so.
ModelFormat FormatOfContent(std::string_view inBytes);

/// The format to read a file in: what its content shows, else what its ending promises.
/// @param outReason why there is none, one line.
ModelFormat DecideFormat(const std::string& inPath, std::string_view inBytes,
                         std::string& outReason);

/// @return false when the end of a file of that format is missing. Formats without a mark at their
///         end are taken as whole.
bool IsWhole(ModelFormat inFormat, std::string_view inBytes);

}  // namespace ZORDefault

#endif
