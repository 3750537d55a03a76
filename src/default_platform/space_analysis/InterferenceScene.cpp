#include "default_platform/InterferenceScene.h"

#include "default_platform/OpenModel.h"
#include "default_platform/space_analysis/Interference.h"
#include "default_platform/space_analysis/StandingProduct.h"

namespace ZORDefault {
namespace {

/// Products that another system manages have their path in the alias, all others in the identifier.
void Find(const ZORIProduct_var& inRoot, const DOM_Node& inElement, ZORIProduct_var& outProduct,
          ZORUnicodeString& outPath) {
  for (const char* const name : {"DescriptionID", "Alias"}) {
    const ZORUnicodeString path = AttributeOf(inElement, name);
    if (path.GetLengthInChar() == 0) continue;
    outProduct = FindProduct(inRoot, path);
    if (!outProduct.IsNull() || outPath.GetLengthInChar() == 0) outPath = path;
    if (!outProduct.IsNull()) return;
  }
}

std::string WhyNoneIsTrusted(const InterferenceElement& inElement,
                             const ResultPlacements& inPlacements,
                             const InterferenceScene& inScene) {
  for (std::size_t i = 0; i < inPlacements.size() && i < inElement.products.size(); ++i) {
    const std::string why = WhyNotTrusted(inElement.products[i], inPlacements[i]);
    if (!why.empty()) return std::string(inScene.paths[i].ConvertToChar()) + ": " + why;
  }
  return {};
}

/// Two parts of nearly one colour could not be told apart.
bool AreAlike(const PartColour& inA, const PartColour& inB) {
  constexpr int kAlike = 90;
  return ColourDifference(inA, inB) < kAlike;
}

/// Of those that stand out from every other colour here, markers' included.
PartColour ContrastTo(const PartColour& inColour) {
  constexpr PartColour kOrange = {240, 150, 30, 255}, kBlue = {70, 130, 220, 255};
  return AreAlike(inColour, kOrange) ? kBlue : kOrange;
}

/// Each product as one that stands by itself, so that a picture leaves the model's alone.
void Place(const std::optional<ResultPlacements>& inPlacements, InterferenceScene& ioScene) {
  const PartColour first = MeanColourOf(ioScene.products[0]);
  const bool areBoth = !ioScene.products[0].IsNull() && !ioScene.products[1].IsNull();
  const bool isAlike = areBoth && AreAlike(first, MeanColourOf(ioScene.products[1]));
  const PartColour contrast = ContrastTo(first);
  for (std::size_t i = 0; i < ioScene.products.size(); ++i) {
    ProductInfo facts;
    if (!GetProductInfo(ioScene.products[i].GetInterface(), facts)) continue;
    const PartColour* const imposed = i == 1 && isAlike ? &contrast : nullptr;
    ioScene.products[i] = StandAt(
        ioScene.products[i], inPlacements ? (*inPlacements)[i] : facts.rootFromProduct, imposed);
  }
}

}  // namespace

InterferenceScene MakeInterferenceScene(const ZORIProduct_var& inRoot,
                                        const DOM_Node& inInterference,
                                        const std::optional<ResultPlacements>& inPlacements) {
  const InterferenceElement element(inInterference);
  InterferenceScene scene;
  for (std::size_t i = 0; i < scene.products.size() && i < element.products.size(); ++i)
    Find(inRoot, element.products[i], scene.products[i], scene.paths[i]);
  if (inPlacements) scene.whyAsInModel = WhyNoneIsTrusted(element, *inPlacements, scene);
  Place(scene.whyAsInModel.empty() ? inPlacements : std::nullopt, scene);
  scene.interference =
      ZORISiInterference_var((new Interference(element, scene.products))->GetInterface());
  return scene;
}

}  // namespace ZORDefault
