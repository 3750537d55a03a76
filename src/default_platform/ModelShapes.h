// The exact geometry of a model's parts, for libraries that stand on the CAD kernel themselves.
#ifndef ZOR_DEFAULT_PLATFORM_MODELSHAPES_H
#define ZOR_DEFAULT_PLATFORM_MODELSHAPES_H

#include <string>
#include <vector>

class TopoDS_Shape;

namespace ZORDefault {

/// Reads a model in this process, which should be one of its own: see RunOnModel.
/// @param inFormat the number of a ModelFormat.
/// @param outShapes of each part, at the number that ProductInfo::part has for it; of an assembly
/// all
///                  that it holds, of a root that was added none. Untouched on failure.
/// @param outReason why there are none, one line; untouched on success.
bool ReadModelShapes(const std::string& inPath, int inFormat, std::vector<TopoDS_Shape>& outShapes,
                     std::string& outReason);

}  // namespace ZORDefault

#endif
