#include <gtest/gtest.h>

#include <string>

#include "BuildPath.h"
#include "support/PlatformFolder.h"

namespace {
std::string Directory(const char* inName) {
  return BuildPath::TransformFromDLName(inName).ConvertToChar();
}

std::string Path(const char* inReference) {
  return BuildPath::TransformPathnameFromDLName(inReference).ConvertToChar();
}

/// A table with one name whose directory can be expanded and one whose directory cannot.
class BuildPathLogicalNames : public testing::Test {
 protected:
  void SetUp() override {
    folder_.WriteLogicalNames(
        "Reports = '${ZOR_TEST_ROOT}/reports'\n"
        "Lost = '${ZOR_TEST_NO_SUCH_VARIABLE}/lost'\n"
        "Empty = ''\n");
  }
  support::PlatformFolder folder_;
  support::ScopedVariable root_{"ZOR_TEST_ROOT", "/data"};
};
}  // namespace

TEST_F(BuildPathLogicalNames, DirectoryOfAKnownNameIsExpanded) {
  EXPECT_EQ(Directory("Reports"), "/data/reports");
}

TEST_F(BuildPathLogicalNames, DirectoryOfAnUnknownNameIsTheName) {
  EXPECT_EQ(Directory("Elsewhere"), "Elsewhere");
  EXPECT_EQ(Directory("/an/ordinary/path"), "/an/ordinary/path");
}

TEST_F(BuildPathLogicalNames, DirectoryThatCannotBeExpandedIsEmpty) {
  EXPECT_EQ(Directory("Lost"), "");
  EXPECT_EQ(Directory("\x01\x01\x01Lost"), "");
}

TEST_F(BuildPathLogicalNames, DirectoryDropsThreeCharactersBehindAControlByte) {
  EXPECT_EQ(Directory("\x01?!Reports"), "/data/reports");
}

TEST_F(BuildPathLogicalNames, DirectoryOfAnUnknownNameBehindAControlByteIsEmpty) {
  EXPECT_EQ(Directory("\x01?!Elsewhere"), "");
}

TEST_F(BuildPathLogicalNames, DirectoryLooksAtTheByteAboveOneAsAnOrdinaryCharacter) {
  EXPECT_EQ(Directory("\x02?!Reports"), "\x02?!Reports");
}

// Their first byte is beyond ASCII. Three characters are dropped, not three bytes.
TEST_F(BuildPathLogicalNames, DirectoryDropsThreeCharactersBehindACharacterBeyondASCII) {
  EXPECT_EQ(Directory("\u00e9\u00e9\u00e9Reports"), "/data/reports");
  EXPECT_EQ(Directory("\u2022ab"
                      "Reports"),
            "/data/reports");
  EXPECT_EQ(Directory("\u00e9Reports"), "");
}

TEST_F(BuildPathLogicalNames, DirectoryOfAnEmptyNameIsEmpty) { EXPECT_EQ(Directory(""), ""); }

TEST_F(BuildPathLogicalNames, DirectoryOfANameShorterThanWhatIsDroppedIsEmpty) {
  EXPECT_EQ(Directory("\x01"), "");
  EXPECT_EQ(Directory("\x01"
                      "a"),
            "");
  EXPECT_EQ(Directory("\x01"
                      "ab"),
            "");
  EXPECT_EQ(Directory("\u00e9"), "");
}

TEST_F(BuildPathLogicalNames, DirectoryLooksTheSchemeUpWithTheName) {
  EXPECT_EQ(Directory("ZORDLN://Reports"), "ZORDLN://Reports");
}

TEST_F(BuildPathLogicalNames, PathOfAPlainPathIsThePath) {
  EXPECT_EQ(Path("C:\\temp\\report.xml"), "C:\\temp\\report.xml");
  EXPECT_EQ(Path("Reports"), "Reports");
  EXPECT_EQ(Path(""), "");
}

TEST_F(BuildPathLogicalNames, PathJoinsDirectoryAndTailByABackslash) {
  EXPECT_EQ(Path("ZORDLN://Reports\\folder\\file.xsl"), "/data/reports\\folder\\file.xsl");
}

TEST_F(BuildPathLogicalNames, PathKeepsForwardSlashesInTheTail) {
  EXPECT_EQ(Path("ZORDLN://Reports\\folder/sub/file.xsl"), "/data/reports\\folder/sub/file.xsl");
}

// Only a backslash ends the logical name.
TEST_F(BuildPathLogicalNames, PathDoesNotSplitAtAForwardSlash) {
  EXPECT_EQ(Path("ZORDLN://Reports/file.xsl"), "");
}

TEST_F(BuildPathLogicalNames, PathWithoutTailEndsInABackslash) {
  EXPECT_EQ(Path("ZORDLN://Reports"), "/data/reports\\");
  EXPECT_EQ(Path("ZORDLN://Reports\\"), "/data/reports\\");
}

TEST_F(BuildPathLogicalNames, PathDropsTheTextBeforeTheScheme) {
  EXPECT_EQ(Path("see ZORDLN://Reports\\a.xsl"), "/data/reports\\a.xsl");
}

TEST_F(BuildPathLogicalNames, PathTakesTheFirstScheme) {
  EXPECT_EQ(Path("ZORDLN://Reports\\ZORDLN://b"), "/data/reports\\ZORDLN://b");
}

TEST_F(BuildPathLogicalNames, PathOfAnUnknownNameIsEmpty) {
  EXPECT_EQ(Path("ZORDLN://Elsewhere\\a.xsl"), "");
}

TEST_F(BuildPathLogicalNames, PathThatCannotBeExpandedIsTheWordError) {
  EXPECT_EQ(Path("ZORDLN://Lost\\a.xsl"), "error");
}

TEST_F(BuildPathLogicalNames, PathOfASchemeAloneIsEmpty) {
  EXPECT_EQ(Path("ZORDLN://"), "");
  EXPECT_EQ(Path("ZORDLN://\\a.xsl"), "");
}

TEST_F(BuildPathLogicalNames, SchemeIsComparedWithLetterCase) {
  EXPECT_EQ(Path("zordln://Reports"), "zordln://Reports");
}

TEST_F(BuildPathLogicalNames, TableIsReadAtEachCall) {
  EXPECT_EQ(Directory("Reports"), "/data/reports");
  folder_.WriteLogicalNames("Reports = '/moved'\n");
  EXPECT_EQ(Directory("Reports"), "/moved");
}

TEST_F(BuildPathLogicalNames, DamagedTableKnowsNoName) {
  folder_.WriteLogicalNames("= damaged");
  EXPECT_EQ(Directory("Reports"), "Reports");
  EXPECT_EQ(Path("ZORDLN://Reports"), "");
}
