// From a document to products and parts.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_TREEWALK_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_TREEWALK_H

#include <TDF_Label.hxx>
#include <TDocStd_Document.hxx>
#include <TopTools_IndexedMapOfShape.hxx>
#include <cstdint>
#include <optional>
#include <vector>

#include "default_platform/product_structure/ModelData.h"

namespace ZORDefault {

/// Fills products and parts, still without meshes. Several roots get one above them.
/// @return for each part the label that it comes from; a null label for a root that was added.
std::vector<TDF_Label> WalkTree(const Handle(TDocStd_Document) & inDocument, ModelData& outModel);

/// The colour of what a label stands for: of its surfaces, else a general one, else that of its
/// material.
std::optional<PartColour> ColourOf(const TDF_Label& inLabel);

/// The colours below one part.
struct FaceColours {
  std::vector<PartColour> colours;    ///< each once
  std::vector<std::uint16_t> ofFace;  ///< for each face a position there, or PartMesh::kNoColour
};

/// @param inFaces the faces of the part.
FaceColours FaceColoursOf(const TDF_Label& inPart, const TopTools_IndexedMapOfShape& inFaces);

}  // namespace ZORDefault

#endif
