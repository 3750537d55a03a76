// The products of CAD models from a shell.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <map>
#include <nlohmann/json.hpp>

#include "tools/Command.h"

using nlohmann::json;
using testing::HasSubstr;
using testing::MatchesRegex;
using testing::Not;
using testing::StartsWith;

namespace {

const std::string kModel = "samples/as1-oc-214.stp";

/// Runs the command with a cache of models that is the test program's own.
CommandResult RunWithCache(const std::vector<std::string>& inArguments) {
  static const TemporaryDirectory cache;
  setenv("XDG_CACHE_HOME", cache.Path("").c_str(), 1);
  return RunCommand(inArguments);
}

json JsonOf(const std::vector<std::string>& inArguments) {
  const CommandResult result = RunWithCache(inArguments);
  EXPECT_EQ(result.code, 0);
  EXPECT_EQ(result.error, "");
  return json::parse(result.out);
}

/// A model of one triangle in a part of one node; the text around the names is fixed.
std::string GltfWithNames(const std::string& inNodes) {
  return R"({"asset":{"version":"2.0"},"scene":0,"scenes":[{"nodes":[0]}],"nodes":[)" + inNodes +
         R"(],"meshes":[{"primitives":[{"attributes":{"POSITION":0}}]}],)"
         R"("buffers":[{"byteLength":36,"uri":"data:application/octet-stream;base64,)"
         R"(AAAAAAAAAAAAAAAAAACAPwAAAAAAAAAAAAAAAAAAgD8AAAAA"}],)"
         R"("bufferViews":[{"buffer":0,"byteLength":36}],"accessors":[{"bufferView":0,)"
         R"("componentType":5126,"count":3,"type":"VEC3","min":[0,0,0],"max":[1,1,0]}]})";
}

/// The paths and aliases that the leaves of a tree must have.
json LeavesOf(const json& inTree) {
  json leaves = json::array();
  const std::function<void(const json&, const std::string&)> visit =
      [&](const json& inProduct, const std::string& inPath) {
        for (const json& child : inProduct["children"]) {
          const std::string alias = child["alias"];
          visit(child, inPath.empty() ? alias : inPath + " --++-- " + alias);
        }
        if (!inProduct["children"].empty()) return;
        json leaf = inProduct;
        for (const char* const key : {"children", "$schema", "version", "units", "tool", "filters"})
          leaf.erase(key);
        leaf["path"] = inPath;
        leaves.push_back(leaf);
      };
  visit(inTree, "");
  return leaves;
}

std::size_t LevelsOf(const json& inTree) {
  std::size_t deepest = 0;
  if (inTree.contains("children"))
    for (const json& child : inTree["children"]) deepest = std::max(deepest, LevelsOf(child));
  return 1 + deepest;
}

}  // namespace

TEST(Tree, RowsNameProductPartPlacementTrianglesAndColour) {
  const CommandResult result = RunWithCache({"tree", kModel});
  EXPECT_EQ(result.code, 0);
  EXPECT_EQ(result.error, "");
  EXPECT_THAT(result.out, MatchesRegex("Product +Part +Position +Turned +Triangles +Colour\n"
                                       "as1 +as1 +0, 0, 0\n.*"));
  EXPECT_THAT(result.out,
              HasSubstr("\n│  └─ rod_1                rod                 -10, 75, 60       90° "
                        "about 0, 1, 0                  132  #ff8000\n"));
  EXPECT_THAT(result.out, HasSubstr("\n├─ plate_1 "));
  EXPECT_THAT(result.out, HasSubstr("\n   └─ l-bracket_1 "));
}

TEST(Tree, JsonHasTheKeysOfEachProductInOrder) {
  const CommandResult result = RunWithCache({"tree", "--json", kModel});
  EXPECT_THAT(result.out,
              HasSubstr(",\"filters\":{},\"alias\":\"as1\",\"part\":\"as1\",\"placement\":[1.0,0.0,"
                        "0.0,0.0,1.0,0.0,"
                        "0.0,0.0,1.0,0.0,0.0,0.0],\"triangles\":0,\"colour\":null,\"children\":["));
  const json rod = json::parse(result.out)["children"][0]["children"][2];
  EXPECT_EQ(rod["alias"], "rod_1");
  EXPECT_EQ(rod["placement"], json({0, 0, -1, 0, 1, 0, 1, 0, 0, -10, 75, 60}));
  EXPECT_EQ(rod["triangles"], 132);
  EXPECT_EQ(rod["colour"], "#ff8000");
  EXPECT_EQ(rod["children"], json::array());
}

TEST(Tree, LeavesAreThoseOfTheTreeWithTheirPaths) {
  const json leaves = JsonOf({"tree", "--leaves", "--json", kModel});
  EXPECT_EQ(leaves.size(), 18u);
  EXPECT_EQ(leaves, LeavesOf(JsonOf({"tree", "--json", kModel})));
}

TEST(Tree, LeavesAsRowsStartWithTheirPaths) {
  EXPECT_THAT(RunWithCache({"tree", "--leaves", kModel}).out,
              HasSubstr("\nl-bracket-assembly_2 --++-- nut-bolt-assembly_3 --++-- bolt_1  bolt "));
}

TEST(Tree, ClashResultsNameProductsByThesePathsAndPlacements) {
  std::map<std::string, json> placements;
  for (const json& leaf : JsonOf({"tree", "--leaves", "--json", kModel}))
    placements[leaf["path"]] = leaf["placement"];
  int compared = 0;
  for (const json& interference : JsonOf({"list", "--json", "samples/as1.clash.xml"})) {
    for (const json& product : interference["products"]) {
      ASSERT_TRUE(placements.contains(product["alias"])) << product["alias"];
      for (std::size_t i = 0; i < 12; ++i)
        EXPECT_NEAR(product["position"][i], placements[product["alias"]][i], 1e-3);
      ++compared;
    }
  }
  EXPECT_EQ(compared, 64);  // two of each of 32 interferences
}

TEST(Tree, DepthLeavesOutDeeperLevels) {
  for (std::size_t depth : {0u, 1u, 2u, 3u, 9u}) {
    const json tree = JsonOf({"tree", "--json", "--depth", std::to_string(depth), kModel});
    EXPECT_EQ(LevelsOf(tree), std::min<std::size_t>(depth, 3) + 1);
  }
}

TEST(Tree, ProductWhoseChildrenAreNotShownHasNone) {
  const json tree = JsonOf({"tree", "--json", "--depth", "1", kModel});
  EXPECT_FALSE(tree["children"][0].contains("children"));     // an assembly
  EXPECT_EQ(tree["children"][2]["children"], json::array());  // a part
}

TEST(Tree, DepthOfRowsIsThatOfTheJson) {
  const std::string rows = RunWithCache({"tree", "--depth", "1", kModel}).out;
  EXPECT_EQ(std::count(rows.begin(), rows.end(), '\n'), 6);  // the header, the root, four children
}

TEST(Tree, NegativeDepthIsWrongUsage) {
  const CommandResult result = RunWithCache({"tree", "--depth", "-1", kModel});
  EXPECT_EQ(result.code, 2);
  EXPECT_EQ(result.error, "lyra: tree: --depth cannot be negative\nsee lyra --help\n");
}

TEST(Tree, DepthAndLeavesExcludeEachOther) {
  EXPECT_EQ(RunWithCache({"tree", "--depth", "1", "--leaves", kModel}).code, 2);
}

TEST(Tree, SecondRunFromTheCacheSaysTheSame) {
  const TemporaryDirectory cache;
  setenv("XDG_CACHE_HOME", cache.Path("").c_str(), 1);
  const CommandResult first = RunCommand({"tree", "--json", kModel});
  const CommandResult second = RunCommand({"tree", "--json", kModel});
  EXPECT_EQ(first.code, 0);
  EXPECT_EQ(first.out, second.out);
}

TEST(Tree, NamesThatCouldDriveATerminalAreEscaped) {
  const TemporaryDirectory directory;
  const std::string path = directory.Write(
      "a.gltf", GltfWithNames(R"({"name":"root","children":[1,2]},)"
                              R"({"name":"a\u009b\u202eb","mesh":0},{"name":"plain","mesh":0})"));
  const CommandResult rows = RunWithCache({"tree", path});
  EXPECT_EQ(rows.code, 0) << rows.error;
  EXPECT_THAT(rows.out, HasSubstr("a\\u{9B}\\u{202E}b"));
  EXPECT_THAT(RunWithCache({"tree", "--json", path}).out, HasSubstr("a\\u009b\\u202eb"));
}

TEST(Tree, VeryDeepTreeIsPrinted) {
  std::string nodes;
  constexpr int kDepth = 300;
  for (int i = 0; i < kDepth; ++i)
    nodes += R"({"name":"n","children":[)" + std::to_string(i + 1) + "]},";
  const TemporaryDirectory directory;
  const std::string path =
      directory.Write("deep.gltf", GltfWithNames(nodes + R"({"name":"end","mesh":0})"));
  const CommandResult rows = RunWithCache({"tree", path});
  ASSERT_EQ(rows.code, 0) << rows.error;
  EXPECT_THAT(rows.out, HasSubstr("\n(level 300) end "));
  EXPECT_EQ(LevelsOf(JsonOf({"tree", "--json", path})), std::size_t{kDepth} + 1);
}

TEST(Tree, MissingModelIsRefused) {
  const CommandResult result = RunWithCache({"tree", "no/such.stp"});
  EXPECT_EQ(result.code, 1);
  EXPECT_EQ(result.out, "");
  EXPECT_EQ(result.error, "lyra: no/such.stp: does not exist\n");
}

TEST(Tree, FileThatIsNoModelIsRefusedInOneLine) {
  const CommandResult result = RunWithCache({"tree", "samples/as1.clash.xml"});
  EXPECT_EQ(result.code, 1);
  EXPECT_EQ(result.out, "");
  EXPECT_THAT(result.error, StartsWith("lyra: samples/as1.clash.xml: "));
  EXPECT_EQ(std::count(result.error.begin(), result.error.end(), '\n'), 1);
}

TEST(Tree, StandardInputIsRefused) {
  EXPECT_EQ(RunWithCache({"tree", "-"}).error,
            "lyra: -: a model cannot be read from standard input\n");
}

TEST(Tree, ProgressIsShownOnATerminalAndTakenBack) {
  const TemporaryDirectory cache;
  const CommandResult result =
      RunShell("XDG_CACHE_HOME=" + cache.Path("") + " script -qec \"lyra tree " + kModel +
               " >/dev/null\" /dev/null");
  EXPECT_EQ(result.code, 0);
  EXPECT_THAT(result.out, HasSubstr("\rreading " + kModel + " 100%"));
  EXPECT_THAT(result.out, testing::EndsWith("\r"));
}

/// The libraries that a run of the command loads.
std::string LibrariesOf(const std::string& inArguments) {
  return RunShell("LD_DEBUG=files lyra " + inArguments + " 2>&1 >/dev/null").out;
}

TEST(HeavyLibraries, OtherVerbsLoadNone) {
  const std::string libraries = LibrariesOf("info samples/as1.clash.xml");
  ASSERT_THAT(libraries, HasSubstr("libZORLyra.so"));
  for (const char* heavy : {"libZORRayCaster", "libTK", "libembree"})
    EXPECT_THAT(libraries, Not(HasSubstr(heavy)));
}

TEST(HeavyLibraries, TreeLoadsNoneSinceModelsAreReadByAnotherProcess) {
  const TemporaryDirectory cache;
  setenv("XDG_CACHE_HOME", cache.Path("").c_str(), 1);
  const std::string libraries = LibrariesOf("tree " + kModel);
  ASSERT_THAT(libraries, HasSubstr("libZORDefaultPlatform.so"));
  for (const char* heavy : {"libZORRayCaster", "libTK", "libembree"})
    EXPECT_THAT(libraries, Not(HasSubstr(heavy)));
}

// Limits

TEST(Tree, ModelThatTakesTooMuchIsOneLine) {
#ifdef __SANITIZE_ADDRESS__
  GTEST_SKIP() << "the address sanitizer needs the address space that would be limited";
#endif
  const CommandResult result =
      RunShell("XDG_CACHE_HOME=/dev/null lyra tree --limit-memory 1 " + kModel);
  EXPECT_EQ(result.code, 1);
  EXPECT_EQ(result.out, "");
  EXPECT_THAT(result.error,
              MatchesRegex("lyra: " + kModel + ": takes more than 1 MB to read; .*\n"));
}

TEST(Tree, LimitOfTheSettingsHoldsWhereNoneIsGiven) {
#ifdef __SANITIZE_ADDRESS__
  GTEST_SKIP() << "the address sanitizer needs the address space that would be limited";
#endif
  const TemporaryDirectory directory;
  directory.Write("ModelReading.toml", "LimitMemory = 1\n");
  const std::string tree =
      "XDG_CACHE_HOME=/dev/null ZOR_SETTINGS_PATH=" + directory.Path("") + " lyra tree " + kModel;
  EXPECT_THAT(RunShell(tree).error, HasSubstr("takes more than 1 MB to read"));
  EXPECT_EQ(RunShell(tree + " --limit-memory 1000").error, "");
}

TEST(Tree, StrictRefusesADamagedModel) {
  const TemporaryDirectory directory;
  const std::string model = directory.Path("a.stp");
  RunShell("sed 5895d " + kModel + " > " + model);  // a point of an edge
  const std::string damage = model + ": is damaged: 4 entities of the file could not be built\n";
  const CommandResult lenient = RunWithCache({"tree", model});
  EXPECT_EQ(lenient.code, 0);
  EXPECT_THAT(lenient.error, HasSubstr("lyra: warning: " + damage));
  for (const char* verb : {"tree", "render", "publish"}) {
    std::vector<std::string> words = {verb, "--strict"};
    if (verb == std::string("publish"))
      words.insert(words.end(), {"samples/as1.clash.xml", "--model"});
    words.push_back(model);
    if (verb != std::string("tree"))
      words.insert(words.end(), {"-o", directory.Path(verb + std::string(".png"))});
    const CommandResult strict = RunWithCache(words);
    EXPECT_EQ(strict.code, 1) << verb;
    EXPECT_EQ(strict.error, "lyra: " + damage) << verb;
  }
}
