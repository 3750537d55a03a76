// An independent judge of two shapes: the CAD kernel's distance and Boolean operation on whole shapes.
#ifndef ZOR_TESTS_TOOLKIT_DETECTION_EXACTJUDGE_H
#define ZOR_TESTS_TOOLKIT_DETECTION_EXACTJUDGE_H

#include <TopoDS_Shape.hxx>

namespace ZORDetection {

struct Judgement {
  double distance = 0;  ///< between the boxes when these are beyond the limit
  double volume = 0;    ///< that the solids share
  double depth = 0;  ///< the deepest point of that volume's boundary that was tried: at most true
  bool hasSheets = false;  ///< faces outside any solid: their volume means nothing
  bool isDone = true;      ///< false: an operation failed
};

/// @param inFarthest nothing is computed beyond it.
Judgement JudgeExactly(const TopoDS_Shape& inFirst, const TopoDS_Shape& inSecond,
                       double inFarthest);

}  // namespace ZORDetection

#endif
