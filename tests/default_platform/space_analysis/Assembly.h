// The sample assembly and interferences in it.
#ifndef ZOR_TESTS_DEFAULT_PLATFORM_SPACE_ANALYSIS_ASSEMBLY_H
#define ZOR_TESTS_DEFAULT_PLATFORM_SPACE_ANALYSIS_ASSEMBLY_H

#include <string>
#include <vector>

#include "default_platform/InterferenceScene.h"
#include "default_platform/OpenModel.h"
#include "platform/visualisation/ZOR3DRep.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"

namespace assembly {

constexpr char kNut[] = "rod-assembly_1 --++-- nut_1";
constexpr char kRod[] = "rod-assembly_1 --++-- rod_1";

/// Opened once; its products are not changed by tests.
inline const ZORIProduct_var& Root() {
  static const ZORDefault::OpenedModel model = [] {
    ZORDefault::ModelOptions options;
    options.useCache = false;
    return ZORDefault::OpenModel(ZOR_SOURCE_DIR "/samples/as1-oc-214.stp", options);
  }();
  return model.root;
}
inline ZORIProduct_var Product(const char* inPath) {
  return ZORDefault::FindProduct(Root(), inPath);
}
inline ZORDefault::ProductInfo Info(const ZORIProduct_var& inProduct) {
  ZORDefault::ProductInfo info;
  ZORDefault::GetProductInfo(inProduct.GetInterface(), info);
  return info;
}

/// A quarter turn about z, then a translation.
inline ZORMathTransformation Moved() {
  ZORMathTransformation placement;
  placement.SetMatrix(ZORMath3x3Matrix({0, 1, 0}, {-1, 0, 0}, {0, 0, 1}));
  placement.SetVector({1, 2, 3});
  return placement;
}

/// Where the nut and the rod touch.
inline const ZORMathVector kTouch(178, 75, 65);

inline ZORDefault::InterferenceGeometry At(const std::vector<ZORMathVector>& inPoints) {
  ZORDefault::InterferenceGeometry geometry;
  geometry.points = inPoints;
  return geometry;
}
/// Placed as in the model.
inline ZORDefault::InterferenceScene NutAndRod(
    const ZORDefault::InterferenceGeometry& inGeometry = At({kTouch})) {
  return ZORDefault::MakeInterferenceScene(
      inGeometry, {ZORDefault::SceneProduct{Product(kNut), {}}, {Product(kRod), {}}});
}

inline ZOR3DRep* RepOf(const ZORI3DGeoVisu_var& inObject) {
  return inObject.IsNull() ? nullptr : dynamic_cast<ZOR3DRep*>(inObject->GetRep());
}

}  // namespace assembly

#endif
