// Tessellating a part.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_PARTMESHING_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_PARTMESHING_H

#include <TDF_Label.hxx>

#include "default_platform/product_structure/ModelData.h"

namespace ZORDefault {

/// Fills the part's mesh, its area, and its counts of what has no triangles. On failure the part has
/// no mesh.
/// @param inDeflection as a share of the diagonal of the part's box.
/// @return false when the kernel raised an error. Raises std::bad_alloc.
bool MeshPart(const TDF_Label& inPart, double inDeflection, ModelPart& ioPart);

}  // namespace ZORDefault

#endif
