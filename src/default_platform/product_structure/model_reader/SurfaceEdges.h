// The edges that are drawn on surfaces.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_SURFACEEDGES_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_SURFACEEDGES_H

#include <TopTools_IndexedMapOfShape.hxx>
#include <cstdint>
#include <vector>

#include "default_platform/product_structure/model_reader/MeshBuilder.h"

namespace ZORDefault {

/// Adds the boundaries of tessellated faces, each once; those on which a surface meets itself, or
/// two faces pass into each other without a bend, are left out. A shape without faces has all its
/// curves drawn.
/// @param inFirstPoints for each face the position of its first point in the builder, or kNoPoints.
void AddSurfaceEdges(const TopoDS_Shape& inShape, const TopTools_IndexedMapOfShape& inFaces,
                     const std::vector<std::uint32_t>& inFirstPoints, MeshBuilder& ioBuilder);

inline constexpr std::uint32_t kNoPoints = 0xFFFFFFFF;

}  // namespace ZORDefault

#endif
