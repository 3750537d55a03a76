#include "default_platform/InterferenceScene.h"

#include <algorithm>

#include "default_platform/OpenModel.h"
#include "default_platform/space_analysis/Interference.h"
#include "default_platform/space_analysis/PlacedProduct.h"

namespace ZORDefault {
namespace {

/// Two parts of nearly one colour could not be told apart.
bool AreAlike(const SceneColour& inA, const SceneColour& inB) {
  constexpr int kAlike = 90;
  return ColourDifference(inA, inB) < kAlike;
}

/// Of those that stand out from every other colour here, markers' included.
SceneColour ContrastTo(const SceneColour& inColour) {
  constexpr SceneColour kOrange = {240, 150, 30, 255}, kBlue = {70, 130, 220, 255};
  return AreAlike(inColour, kOrange) ? kBlue : kOrange;
}

/// The first of these that stands out from both products, else the one that does so best.
SceneColour MarkerColour(const SceneColour& inFirst, const SceneColour& inSecond) {
  constexpr SceneColour kColours[] = {{255, 0, 140, 255}, {0, 190, 255, 255}, {255, 220, 0, 255}};
  constexpr int kClear = 230;
  SceneColour best = kColours[0];
  int most = -1;
  for (const SceneColour& colour : kColours) {
    const int least =
        std::min(ColourDifference(colour, inFirst), ColourDifference(colour, inSecond));
    if (least > most) best = colour;
    most = std::max(most, least);
    if (least >= kClear) break;
  }
  return best;
}

}  // namespace

SceneColours ChooseColours(const std::array<ZORIProduct_var, 2>& inProducts) {
  const SceneColour first = MeanColourOf(inProducts[0]), second = MeanColourOf(inProducts[1]);
  const bool areBoth = !inProducts[0].IsNull() && !inProducts[1].IsNull();
  SceneColours colours;
  if (areBoth && AreAlike(first, second)) colours.imposedOnSecond = ContrastTo(first);
  colours.markers = MarkerColour(first, colours.imposedOnSecond.value_or(second));
  return colours;
}

InterferenceScene MakeInterferenceScene(const InterferenceGeometry& inGeometry,
                                        const std::array<SceneProduct, 2>& inProducts,
                                        const std::optional<SceneColours>& inColours) {
  const SceneColours colours =
      inColours ? *inColours : ChooseColours({inProducts[0].product, inProducts[1].product});
  InterferenceScene scene;
  for (std::size_t i = 0; i < 2; ++i) {
    ProductInfo info;
    if (!GetProductInfo(inProducts[i].product.GetInterface(), info)) continue;
    scene.products[i] = PlaceProduct(
        inProducts[i].product, inProducts[i].rootFromProduct.value_or(info.rootFromProduct),
        i == 1 && colours.imposedOnSecond ? &*colours.imposedOnSecond : nullptr);
  }
  scene.interference = ZORISiInterference_var(
      (new Interference(inGeometry, scene.products, colours.markers))->GetInterface());
  return scene;
}

}  // namespace ZORDefault
