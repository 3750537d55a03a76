// The format of a model file, and whether the file is complete.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELFORMAT_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELFORMAT_H

#include <string>
#include <string_view>

namespace ZORDefault {

enum class ModelFormat { kUnknown, kStep, kIges, kGltf, kGlb, kObj, kStl };

/// The format's usual name; "" for the unknown one.
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

/// By the file name extension, in any case.
ModelFormat FormatOfEnding(const std::string& inPath);

/// By the content. OBJ has no signature and is never detected.
ModelFormat FormatOfContent(std::string_view inBytes);

/// By the content, else by the extension.
/// @param outReason why there is none, one line.
ModelFormat DecideFormat(const std::string& inPath, std::string_view inBytes,
                         std::string& outReason);

/// @return false when the file is truncated. Formats without an end marker count as complete.
bool IsWhole(ModelFormat inFormat, std::string_view inBytes);

}  // namespace ZORDefault

#endif
