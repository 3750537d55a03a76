// Interferences of a clash result on their model, and what their pictures show.
#ifndef ZOR_TESTS_SUPPORT_RESULT_ON_MODEL_H
#define ZOR_TESTS_SUPPORT_RESULT_ON_MODEL_H

#include <array>
#include <optional>
#include <string>
#include <vector>

#include "default_platform/OpenModel.h"
#include "default_platform/visualisation/Rendering.h"
#include "platform/visualisation/ZOR3DBagRep.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"
#include "toolkit/scenes/InterferenceScenes.h"

namespace support {

/// A model, and the interferences of a result on it.
class ResultOnModel {
 public:
  ResultOnModel(const std::string& inModel, const std::string& inResult)
      : model(ZORDefault::OpenModel(inModel, WithoutCache())), scenes_(model.root) {
    ZORToolkit::ClashDocument document(inResult);
    ZORToolkit::ForEachInterference(
        document, ZORToolkit::RecordPart::kAll,
        [&](const ZORToolkit::InterferenceRecord& inRecord) {
          resolved_.push_back(scenes_.Resolve(inRecord, ZORToolkit::ProductPlaces::kResult));
        });
  }
  std::size_t Count() const { return resolved_.size(); }
  const ZORToolkit::ResolvedInterference& Resolved(std::size_t inIndex) const {
    return resolved_[inIndex];
  }
  ZORDefault::InterferenceScene Scene(std::size_t inIndex) const {
    return ZORToolkit::MakeScene(resolved_[inIndex]);
  }

  ZORDefault::OpenedModel model;

 private:
  static ZORDefault::ModelOptions WithoutCache() {
    ZORDefault::ModelOptions options;
    options.useCache = false;
    return options;
  }

  ZORToolkit::InterferenceScenes scenes_;
  std::vector<ZORToolkit::ResolvedInterference> resolved_;
};

inline ZOR3DRep* RepOf(const ZORI3DGeoVisu_var& inObject) {
  return inObject.IsNull() ? nullptr : dynamic_cast<ZOR3DRep*>(inObject->GetRep());
}

/// Pixels of the first product, the second one and the markers in a picture that frames the
/// interference; nothing when it has a stored viewpoint, or lacks one of these.
inline std::optional<std::array<int, 3>> SeenWhereFramed(
    const ZORDefault::InterferenceScene& inScene, int inWidth, int inHeight) {
  ZOR3DViewpoint viewpoint;
  if (inScene.interference->FillViewpoint(&viewpoint) == 1) return std::nullopt;
  ZOR3DRep* const things[3] = {RepOf(inScene.products[0]), RepOf(inScene.products[1]),
                               RepOf(inScene.interference)};
  if (!things[0] || !things[1] || !things[2]) {
    if (things[2]) things[2]->Destroy();
    return std::nullopt;
  }
  auto* const all = new ZOR3DBagRep;
  std::vector<std::size_t> owners;
  for (std::size_t i = 0; i < 3; ++i) {
    all->AddChild(things[i]);
    owners.resize(owners.size() + ZORDefault::CollectMeshInstances(*things[i]).size(), i);
  }
  viewpoint.Reframe(static_cast<float>(inWidth), static_cast<float>(inHeight), 1, 1,
                    things[2]->GetShowBoundingElement());
  std::array<int, 3> counts{};
  const auto pixels = ZORDefault::RenderIdBuffer(*all, viewpoint, inWidth, inHeight);
  for (const ZORDefault::IdBufferPixel& pixel : pixels.value())
    if (pixel.mesh != ZORDefault::IdBufferPixel::kNone) ++counts[owners.at(pixel.mesh)];
  things[2]->Destroy();
  all->Destroy();
  return counts;
}

}  // namespace support

#endif
