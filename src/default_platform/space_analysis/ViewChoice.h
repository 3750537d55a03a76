// Choosing a direction from which an interference is seen well.
#ifndef ZOR_DEFAULT_PLATFORM_SPACE_ANALYSIS_VIEWCHOICE_H
#define ZOR_DEFAULT_PLATFORM_SPACE_ANALYSIS_VIEWCHOICE_H

#include <array>
#include <vector>

#include "default_platform/space_analysis/InterferenceRep.h"
#include "platform/visualisation/ZOR3DRep.h"
#include "platform/visualisation/ZOR3DViewpoint.h"

namespace ZORDefault {

/// Representations, null where a product is missing.
typedef std::array<const ZOR3DRep*, 2> ShownProducts;

struct ChosenView {
  MarkerStyle markers;
  ZOR3DBoundingSphere framed;  ///< around the interference, with something of its surroundings
};

/// The direction upwards in a picture with this sight: of z as much as can be, else of y.
ZOR_PLATFORM_EXPORT ZORMathVector UpFor(const ZORMathVector& inSight);

/// Looks for a direction in which both products are seen when the interference is framed: the
/// default one where that shows them well, else the best of those around; where a product is hidden
/// from all, more of the surroundings is framed.
/// @param inPoints at least one.
ZOR_PLATFORM_EXPORT ChosenView ChooseView(const ShownProducts& inProducts,
                                          const std::vector<ZORMathVector>& inPoints,
                                          bool inIsDimension);

/// Gives the markers pins as long as it takes to see them through a viewpoint. None are needed but
/// with a near plane, which keeps markers from being drawn over all else.
void LengthenPins(const ShownProducts& inProducts, const std::vector<ZORMathVector>& inPoints,
                  const ZOR3DViewpoint& inViewpoint, MarkerStyle& ioStyle);

}  // namespace ZORDefault

#endif
