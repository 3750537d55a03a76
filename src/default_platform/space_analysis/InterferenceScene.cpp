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

}  // namespace

InterferenceScene MakeInterferenceScene(const ZORIProduct_var& inRoot,
                                        const DOM_Node& inInterference,
                                        const std::optional<ResultPlacements>& inPlacements) {
  const InterferenceElement element(inInterference);
  InterferenceScene scene;
  for (std::size_t i = 0; i < scene.products.size() && i < element.products.size(); ++i)
    Find(inRoot, element.products[i], scene.products[i], scene.paths[i]);
  if (inPlacements) scene.whyAsInModel = WhyNoneIsTrusted(element, *inPlacements, scene);
  if (inPlacements && scene.whyAsInModel.empty())
    for (std::size_t i = 0; i < scene.products.size(); ++i)
      if (!scene.products[i].IsNull())
        scene.products[i] = StandAt(scene.products[i], (*inPlacements)[i]);
  scene.interference =
      ZORISiInterference_var((new Interference(element, scene.products))->GetInterface());
  return scene;
}

}  // namespace ZORDefault
