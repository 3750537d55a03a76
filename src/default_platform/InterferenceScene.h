// An interference between two products of a model, ready for a picture.
#ifndef ZOR_DEFAULT_PLATFORM_INTERFERENCESCENE_H
#define ZOR_DEFAULT_PLATFORM_INTERFERENCESCENE_H

#include <array>
#include <cstdint>
#include <optional>
#include <vector>

#include "ZORPlatformExport.h"
#include "platform/mathematics/ZORMathTransformation.h"
#include "platform/product_structure/ZORIProduct.h"
#include "platform/space_analysis/ZORISiInterference.h"
#include "platform/visualisation/ZOR3DViewpoint.h"

namespace ZORDefault {

/// A camera that was stored with an interference. Lengths in millimetres; planes of 0 do not clip.
struct StoredViewpoint {
  ZOR3DViewpoint::Projection projection = ZOR3DViewpoint::kConic;
  ZORMathVector origin;
  ZORMathVector sight;  ///< any length above zero
  double focusDistance = 0;
  double nearPlane = 0;
  double farPlane = 0;
};

/// How the points of an interference are marked.
enum class MarkerKind {
  kBalls,     ///< a ball at each point
  kDimension  ///< a dimension line where there are exactly two points, else balls
};

/// Where two products interfere.
struct InterferenceGeometry {
  std::vector<ZORMathVector> points;  ///< of equal ones the first counts
  MarkerKind markers = MarkerKind::kBalls;
  std::optional<StoredViewpoint> viewpoint;  ///< nothing: one is chosen that shows both products
};

/// Red, green, blue, alpha.
typedef std::array<std::uint8_t, 4> SceneColour;

/// The colours of a scene, as ChooseColours gives them.
struct SceneColours {
  std::optional<SceneColour> imposedOnSecond;  ///< where it could not be told from the first
  SceneColour markers;
};

/// Colours in which the two products and the markers are told apart.
/// @param inProducts of an opened model; empty where one is missing.
ZOR_PLATFORM_EXPORT SceneColours ChooseColours(const std::array<ZORIProduct_var, 2>& inProducts);

/// A product of a scene and its placement.
struct SceneProduct {
  ZORIProduct_var product;  ///< of an opened model; empty where it is missing
  std::optional<ZORMathTransformation> rootFromProduct;  ///< nothing: as in the model
};

/// What PrintPictures draws of an interference.
struct InterferenceScene {
  /// The two products by themselves, so that a picture changes nothing of the model; each keeps its
  /// model alive. Empty where one is missing.
  std::array<ZORIProduct_var, 2> products;
  /// Never empty.
  ZORISiInterference_var interference;
};

/// Makes the scene of an interference. The model and its products are not changed.
/// @param inColours nothing: they are chosen here.
ZOR_PLATFORM_EXPORT InterferenceScene MakeInterferenceScene(
    const InterferenceGeometry& inGeometry, const std::array<SceneProduct, 2>& inProducts,
    const std::optional<SceneColours>& inColours = std::nullopt);

}  // namespace ZORDefault

#endif
