#include "house/SourceTree.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>
#include <regex>
#include <set>

namespace fs = std::filesystem;
using house::FindWrongIncludes;
using testing::Contains;
using testing::ElementsAre;
using testing::Field;
using testing::IsEmpty;
using testing::StartsWith;

namespace {
std::vector<house::SourceFile> ThisProject() { return house::ReadTree(ZOR_SOURCE_DIR); }

/// Whether a file may have this `#include`, in a tree with one header of each kind.
bool MayInclude(const std::string& inPath, const std::string& inInclude) {
  const auto wrong = FindWrongIncludes({
      {"include/ZORClashParsing.h", {}},
      {"include/ZORReader.h", {}},
      {"src/StaticOrder.h", {}},
      {"src/clash_reading/Walk.h", {}},
      {"src/default_platform/Front.h", {}},
      {"src/default_platform/xml/Tree.h", {}},
      {"src/foundation/Hash.h", {}},
      {"src/platform/xml/DOM_Node.h", {}},
      {"src/toolkit/records/Record.h", {}},
      {"tools/lyra/Verbs.h", {}},
      {inPath, {"// first line", "#include " + inInclude}},
  });
  return wrong.empty();
}

constexpr const char* kPublic = "\"ZORReader.h\"";
constexpr const char* kPlatform = "\"platform/xml/DOM_Node.h\"";
constexpr const char* kGroup = "\"clash_reading/Walk.h\"";
constexpr const char* kFoundation = "\"foundation/Hash.h\"";
constexpr const char* kDefaultPlatform = "\"default_platform/xml/Tree.h\"";
constexpr const char* kFront = "\"default_platform/Front.h\"";
constexpr const char* kToolkit = "\"toolkit/records/Record.h\"";
constexpr const char* kTool = "\"lyra/Verbs.h\"";
constexpr const char* kThirdParty = "<xercesc/dom/DOM.hpp>";
constexpr const char* kSystem = "<unistd.h>";
}  // namespace

TEST(SourceTree, ReadFindsThisProjectWithoutBuildAndSamples) {
  const auto tree = ThisProject();
  EXPECT_THAT(tree, Contains(Field(&house::SourceFile::path, "CMakeLists.txt")));
  EXPECT_THAT(tree, Contains(Field(&house::SourceFile::path, "include/ZORClashParsing.h")));
  EXPECT_THAT(tree, Not(Contains(Field(&house::SourceFile::path, StartsWith("build/")))));
  EXPECT_THAT(tree, Not(Contains(Field(&house::SourceFile::path, StartsWith("samples/")))));
}

TEST(SourceTree, ReadGivesPathsAndLines) {
  const fs::path root = fs::path(testing::TempDir()) / "zor_source_tree_read";
  fs::create_directories(root / "src/.hidden");
  std::ofstream(root / "src/A.cpp") << "one\ntwo\n";
  std::ofstream(root / "src/.hidden/B.cpp") << "three\n";

  const auto tree = house::ReadTree(root);
  fs::remove_all(root);

  ASSERT_EQ(tree.size(), 1u);
  EXPECT_EQ(tree[0].path, "src/A.cpp");
  EXPECT_THAT(tree[0].lines, ElementsAre("one", "two"));
}

TEST(IncludeArrows, HoldInThisProject) { EXPECT_THAT(FindWrongIncludes(ThisProject()), IsEmpty()); }

TEST(IncludeArrows, AnswerNamesTheLine) {
  EXPECT_THAT(
      FindWrongIncludes({{"src/clash_reading/A.cpp", {"#include <vector>", "#include <x/y.h>"}}}),
      ElementsAre("src/clash_reading/A.cpp:2: must not include x/y.h"));
}

TEST(IncludeArrows, LibrarySeesItsOwnGroupPublicHeadersAndThePlatform) {
  for (const char* include : {kGroup, kPublic, kPlatform, "\"StaticOrder.h\"", "<vector>"}) {
    EXPECT_TRUE(MayInclude("src/clash_reading/A.cpp", include)) << include;
  }
  for (const char* include : {kDefaultPlatform, kFront, kFoundation, kToolkit, kTool, kThirdParty,
                              kSystem, "<windows.h>"}) {
    EXPECT_FALSE(MayInclude("src/clash_reading/A.cpp", include)) << include;
  }
  EXPECT_FALSE(MayInclude("src/path_text/A.cpp", kGroup));
}

TEST(IncludeArrows, PublicHeadersSeeThePlatformAlone) {
  for (const char* include : {kPublic, kPlatform, "\"ZORLyraExport.h\""}) {
    EXPECT_TRUE(MayInclude("include/A.h", include)) << include;
  }
  for (const char* include :
       {kGroup, kFront, kFoundation, kToolkit, kThirdParty, "\"StaticOrder.h\"", "<windows.h>"}) {
    EXPECT_FALSE(MayInclude("include/A.h", include)) << include;
  }
}

TEST(IncludeArrows, PlatformDeclarationsSeeNothingElse) {
  for (const char* include : {kPlatform, "\"ZORPlatformExport.h\"", "<guiddef.h>"}) {
    EXPECT_TRUE(MayInclude("src/platform/xml/A.h", include)) << include;
  }
  for (const char* include :
       {kPublic, kGroup, kFront, kFoundation, kToolkit, kThirdParty, "<windows.h>"}) {
    EXPECT_FALSE(MayInclude("src/platform/xml/A.h", include)) << include;
  }
}

TEST(IncludeArrows, FoundationSeesNothingOfOurs) {
  for (const char* include : {kFoundation, kThirdParty, kSystem}) {
    EXPECT_TRUE(MayInclude("src/foundation/A.cpp", include)) << include;
  }
  for (const char* include :
       {kPublic, kPlatform, kGroup, kDefaultPlatform, kFront, kToolkit, kTool}) {
    EXPECT_FALSE(MayInclude("src/foundation/A.cpp", include)) << include;
  }
  EXPECT_FALSE(MayInclude("src/foundation/A.h", kThirdParty));
}

TEST(IncludeArrows, DefaultPlatformSeesDeclarationsFoundationAndThirdParties) {
  for (const char* include :
       {kPlatform, kDefaultPlatform, kFront, kFoundation, kThirdParty, kSystem}) {
    EXPECT_TRUE(MayInclude("src/default_platform/xml/A.cpp", include)) << include;
  }
  for (const char* include : {kPublic, kGroup, kToolkit, kTool}) {
    EXPECT_FALSE(MayInclude("src/default_platform/xml/A.cpp", include)) << include;
  }
  EXPECT_FALSE(MayInclude("src/default_platform/A.h", kThirdParty));
}

TEST(IncludeArrows, ToolkitSeesLibraryPlatformFrontHeadersAndFoundation) {
  for (const char* include : {kPublic, kPlatform, kFront, kFoundation, kToolkit, kThirdParty}) {
    EXPECT_TRUE(MayInclude("src/toolkit/scenes/A.cpp", include)) << include;
  }
  for (const char* include : {kGroup, kDefaultPlatform, kTool, "\"StaticOrder.h\""}) {
    EXPECT_FALSE(MayInclude("src/toolkit/scenes/A.cpp", include)) << include;
  }
  EXPECT_FALSE(MayInclude("src/toolkit/scenes/A.h", kThirdParty));
  EXPECT_TRUE(MayInclude("src/toolkit/detection/kernel/A.h", kThirdParty));  // not installed
}

TEST(IncludeArrows, CommandSeesTheToolkitAndWhatItStandsOn) {
  for (const char* include : {kTool, kToolkit, kPublic, kFront, kFoundation, kThirdParty}) {
    EXPECT_TRUE(MayInclude("tools/lyra/A.cpp", include)) << include;
    EXPECT_EQ(MayInclude("python/A.cpp", include), include != kTool) << include;
  }
  // kPlatform is a header of XML.
  for (const char* include : {kGroup, kDefaultPlatform, kPlatform, "\"ZORClashParsing.h\""}) {
    EXPECT_FALSE(MayInclude("tools/lyra/A.cpp", include)) << include;
    EXPECT_FALSE(MayInclude("python/A.cpp", include)) << include;
  }
}

TEST(IncludeArrows, WindowsHeadersAreForTheEntryPoint) {
  EXPECT_TRUE(MayInclude("src/windows/A.cpp", "<windows.h>"));
}

namespace {
constexpr const char* kXml = R"(\bDOM_\w|\bZORXMLParser\b)";
/// Names of a clash document's elements; the counted objects' own names may be the same.
constexpr const char* kClashDocument =
    R"re(^(?!.*CountedName).*"(ClashElement|Clash|GeometricAspect|Interferences?|Products?|Preview)")re";
}  // namespace

TEST(Words, CommandKnowsNoXml) {
  EXPECT_THAT(house::FindLines(ThisProject(), "tools/", kXml), IsEmpty());
}

TEST(Words, DefaultPlatformKnowsNoClashDocument) {
  EXPECT_THAT(house::FindLines(ThisProject(), "src/default_platform/", kClashDocument), IsEmpty());
}

TEST(Words, AreNoticed) {
  EXPECT_THAT(
      house::FindLines({{"tools/lyra/A.cpp", {"int a;", "DOM_Node node;"}}}, "tools/", kXml),
      ElementsAre("tools/lyra/A.cpp:2: DOM_Node node;"));
  EXPECT_THAT(house::FindLines({{"src/A.cpp",
                                 {"Find(\"Interference\");", "ZORISiInterference* i;",
                                  "CountedName() { return \"Product\"; }"}}},
                               "src/", kClashDocument),
              ElementsAre("src/A.cpp:1: Find(\"Interference\");"));
}

TEST(SourceTree, FindLinesLooksBelowTheFolderAlone) {
  EXPECT_THAT(house::FindLines(
                  {{"tools/A.cpp", {"DOM_Node node;"}}, {"src/A.cpp", {"", "x", "DOM_Node node;"}}},
                  "src/", R"(\bDOM_\w)"),
              ElementsAre("src/A.cpp:3: DOM_Node node;"));
}

namespace {
/// The versions of CMake that the files ask for, each once.
std::set<std::string> CMakeVersions(const std::vector<house::SourceFile>& inTree) {
  static const std::regex kVersion(
      R"re(^cmake_minimum_required\(VERSION ([0-9]+)\.([0-9]+)\)|"cmakeMinimumRequired": \{ "major": ([0-9]+), "minor": ([0-9]+))re");
  std::set<std::string> versions;
  for (const house::SourceFile& file : inTree) {
    if (file.path.ends_with(".cpp")) continue;
    for (const std::string& line : file.lines) {
      std::smatch match;
      if (!std::regex_search(line, match, kVersion)) continue;
      versions.insert(match.str(1) + match.str(3) + "." + match.str(2) + match.str(4));
    }
  }
  return versions;
}

std::vector<std::string> FilesLongerThan(std::size_t inMax,
                                         const std::vector<house::SourceFile>& inTree) {
  std::vector<std::string> files;
  for (const house::SourceFile& file : inTree) {
    const bool isOurs = file.path.starts_with("src/") || file.path.starts_with("tools/");
    if (isOurs && file.lines.size() > inMax) files.push_back(file.path);
  }
  return files;
}
}  // namespace

TEST(Build, AsksForOneVersionOfCMake) {
  EXPECT_THAT(CMakeVersions(ThisProject()), testing::SizeIs(1));
}

TEST(Build, AnotherVersionOfCMakeIsNoticed) {
  EXPECT_THAT(CMakeVersions({{"a/CMakeLists.txt", {"cmake_minimum_required(VERSION 3.25)"}},
                             {"CMakePresets.json",
                              {R"(  "cmakeMinimumRequired": { "major": 3, "minor": 23 })"}}}),
              ElementsAre("3.23", "3.25"));
}

TEST(Files, HaveAtMost600Lines) { EXPECT_THAT(FilesLongerThan(600, ThisProject()), IsEmpty()); }

TEST(Files, ALongerOneIsNoticed) {
  const std::vector<std::string> two(2);
  EXPECT_THAT(FilesLongerThan(1, {{"src/A.cpp", two}, {"src/B.cpp", {""}}, {"docs/C.md", two}}),
              ElementsAre("src/A.cpp"));
}

namespace {
/// The files of tests that are no program of their own name: those that their folder's
/// CMakeLists.txt does not name without ".cpp".
std::vector<std::string> TestsWithoutProgram(const std::vector<house::SourceFile>& inTree) {
  static const std::regex kName(R"(\b(\w+?)(_test)?\b(\.cpp)?)");
  std::set<std::string> named;
  for (const house::SourceFile& file : inTree) {
    if (!file.path.ends_with("/CMakeLists.txt")) continue;
    const std::string folder = fs::path(file.path).parent_path().generic_string();
    for (const std::string& line : file.lines) {
      for (std::sregex_iterator word(line.begin(), line.end(), kName), end; word != end; ++word) {
        if (!(*word)[3].matched) named.insert(folder + "/" + word->str(1) + "_test.cpp");
      }
    }
  }
  std::vector<std::string> files;
  for (const house::SourceFile& file : inTree) {
    const bool isTest = file.path.starts_with("tests/") && file.path.ends_with("_test.cpp");
    if (isTest && !named.contains(file.path)) files.push_back(file.path);
  }
  return files;
}
}  // namespace

TEST(TestPrograms, AreNamedAfterTheirFiles) {
  EXPECT_THAT(TestsWithoutProgram(ThisProject()), IsEmpty());
}

TEST(TestPrograms, AFileWithoutOneIsNoticed) {
  EXPECT_THAT(TestsWithoutProgram(
                  {{"tests/a/A_test.cpp", {}},
                   {"tests/a/B_test.cpp", {}},
                   {"tests/a/C_test.cpp", {}},
                   {"tests/a/CMakeLists.txt",
                    {"foreach(subject C)", "zor_add_test(A_test B_test.cpp LIBRARIES ZORLyra)"}}}),
              ElementsAre("tests/a/B_test.cpp"));
}
