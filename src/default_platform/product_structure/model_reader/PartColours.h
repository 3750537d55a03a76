// The colours that a document gives to parts, instances and faces.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_PARTCOLOURS_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_PARTCOLOURS_H

#include <TDF_Label.hxx>
#include <TopTools_IndexedMapOfShape.hxx>
#include <cstdint>
#include <optional>
#include <vector>

#include "default_platform/visualisation/PartMesh.h"

namespace ZORDefault {

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
