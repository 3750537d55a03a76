#include <gtest/gtest.h>

#include <string>

#include "BuildPath.h"
#include "ZORLyraGeneralServices.h"
#include "support/PlatformFolder.h"

namespace {
std::string Directory(const char* inName) {
  return ZORLyraGeneralServices::TransformFromDLName(inName).ConvertToChar();
}

std::string Path(const char* inReference) {
  return ZORLyraGeneralServices::TransformPathnameFromDLName(inReference).ConvertToChar();
}

class GeneralServicesLogicalNames : public testing::Test {
 protected:
  void SetUp() override {
    folder_.WriteLogicalNames(
        "Reports = '${ZOR_TEST_ROOT}/reports'\n"
        "Lost = '${ZOR_TEST_NO_SUCH_VARIABLE}/lost'\n");
  }
  support::PlatformFolder folder_;
  support::ScopedVariable root_{"ZOR_TEST_ROOT", "/data"};
};
}  // namespace

TEST_F(GeneralServicesLogicalNames, DirectoryOfASchemeAndAKnownNameIsExpanded) {
  EXPECT_EQ(Directory("ZORDLN://Reports"), "/data/reports");
}

TEST_F(GeneralServicesLogicalNames, DirectoryOfASchemeAndAnUnknownNameIsEmpty) {
  EXPECT_EQ(Directory("ZORDLN://Elsewhere"), "");
}

TEST_F(GeneralServicesLogicalNames, DirectoryOfASchemeThatCannotBeExpandedIsEmpty) {
  EXPECT_EQ(Directory("ZORDLN://Lost"), "");
}

TEST_F(GeneralServicesLogicalNames, DirectoryOfASchemeAloneIsEmpty) {
  EXPECT_EQ(Directory("ZORDLN://"), "");
}

// Nine characters are dropped from the start, wherever the scheme stands.
TEST_F(GeneralServicesLogicalNames, DirectoryDropsNineCharactersWhereverTheSchemeIsFound) {
  EXPECT_EQ(Directory("123456789ReportsZORDLN://"), "");
  folder_.WriteLogicalNames("'ReportsZORDLN://' = '/odd'\n");
  EXPECT_EQ(Directory("123456789ReportsZORDLN://"), "/odd");
}

TEST_F(GeneralServicesLogicalNames, DirectoryWithoutSchemeIsThatOfBuildPath) {
  for (const char* name : {"Reports", "Elsewhere", "Lost", "", "\x01", "\x01?!Reports",
                           "\x01?!Elsewhere", "\u00e9\u00e9\u00e9Reports", "\u00e9Reports"}) {
    EXPECT_EQ(Directory(name), BuildPath::TransformFromDLName(name).ConvertToChar()) << name;
  }
  EXPECT_EQ(Directory("Reports"), "/data/reports");
  EXPECT_EQ(Directory("Elsewhere"), "Elsewhere");
  EXPECT_EQ(Directory("\x01?!Elsewhere"), "");
}

TEST_F(GeneralServicesLogicalNames, PathJoinsDirectoryAndTailByABackslash) {
  EXPECT_EQ(Path("ZORDLN://Reports\\folder\\a.xsl"), "/data/reports\\folder\\a.xsl");
}

TEST_F(GeneralServicesLogicalNames, PathWithoutTailEndsInABackslash) {
  EXPECT_EQ(Path("ZORDLN://Reports"), "/data/reports\\");
}

TEST_F(GeneralServicesLogicalNames, PathOfAPlainPathIsThePath) {
  EXPECT_EQ(Path("D:\\data\\a.xsl"), "D:\\data\\a.xsl");
}

TEST_F(GeneralServicesLogicalNames, PathOfAnUnknownNameIsEmpty) {
  EXPECT_EQ(Path("ZORDLN://Elsewhere\\a.xsl"), "");
}

TEST_F(GeneralServicesLogicalNames, PathThatCannotBeExpandedIsTheWordError) {
  EXPECT_EQ(Path("ZORDLN://Lost\\a.xsl"), "error");
}
