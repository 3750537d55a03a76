// Pictures of models as engineers publish them.
#include <gtest/gtest.h>

#include <algorithm>
#include <string>

#include "default_platform/product_structure/OpenedModels.h"
#include "default_platform/visualisation/Pictures.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"

namespace {

class RealPictures : public testing::TestWithParam<const char*> {
 protected:
  void SetUp() override {
    const auto path = products::FindModel(GetParam());
    if (!path) GTEST_SKIP() << GetParam() << " is not here; set ZOR_MODEL_DIR";
    model_ = products::OpenAnew(*path);
  }
  static ZOR3DRep* RepOf(const ZORIProduct_var& inProduct) {
    const ZORI3DGeoVisu_var shown = inProduct;
    return shown.IsNull() ? nullptr : dynamic_cast<ZOR3DRep*>(shown->GetRep());
  }
  /// The share of a picture on white that is not white.
  static double CoveredShare(ZOR3DRep* inRep, int inWidth, int inHeight) {
    const auto picture = pictures::Draw(inRep, inWidth, inHeight, &pictures::White);
    std::size_t covered = 0;
    for (std::size_t i = 0; i < picture.pixels.size(); i += 3)
      covered += std::all_of(&picture.pixels[i], &picture.pixels[i] + 3,
                             [](std::uint8_t inByte) { return inByte == 255; })
                     ? 0
                     : 1;
    return static_cast<double>(covered) / (inWidth * inHeight);
  }

  ZORDefault::OpenedModel model_;
};

TEST_P(RealPictures, WholeModelFillsItsPicture) {
  const double share = CoveredShare(RepOf(model_.root), 756, 506);
  EXPECT_GT(share, 0.005);  // the emptiest holds two small things far apart
  EXPECT_LT(share, 0.9);
}

TEST_P(RealPictures, EachProductIsSeenAlone) {
  for (const auto& leaf : products::Leaves(model_.root)) {
    if (products::FactsOf(leaf).triangles == 0) continue;
    ASSERT_NE(RepOf(leaf), nullptr) << products::AliasPathOf(leaf);
    EXPECT_GT(CoveredShare(RepOf(leaf), 90, 60), 0.005) << products::AliasPathOf(leaf);
  }
}

INSTANTIATE_TEST_SUITE_P(Published, RealPictures,
                         testing::Values("as1-oc-214.stp", "dissonance_assembly.step",
                                         "low_cost_robot_arm.step", "manta_model_4.glb",
                                         "printable_case_full.stp", "pushdevice_assembly.step",
                                         "stamp_c6lora_smd.step"),
                         [](const testing::TestParamInfo<const char*>& inInfo) {
                           std::string name = inInfo.param;
                           std::ranges::replace_if(
                               name, [](unsigned char c) { return !std::isalnum(c); }, '_');
                           return name;
                         });

}  // namespace
