// From where an interference is seen well.
#ifndef ZOR_DEFAULT_PLATFORM_SPACE_ANALYSIS_VIEWCHOICE_H
#define ZOR_DEFAULT_PLATFORM_SPACE_ANALYSIS_VIEWCHOICE_H

#include <array>
#include <vector>

#include "platform/visualisation/ZOR3DRep.h"
#include "platform/visualisation/ZOR3DViewpoint.h"

namespace ZORDefault {

struct ChosenView {
  ZORMathVector sight;         ///< unit
  ZORMathVector up;            ///< unit, at a right angle to sight
  ZOR3DBoundingSphere framed;  ///< around the interference, with something of its surroundings
};

/// The direction upwards in a picture with this sight: of z as much as can be, else of y.
ZORMathVector UpFor(const ZORMathVector& inSight);

/// Looks for a direction in which both products and the markers are seen when the interference is
/// framed: the default one where that shows them well, else the best of those around; where a
/// product is hidden from all, more of the surroundings is framed.
/// @param inProducts representations, null where a product is missing.
/// @param inPoints   at least one.
ChosenView ChooseView(const std::array<const ZOR3DRep*, 2>& inProducts,
                      const std::vector<ZORMathVector>& inPoints, bool inIsDimension);

}  // namespace ZORDefault

#endif
