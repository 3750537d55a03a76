// The sample assembly and elements of clash results on it.
#ifndef ZOR_TESTS_DEFAULT_PLATFORM_SPACE_ANALYSIS_ASSEMBLY_H
#define ZOR_TESTS_DEFAULT_PLATFORM_SPACE_ANALYSIS_ASSEMBLY_H

#include <string>

#include "default_platform/InterferenceScene.h"
#include "default_platform/OpenModel.h"
#include "platform/visualisation/ZOR3DRep.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"
#include "support/XMLText.h"

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
inline ZORDefault::ProductInfo Facts(const ZORIProduct_var& inProduct) {
  ZORDefault::ProductInfo facts;
  ZORDefault::GetProductInfo(inProduct.GetInterface(), facts);
  return facts;
}

constexpr char kMatrix[] =
    "<Matrix><Point Ux='1' Uy='2' Uz='3'/>"
    "<Vector CorrespondingData='Rx' Vx='0' Vy='1' Vz='0'/>"
    "<Vector CorrespondingData='Ry' Vx='-1' Vy='0' Vz='0'/>"
    "<Vector CorrespondingData='Rz' Vx='0' Vy='0' Vz='1'/></Matrix>";
/// What a reader makes of it.
inline ZORMathTransformation ReadMatrix() {
  ZORMathTransformation placement;
  placement.SetMatrix(ZORMath3x3Matrix({0, 1, 0}, {-1, 0, 0}, {0, 0, 1}));
  placement.SetVector({1, 2, 3});
  return placement;
}

inline std::string ProductText(const std::string& inPath, const std::string& inMatrix = kMatrix) {
  return "<Product DescriptionID='" + inPath + "' Alias='" + inPath + "'>" + inMatrix +
         "</Product>";
}
inline std::string GeometryText(const std::string& inContent) {
  return "<GeometricAspect>" + inContent + "</GeometricAspect>";
}
inline DOM_Element Interference(const std::string& inContent, const char* inType = "Contact") {
  return support::RootOf("<Interference ResultType='" + std::string(inType) + "'>" + inContent +
                         "</Interference>");
}
constexpr char kPoint[] = "<Point Ux='178' Uy='75' Uz='65'/>";
/// As the model has them: the nut and the rod touch there.
inline ZORDefault::InterferenceScene NutAndRod(const std::string& inGeometry = kPoint,
                                               const char* inType = "Contact") {
  return ZORDefault::MakeInterferenceScene(
      Root(),
      Interference(ProductText(kNut) + ProductText(kRod) + GeometryText(inGeometry), inType),
      std::nullopt);
}

inline ZOR3DRep* RepOf(const ZORI3DGeoVisu_var& inObject) {
  return inObject.IsNull() ? nullptr : dynamic_cast<ZOR3DRep*>(inObject->GetRep());
}

}  // namespace assembly

#endif
