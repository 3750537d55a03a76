// A model as it was read: its parts, and the tree of products that are instances of them.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELDATA_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELDATA_H

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "default_platform/PartMesh.h"
#include "platform/mathematics/ZORMathTransformation.h"

namespace ZORDefault {

/// A part or an assembly, shared by the products that are its instances.
struct ModelPart {
  std::u16string name;  ///< as the file has it; may be empty
  std::string label;    ///< the kernel's label, such as "0:1:1:30"; may be empty
  std::optional<PartColour> colour;
  std::shared_ptr<const PartMesh> mesh;  ///< null: an assembly, or a part with nothing to show
  bool isAssembly = false;
  bool failedToTessellate = false;          ///< it has surfaces but no triangles
  std::uint32_t facesWithoutTriangles = 0;  ///< missing from the mesh
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

/// Another file that a model names.
struct ReferencedFile {
  enum class State : std::uint8_t {
    kRead,     ///< parts of the content come from it
    kMissing,  ///< it does not exist
    kUnread,   ///< it exists, but nothing in it is needed
    kRefused   ///< it lies outside the model's folder, or is no file
  };
  std::string name;  ///< relative to the model's folder, or absolute
  State state = State::kMissing;
  std::uint64_t hash = 0;  ///< of its bytes, when they were read
};

/// The products in preorder, the root first.
struct ModelData {
  std::vector<ModelPart> parts;
  std::vector<ModelProduct> products;
  std::vector<ReferencedFile> referencedFiles;
  std::vector<std::string> damages;   ///< what the file holds and the model does not; one line each
  std::vector<std::string> warnings;  ///< one line each, UTF-8
  bool hadFailure = false;            ///< not to be cached: another reading may give more
};

/// Incremented with every change of the encoding, or of what is read from the same file.
inline constexpr std::uint32_t kModelCodecVersion = 4;

/// The form in which models are kept in the cache and handed over by the process that reads them,
/// in the machine's own byte order.
std::string EncodeModel(const ModelData& inModel);

/// @return false when the bytes are no model: too short, too long, or with indices out of range.
bool DecodeModel(std::string_view inBytes, ModelData& outModel);

}  // namespace ZORDefault

#endif
