// A product that stands elsewhere than in its model.
#ifndef ZOR_DEFAULT_PLATFORM_SPACE_ANALYSIS_STANDINGPRODUCT_H
#define ZOR_DEFAULT_PLATFORM_SPACE_ANALYSIS_STANDINGPRODUCT_H

#include "platform/mathematics/ZORMathTransformation.h"
#include "platform/product_structure/ZORIProduct.h"

namespace ZORDefault {

/// The same product with a representation of its own at another place. In all else it is the
/// model's product.
/// @param inProduct       of an opened model.
/// @param rootFromProduct where it stands.
/// @return empty for a product that is none of an opened model.
ZORIProduct_var StandAt(const ZORIProduct_var& inProduct,
                        const ZORMathTransformation& rootFromProduct);

}  // namespace ZORDefault

#endif
