// The clash results of the samples name products of real models and their places.
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <map>

#include "default_platform/product_structure/OpenedModels.h"
#include "platform/xml/DOMParser.h"
#include "platform/xml/DOM_Document.h"
#include "platform/xml/DOM_Element.h"

namespace {
struct ClashResult {
  const char* result;
  const char* model;
  std::size_t products;  // how many different ones the result names
};

/// As GetCoefficients gives them: three columns, then the translation.
typedef std::array<double, 12> Placement;

class ClashResults : public testing::TestWithParam<ClashResult> {};

std::string Attribute(const DOM_Element& inElement, const char* inName) {
  return inElement.getAttribute(inName).DOMStringToZORUnicodeString().ConvertToChar();
}

/// Decimal commas are read too.
double Number(const DOM_Element& inElement, const char* inName) {
  std::string text = Attribute(inElement, inName);
  std::ranges::replace(text, ',', '.');
  return std::stod(text);
}

Placement PlacementOf(const DOM_Element& inMatrix) {
  Placement placement{};
  std::size_t column = 0;
  for (DOM_Node node = inMatrix.getFirstChild(); !node.isNull(); node = node.getNextSibling()) {
    const DOM_Element element(node);
    if (element.isNull()) continue;
    const bool isPoint = element.getTagName().equals("Point");
    const std::size_t first = isPoint ? 9 : 3 * column++;
    placement[first] = Number(element, isPoint ? "Ux" : "Vx");
    placement[first + 1] = Number(element, isPoint ? "Uy" : "Vy");
    placement[first + 2] = Number(element, isPoint ? "Uz" : "Vz");
  }
  return placement;
}

void CollectPlacements(const DOM_Node& inNode, std::map<std::string, Placement>& ioPlacements) {
  for (DOM_Node node = inNode.getFirstChild(); !node.isNull(); node = node.getNextSibling()) {
    const DOM_Element element(node);
    if (element.isNull()) continue;
    if (element.getTagName().equals("Matrix"))
      ioPlacements[Attribute(DOM_Element(inNode), "DescriptionID")] = PlacementOf(element);
    CollectPlacements(node, ioPlacements);
  }
}

std::map<std::string, Placement> PlacementsIn(const std::string& inPath) {
  DOMParser parser;
  parser.parse(inPath.c_str());
  std::map<std::string, Placement> placements;
  CollectPlacements(parser.getDocument().getDocumentElement(), placements);
  return placements;
}
}  // namespace

TEST_P(ClashResults, EveryProductIsFoundAtItsPlace) {
  const auto path = products::FindModel(GetParam().model);
  if (!path) GTEST_SKIP() << GetParam().model << " is not here; set ZOR_MODEL_DIR";
  const auto model = products::OpenAnew(*path);
  const auto placements = PlacementsIn(products::Sample(GetParam().result));
  EXPECT_EQ(placements.size(), GetParam().products);
  for (const auto& [alias, expected] : placements) {
    const ZORIProduct_var product = ZORDefault::FindProduct(model.root, alias.c_str());
    ASSERT_FALSE(product.IsNull()) << alias;
    Placement found;
    products::FactsOf(product).rootFromProduct.GetCoefficients(found.data());
    for (std::size_t i = 0; i < 12; ++i)  // the result has six digits
      EXPECT_NEAR(found[i], expected[i], 1e-3 + 5e-6 * std::abs(expected[i])) << alias << ' ' << i;
  }
}

INSTANTIATE_TEST_SUITE_P(
    Samples, ClashResults,
    testing::Values(ClashResult{"as1.clash.xml", "as1-oc-214.stp", 18},
                    ClashResult{"dissonance.clash.xml", "dissonance_assembly.step", 18},
                    ClashResult{"printable_case.clash.xml", "printable_case_full.stp", 15},
                    ClashResult{"pushdevice.clash.xml", "pushdevice_assembly.step", 67},
                    ClashResult{"low_cost_robot_arm.clash.xml", "low_cost_robot_arm.step", 161},
                    ClashResult{"stamp_c6lora.clash.xml", "stamp_c6lora_smd.step", 498}),
    [](const auto& inInfo) {
      std::string name = inInfo.param.model;
      name = name.substr(0, name.find('.'));
      std::ranges::replace(name, '-', '_');
      return name;
    });
