// An interference of a clash result and its two products, ready for a picture.
#ifndef ZOR_DEFAULT_PLATFORM_INTERFERENCESCENE_H
#define ZOR_DEFAULT_PLATFORM_INTERFERENCESCENE_H

#include <array>
#include <optional>
#include <string>

#include "ZORPlatformExport.h"
#include "platform/mathematics/ZORMathTransformation.h"
#include "platform/product_structure/ZORIProduct.h"
#include "platform/space_analysis/ZORISiInterference.h"
#include "platform/system/ZORUnicodeString.h"
#include "platform/xml/DOM_Node.h"

namespace ZORDefault {

struct InterferenceScene {
  /// The first and the second product, as ones that stand by themselves: a picture changes nothing
  /// of the model. Where both are shown in nearly the same colour, another one is imposed on the
  /// second. Empty where the model has none of that path.
  std::array<ZORIProduct_var, 2> products;
  /// The alias path by which each was found; of a missing one, the text that says which it is.
  std::array<ZORUnicodeString, 2> paths;
  /// Never empty; without geometry where the element gives no point.
  ZORISiInterference_var interference;
  /// Why the products stand as in their model although placements were given: one line of UTF-8,
  /// empty when they stand where these say.
  std::string whyAsInModel;
};

/// Where the two products of an interference stood, as the result says.
typedef std::array<ZORMathTransformation, 2> ResultPlacements;

/// @param inRoot         the root of an opened model; its products live until the last handle on
///                       them is released.
/// @param inInterference an "Interference" element.
/// @param inPlacements   as a reader of the result answered; nothing: as in the model. When either
///                       cannot be trusted (no "Matrix" or an incomplete one, numbers with a
///                       decimal comma, no rotation) both products stand as in the model.
ZOR_PLATFORM_EXPORT InterferenceScene
MakeInterferenceScene(const ZORIProduct_var& inRoot, const DOM_Node& inInterference,
                      const std::optional<ResultPlacements>& inPlacements);

}  // namespace ZORDefault

#endif
