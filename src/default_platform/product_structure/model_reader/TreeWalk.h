// Walking a document's assembly tree, and its colours.
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

/// Fills products and parts, without meshes. Several roots get a common parent.
/// @return each part's label; null for the parent that was added.
std::vector<TDF_Label> WalkTree(const Handle(TDocStd_Document) & inDocument, ModelData& outModel);

/// The label's surface colour, else its general one, else its material's base colour.
std::optional<PartColour> ColourOf(const TDF_Label& inLabel);

/// The colours of a part's faces.
struct FaceColours {
  std::vector<PartColour> colours;    ///< each once
  std::vector<std::uint16_t> ofFace;  ///< index of each face's colour, or PartMesh::kNoColour
};

/// @param inFaces the faces of the part.
FaceColours FaceColoursOf(const TDF_Label& inPart, const TopTools_IndexedMapOfShape& inFaces);

}  // namespace ZORDefault

#endif
