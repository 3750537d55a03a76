// A model as it was read: parts and the tree of products that shows them.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELDATA_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELDATA_H

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "default_platform/visualisation/PartMesh.h"
#include "platform/mathematics/ZORMathTransformation.h"

namespace ZORDefault {

/// What one or more products are instances of: a part or an assembly. Held once.
struct ModelPart {
  std::u16string name;  ///< as the file has it; may be empty
  std::string label;    ///< the reader's own number for it, such as "0:1:1:30"; may be empty
  std::optional<PartColour> colour;
  std::shared_ptr<const PartMesh> mesh;  ///< null: an assembly, or a part with nothing to show
  bool isAssembly = false;
  bool failedToTessellate = false;          ///< it has surfaces, but no triangle came of them
  std::uint32_t facesWithoutTriangles = 0;  ///< faces that are missing from the mesh
  double area = 0;                          ///< of all triangles, square millimetres
};

/// One instance in the tree.
struct ModelProduct {
  static constexpr std::int32_t kNoParent = -1;

  std::u16string name;  ///< as the file has it; may be empty
  std::int32_t parent = kNoParent;
  std::uint32_t part = 0;
  ZORMathTransformation parentFromProduct;
  std::optional<PartColour> colour;
};

/// The first product is the root; a parent stands before its children, which are in order.
struct ModelData {
  std::vector<ModelPart> parts;
  std::vector<ModelProduct> products;
  /// Files that parts of the content were taken from: relative to the model's folder, or absolute.
  std::vector<std::string> referencedFiles;
  std::vector<std::string> warnings;  ///< one line each, UTF-8
};

/// Counts up with every change of the bytes or of what a reading gives.
inline constexpr std::uint32_t kModelCodecVersion = 3;

/// In the machine's own byte order: entries are not moved between machines.
std::string EncodeModel(const ModelData& inModel);

/// @return false when the bytes are no model: too short, too long, or holding impossible positions.
bool DecodeModel(std::string_view inBytes, ModelData& outModel);

}  // namespace ZORDefault

#endif
