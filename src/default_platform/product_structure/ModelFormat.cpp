#include "default_platform/product_structure/ModelFormat.h"

#include <algorithm>
#include <cctype>
#include <cstdint>
#include <cstring>
#include <filesystem>

namespace ZORDefault {
namespace {

constexpr char kKnownEndings[] = ".step, .stp, .iges, .igs, .gltf, .glb, .obj, .stl";
constexpr std::size_t kIgesLine = 80;
constexpr std::size_t kIgesSectionColumn = 72;

std::string_view WithoutLeadingSpace(std::string_view inText) {
  if (inText.starts_with("\xEF\xBB\xBF")) inText.remove_prefix(3);
  const std::size_t start = inText.find_first_not_of(" \t\r\n");
  return start == std::string_view::npos ? std::string_view() : inText.substr(start);
}

std::string_view Tail(std::string_view inBytes, std::size_t inLength) {
  return inBytes.substr(inBytes.size() - std::min(inBytes.size(), inLength));
}

bool Holds(std::string_view inText, std::string_view inPiece) {
  return inText.find(inPiece) != std::string_view::npos;
}

std::uint32_t LittleEndian32(std::string_view inBytes, std::size_t inOffset) {
  std::uint32_t value = 0;
  for (std::size_t i = 0; i < 4; ++i)
    value |= std::uint32_t{static_cast<unsigned char>(inBytes[inOffset + i])} << (8 * i);
  return value;
}

bool IsIges(std::string_view inBytes) {
  const std::size_t end = inBytes.find_first_of("\r\n");
  const std::string_view line = inBytes.substr(0, std::min(end, kIgesLine));
  return line.size() == kIgesLine && line[kIgesSectionColumn] == 'S' &&
         std::all_of(line.begin() + kIgesSectionColumn + 1, line.end(),
                     [](unsigned char byte) { return std::isdigit(byte) != 0 || byte == ' '; });
}

constexpr std::size_t kStlHeader = 84;
constexpr std::size_t kStlTriangle = 50;

/// A binary STL has its count of triangles after a header of 80 bytes.
std::uint64_t BinaryStlSize(std::string_view inBytes) {
  return kStlHeader + std::uint64_t{kStlTriangle} * LittleEndian32(inBytes, kStlHeader - 4);
}

bool IsTextStl(std::string_view inBytes) {
  const std::string_view text = WithoutLeadingSpace(inBytes);
  return text.starts_with("solid") && Holds(text.substr(0, 4096), "facet");
}

bool IsBinaryStl(std::string_view inBytes) {
  return inBytes.size() > kStlHeader && BinaryStlSize(inBytes) == inBytes.size();
}

}  // namespace

ModelFormat FormatOfEnding(const std::string& inPath) {
  std::string ending = std::filesystem::path(inPath).extension().string();
  std::ranges::transform(ending, ending.begin(),
                         [](unsigned char byte) { return static_cast<char>(std::tolower(byte)); });
  if (ending == ".step" || ending == ".stp") return ModelFormat::kStep;
  if (ending == ".iges" || ending == ".igs") return ModelFormat::kIges;
  if (ending == ".gltf") return ModelFormat::kGltf;
  if (ending == ".glb") return ModelFormat::kGlb;
  if (ending == ".obj") return ModelFormat::kObj;
  if (ending == ".stl") return ModelFormat::kStl;
  return ModelFormat::kUnknown;
}

ModelFormat FormatOfContent(std::string_view inBytes) {
  const std::string_view text = WithoutLeadingSpace(inBytes);
  if (text.starts_with("ISO-10303-21")) return ModelFormat::kStep;
  if (inBytes.starts_with("glTF")) return ModelFormat::kGlb;
  if (text.starts_with("{") && Holds(text, "\"asset\"")) return ModelFormat::kGltf;
  if (IsIges(inBytes)) return ModelFormat::kIges;
  if (IsTextStl(inBytes) || IsBinaryStl(inBytes)) return ModelFormat::kStl;
  return ModelFormat::kUnknown;
}

ModelFormat DecideFormat(const std::string& inPath, std::string_view inBytes,
                         std::string& outReason) {
  const ModelFormat shown = FormatOfContent(inBytes);
  if (shown != ModelFormat::kUnknown) return shown;
  const ModelFormat promised = FormatOfEnding(inPath);
  if (promised == ModelFormat::kUnknown) {
    outReason = std::string("is of no known format; known endings: ") + kKnownEndings;
    return ModelFormat::kUnknown;
  }
  const bool isCutBinary = promised == ModelFormat::kStl && inBytes.size() >= kStlHeader &&
                           BinaryStlSize(inBytes) > inBytes.size();
  if (promised == ModelFormat::kObj || isCutBinary) return promised;
  outReason = std::string("is not a file of the format ") + NameOfFormat(promised);
  return ModelFormat::kUnknown;
}

bool IsWhole(ModelFormat inFormat, std::string_view inBytes) {
  constexpr std::size_t kTail = 4096;
  constexpr std::size_t kGlbHeader = 12;
  switch (inFormat) {
    case ModelFormat::kStep:
      return Holds(Tail(inBytes, kTail), "END-ISO-10303-21");
    case ModelFormat::kGlb:
      return inBytes.size() >= kGlbHeader && LittleEndian32(inBytes, 8) <= inBytes.size();
    case ModelFormat::kStl:
      return IsTextStl(inBytes) && !IsBinaryStl(inBytes)
                 ? Holds(Tail(inBytes, kTail), "endsolid")
                 : inBytes.size() >= kStlHeader && BinaryStlSize(inBytes) <= inBytes.size();
    case ModelFormat::kIges: {  // the last line is that of the section T
      const std::size_t last = inBytes.find_last_not_of(" \r\n");
      const std::string_view text = inBytes.substr(0, last + 1);
      const std::string_view line = text.substr(text.find_last_of("\r\n") + 1);
      return line.size() > kIgesSectionColumn && line[kIgesSectionColumn] == 'T';
    }
    default:
      return true;
  }
}

}  // namespace ZORDefault
