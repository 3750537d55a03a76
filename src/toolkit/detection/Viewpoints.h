// The viewpoints of detected interferences.
#ifndef ZOR_TOOLKIT_DETECTION_VIEWPOINTS_H
#define ZOR_TOOLKIT_DETECTION_VIEWPOINTS_H

#include <array>
#include <vector>

#include "platform/product_structure/ZORIProduct.h"
#include "toolkit/detection/Detect.h"

namespace ZORToolkit {

/// The points of an interference that are written: of a long curve a sample.
std::vector<std::array<double, 3>> WrittenPoints(const DetectedInterference& inFound);

/// Gives each interference the viewpoint from which its picture would be taken: one that shows both
/// products, with the interference framed.
/// @param inRoot of the model in which they were found.
void AddViewpoints(const ZORIProduct_var& inRoot, DetectionResult& ioResult);

}  // namespace ZORToolkit

#endif
