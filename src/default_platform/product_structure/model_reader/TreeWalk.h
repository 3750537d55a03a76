// From a document to products and parts.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_TREEWALK_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_TREEWALK_H

#include <TDF_Label.hxx>
#include <TDocStd_Document.hxx>
#include <vector>

#include "default_platform/product_structure/ModelData.h"

namespace ZORDefault {

/// Fills products and parts, still without meshes. Several roots get one above them.
/// @return for each part the label that it comes from; a null label for a root that was added.
std::vector<TDF_Label> WalkTree(const Handle(TDocStd_Document) & inDocument, ModelData& outModel);

}  // namespace ZORDefault

#endif
