// Models as engineers publish them.
#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <set>

#include "default_platform/product_structure/IndependentCount.h"
#include "default_platform/product_structure/OpenedModels.h"

namespace {
struct RealModel {
  const char* file;
  std::size_t leaves;
  std::size_t parts;
  double area;           // square millimetres, exact surfaces
  std::size_t coloured;  // leaves with a colour of their own or their part's
  std::size_t facesWithoutTriangles;
};

class RealModels : public testing::TestWithParam<RealModel> {
 protected:
  void SetUp() override {
    const auto path = products::FindModel(GetParam().file);
    if (!path) GTEST_SKIP() << GetParam().file << " is not here; set ZOR_MODEL_DIR";
    path_ = *path;
  }
  std::string path_;
};

products::Count CountOpened(const ZORDefault::OpenedModel& inModel) {
  products::Count count;
  std::set<std::size_t> parts;
  for (const auto& leaf : products::Leaves(inModel.root)) {
    const auto facts = products::FactsOf(leaf);
    ++count.leaves;
    count.area += facts.area;
    parts.insert(facts.part);
  }
  count.parts = parts.size();
  return count;
}
}  // namespace

TEST_P(RealModels, OpenWithAllPartsAndSurfaces) {
  const auto model = products::OpenAnew(path_);
  const products::Count count = CountOpened(model);
  EXPECT_EQ(count.leaves, GetParam().leaves);
  EXPECT_EQ(count.parts, GetParam().parts);
  EXPECT_NEAR(count.area, GetParam().area, 0.05 * GetParam().area);
  std::size_t coloured = 0;
  std::map<std::size_t, std::size_t> missing;
  for (const auto& leaf : products::Leaves(model.root)) {
    const auto facts = products::FactsOf(leaf);
    coloured += facts.colour ? 1 : 0;
    missing[facts.part] = facts.facesWithoutTriangles;
    EXPECT_FALSE(facts.failedToTessellate) << products::AliasPathOf(leaf);
  }
  EXPECT_EQ(coloured, GetParam().coloured);
  std::size_t allMissing = 0;
  for (const auto& [part, faces] : missing) allMissing += faces;
  EXPECT_EQ(allMissing, GetParam().facesWithoutTriangles);
}

TEST_P(RealModels, NumbersAreThoseOfAnIndependentCount) {
  const products::Count count = products::CountIndependently(path_);
  EXPECT_EQ(count.leaves, GetParam().leaves);
  EXPECT_EQ(count.parts, GetParam().parts);
  EXPECT_NEAR(count.area, GetParam().area, 0.001 * GetParam().area);
}

TEST_P(RealModels, SiblingsHaveDifferentAliases) {
  const auto model = products::OpenAnew(path_);
  for (const auto& product : products::AllProducts(model.root)) {
    std::set<std::string> aliases;
    const auto children = products::ChildrenOf(product);
    for (const auto& child : children) aliases.insert(products::AliasOf(child));
    EXPECT_EQ(aliases.size(), children.size()) << products::AliasPathOf(product);
  }
}

INSTANTIATE_TEST_SUITE_P(
    Published, RealModels,
    testing::Values(RealModel{"as1-oc-214.stp", 18, 5, 141079.3, 18, 0},
                    RealModel{"dissonance_assembly.step", 18, 15, 105612.2, 18, 0},
                    RealModel{"printable_case_full.stp", 15, 6, 200820.5, 0, 0},
                    RealModel{"pushdevice_assembly.step", 67, 67, 339770.8, 67, 0},
                    RealModel{"low_cost_robot_arm.step", 161, 32, 141356.7, 159, 1},
                    RealModel{"manta_model_4.glb", 81, 34, 359494.6, 80, 0},
                    RealModel{"stamp_c6lora_smd.step", 501, 127, 1928.391, 473, 0},
                    RealModel{"opendog_v2_20.stp", 35, 23, 5645605, 8, 128}),
    [](const auto& inInfo) {
      std::string name = inInfo.param.file;
      name = name.substr(0, name.find('.'));
      std::ranges::replace(name, '-', '_');
      return name;
    });
