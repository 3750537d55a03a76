// What the command prints, compared with what it printed when a person last looked at it. With
// ZOR_RENEW_GOLDEN=1 in the environment the files are written instead: look at each difference
// before committing it.
#include <gtest/gtest.h>

#include <cstdlib>
#include <fstream>

#include "tools/Command.h"

namespace {

struct GoldenCase {
  const char* name;
  std::vector<std::string> arguments;
};

const std::string kInputs = "tests/golden/inputs/";

std::vector<GoldenCase> Cases() {
  return {
      {"help", {"--help"}},
      {"help_info", {"info", "--help"}},
      {"help_list", {"list", "--help"}},
      {"help_show", {"show", "--help"}},
      {"help_convert", {"convert", "--help"}},
      {"help_diff", {"diff", "--help"}},
      {"help_carry", {"carry", "--help"}},
      {"help_group", {"group", "--help"}},
      {"help_review", {"review", "--help"}},
      {"help_rules", {"rules", "--help"}},
      {"help_gate", {"gate", "--help"}},
      {"help_merge", {"merge", "--help"}},
      {"help_federate", {"federate", "--help"}},
      {"help_links", {"links", "--help"}},
      {"help_report", {"report", "--help"}},
      {"help_publish", {"publish", "--help"}},
      {"help_extract", {"extract", "--help"}},
      {"help_gather", {"gather", "--help"}},
      {"help_tree", {"tree", "--help"}},
      {"help_render", {"render", "--help"}},
      {"help_detect", {"detect", "--help"}},
      {"help_path", {"path", "--help"}},
      {"help_escape", {"escape", "--help"}},
      {"help_filename", {"filename", "--help"}},
      {"merge", {"merge", kInputs + "two_sets.xml", kInputs + "two_sets.xml", "-o", "-"}},
      {"report", {"report", kInputs + "two_sets.xml", "-o", "-"}},
      {"info_every_kind",
       {"info", "samples/as1.clash.xml", kInputs + "two_sets.xml", kInputs + "single.xml",
        kInputs + "components.xml", kInputs + "federator.xml", kInputs + "errors.xml"}},
      {"info_json_every_kind",
       {"info", "--json", "samples/as1.clash.xml", kInputs + "two_sets.xml", kInputs + "single.xml",
        kInputs + "components.xml", kInputs + "federator.xml", kInputs + "errors.xml"}},
      {"info_json_one", {"info", "--json", "samples/dissonance.clash.xml"}},
      {"list_as1", {"list", "samples/as1.clash.xml"}},
      {"list_french",
       {"list", "--lang", "fr", "--product", "base", "--type", "clearance",
        "samples/dissonance.clash.xml"}},
      {"list_two_sets", {"list", kInputs + "two_sets.xml"}},
      {"list_two_sets_json", {"list", "--json", kInputs + "two_sets.xml"}},
      {"list_two_sets_csv", {"list", "--csv", kInputs + "two_sets.xml"}},
      {"list_hostile", {"list", kInputs + "hostile.xml"}},
      {"list_hostile_csv", {"list", "--csv", kInputs + "hostile.xml"}},
      {"show_as1", {"show", "samples/as1.clash.xml", "10"}},
      {"show_two_sets", {"show", kInputs + "two_sets.xml", "1"}},
      {"show_two_sets_json", {"show", "--json", kInputs + "two_sets.xml", "1"}},
      {"show_without_products_json", {"show", "--json", kInputs + "two_sets.xml", "2"}},
      {"show_one_product_json", {"show", "--json", kInputs + "two_sets.xml", "3"}},
      {"show_single_json", {"show", "--json", kInputs + "single.xml", "1"}},
      {"show_hostile", {"show", kInputs + "hostile.xml", "1"}},
      {"components", {"components", kInputs + "components.xml"}},
      {"components_json", {"components", "--json", kInputs + "components.xml"}},
      {"specs", {"specs", "samples/as1.clash.xml"}},
      {"specs_json", {"specs", "--json", "samples/as1.clash.xml"}},
      {"links", {"links", kInputs + "federator.xml"}},
      {"links_json", {"links", "--json", kInputs + "federator.xml"}},
      {"convert_two_sets", {"convert", "--to", "json", kInputs + "two_sets.xml"}},
      {"convert_components", {"convert", "--to", "json", kInputs + "components.xml"}},
      {"convert_federator", {"convert", "--to", "json", kInputs + "federator.xml"}},
  };
}

class Golden : public testing::TestWithParam<GoldenCase> {};

}  // namespace

TEST_P(Golden, PrintsWhatItPrinted) {
  const std::string path = std::string(ZOR_SOURCE_DIR "/tests/golden/") + GetParam().name + ".txt";
  const CommandResult result = RunCommand(GetParam().arguments);
  EXPECT_EQ(result.code, 0) << result.error;
  EXPECT_EQ(result.error, "");
  ASSERT_NE(result.out, "");
  if (std::getenv("ZOR_RENEW_GOLDEN") != nullptr) {
    std::ofstream(path, std::ios::binary) << result.out;
    GTEST_SKIP() << "written: " << path;
  }
  EXPECT_EQ(result.out, ReadFile(path)) << path;
}

INSTANTIATE_TEST_SUITE_P(Command, Golden, testing::ValuesIn(Cases()),
                         [](const testing::TestParamInfo<GoldenCase>& inInfo) {
                           return std::string(inInfo.param.name);
                         });
