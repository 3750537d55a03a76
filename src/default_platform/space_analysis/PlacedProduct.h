// A product that is placed elsewhere than in its model.
#ifndef ZOR_DEFAULT_PLATFORM_SPACE_ANALYSIS_PLACEDPRODUCT_H
#define ZOR_DEFAULT_PLATFORM_SPACE_ANALYSIS_PLACEDPRODUCT_H

#include "default_platform/PartMesh.h"
#include "platform/mathematics/ZORMathTransformation.h"
#include "platform/product_structure/ZORIProduct.h"

namespace ZORDefault {

/// The same product with a representation of its own at a place of its own. In all else it is the
/// model's product.
/// @param inProduct       of an opened model.
/// @param rootFromProduct where it is placed.
/// @param inColour        imposed on all of it; null: the model's colours.
/// @return empty for a product that is none of an opened model.
ZORIProduct_var PlaceProduct(const ZORIProduct_var& inProduct,
                             const ZORMathTransformation& rootFromProduct,
                             const PartColour* inColour);

/// The colour that is imposed on a product, else the mean of those in which it is shown, by
/// triangles.
PartColour MeanColourOf(const ZORIProduct_var& inProduct);

/// How far two colours lie apart: the sum over red, green and blue.
int ColourDifference(const PartColour& inA, const PartColour& inB);

}  // namespace ZORDefault

#endif
