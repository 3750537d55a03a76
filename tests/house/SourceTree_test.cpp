#include "house/SourceTree.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>

namespace fs = std::filesystem;
using house::FindWrongIncludes;
using testing::Contains;
using testing::ElementsAre;
using testing::Field;
using testing::IsEmpty;
using testing::StartsWith;

namespace {
std::vector<house::SourceFile> ThisProject() { return house::ReadTree(ZOR_SOURCE_DIR); }

/// The wrong includes of one file that stands beside one header of each kind.
std::vector<std::string> WrongIncludesOf(const std::string& inPath, const std::string& inInclude) {
  return FindWrongIncludes({
      {"include/ZORReader.h", {}},
      {"src/StaticOrder.h", {}},
      {"src/clash_reading/Walk.h", {}},
      {"src/default_platform/Front.h", {}},
      {"src/default_platform/xml/Tree.h", {}},
      {"src/platform/xml/DOM_Node.h", {}},
      {inPath, {"// first line", "#include " + inInclude}},
  });
}
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

TEST(IncludeArrows, LibraryMayNotSeeTheDefaultPlatform) {
  EXPECT_THAT(WrongIncludesOf("src/clash_reading/A.cpp", "\"default_platform/xml/Tree.h\""),
              ElementsAre("src/clash_reading/A.cpp:2: must not include "
                          "default_platform/xml/Tree.h"));
  EXPECT_THAT(WrongIncludesOf("src/clash_reading/A.cpp", "\"default_platform/Front.h\""),
              testing::SizeIs(1));
}

TEST(IncludeArrows, LibraryMayNotSeeThirdPartiesOrTheSystem) {
  EXPECT_THAT(WrongIncludesOf("src/path_text/A.cpp", "<xercesc/dom/DOM.hpp>"), testing::SizeIs(1));
  EXPECT_THAT(WrongIncludesOf("src/path_text/A.cpp", "<unistd.h>"), testing::SizeIs(1));
  EXPECT_THAT(WrongIncludesOf("src/path_text/A.cpp", "<windows.h>"), testing::SizeIs(1));
}

TEST(IncludeArrows, LibraryMayNotSeeAnotherGroup) {
  EXPECT_THAT(WrongIncludesOf("src/path_text/A.cpp", "\"clash_reading/Walk.h\""),
              testing::SizeIs(1));
}

TEST(IncludeArrows, LibraryMaySeeItsOwnGroupPublicHeadersAndThePlatform) {
  for (const char* include : {"\"clash_reading/Walk.h\"", "\"ZORReader.h\"", "\"StaticOrder.h\"",
                              "\"platform/xml/DOM_Node.h\"", "<vector>"}) {
    EXPECT_THAT(WrongIncludesOf("src/clash_reading/A.cpp", include), IsEmpty()) << include;
  }
}

TEST(IncludeArrows, PublicHeadersSeeThePlatformAlone) {
  EXPECT_THAT(WrongIncludesOf("include/A.h", "\"platform/xml/DOM_Node.h\""), IsEmpty());
  EXPECT_THAT(WrongIncludesOf("include/A.h", "\"ZORLyraExport.h\""), IsEmpty());
  EXPECT_THAT(WrongIncludesOf("include/A.h", "\"clash_reading/Walk.h\""), testing::SizeIs(1));
  EXPECT_THAT(WrongIncludesOf("include/A.h", "\"StaticOrder.h\""), testing::SizeIs(1));
  EXPECT_THAT(WrongIncludesOf("include/A.h", "<fmt/format.h>"), testing::SizeIs(1));
}

TEST(IncludeArrows, PlatformDeclarationsSeeNeitherLibraryNorThirdParties) {
  EXPECT_THAT(WrongIncludesOf("src/platform/xml/A.h", "\"platform/xml/DOM_Node.h\""), IsEmpty());
  EXPECT_THAT(WrongIncludesOf("src/platform/xml/A.h", "\"ZORPlatformExport.h\""), IsEmpty());
  EXPECT_THAT(WrongIncludesOf("src/platform/xml/A.h", "\"ZORReader.h\""), testing::SizeIs(1));
  EXPECT_THAT(WrongIncludesOf("src/platform/xml/A.h", "<toml++/toml.h>"), testing::SizeIs(1));
}

TEST(IncludeArrows, DefaultPlatformSeesThirdPartiesButNotTheLibrary) {
  EXPECT_THAT(WrongIncludesOf("src/default_platform/xml/A.cpp", "<xercesc/dom/DOM.hpp>"),
              IsEmpty());
  EXPECT_THAT(WrongIncludesOf("src/default_platform/xml/A.cpp", "\"ZORReader.h\""),
              testing::SizeIs(1));
  EXPECT_THAT(WrongIncludesOf("src/default_platform/xml/A.cpp", "\"clash_reading/Walk.h\""),
              testing::SizeIs(1));
}

TEST(IncludeArrows, ToolsSeeTheFrontOfTheDefaultPlatformAlone) {
  EXPECT_THAT(WrongIncludesOf("tools/lyra/A.cpp", "\"default_platform/Front.h\""), IsEmpty());
  EXPECT_THAT(WrongIncludesOf("tools/lyra/A.cpp", "\"default_platform/xml/Tree.h\""),
              testing::SizeIs(1));
}

TEST(IncludeArrows, WindowsHeadersAreForTheEntryPoint) {
  EXPECT_THAT(WrongIncludesOf("src/platform/system/A.h", "<windows.h>"), testing::SizeIs(1));
  EXPECT_THAT(WrongIncludesOf("include/A.h", "<windows.h>"), testing::SizeIs(1));
  EXPECT_THAT(WrongIncludesOf("src/windows/A.cpp", "<windows.h>"), IsEmpty());
}
