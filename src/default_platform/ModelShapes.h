// The exact geometry of a model's parts, for libraries that stand on the CAD kernel themselves.
#ifndef ZOR_DEFAULT_PLATFORM_MODELSHAPES_H
#define ZOR_DEFAULT_PLATFORM_MODELSHAPES_H

#include <string>
#include <vector>

class TopoDS_Shape;

namespace ZORDefault {

/// Reads a model in this process: OpenModel, which reads in one of its own, should have been able to
/// open it before.
/// @param outShapes of each part, at the number that ProductInfo::part has for it; of an assembly all
///                  that it holds, of a root that was added none. Untouched on failure.
/// @param outReason why there are none, one line; untouched on success.
bool ReadModelShapes(const std::string& inPath, std::vector<TopoDS_Shape>& outShapes,
                     std::string& outReason);

}  // namespace ZORDefault

#endif
