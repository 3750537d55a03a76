// The picture references of interferences, and the directory that they are published in.
#include <gtest/gtest.h>

#include <string>

#include "support/LoadedReader.h"
#include "support/PlatformFolder.h"

namespace {

using support::kUntouched;
using support::LoadedReader;
using support::PlatformFolder;
using support::Text;

std::string PreviewOf(LoadedReader& ioReader, int inIndex) {
  ZORUnicodeString picture = kUntouched;
  ioReader->GetClashPreviewURL(inIndex, picture);
  return Text(picture);
}

constexpr const char* kSingleInterference =
    "<InterferenceElement>\n<Other/><Interference><Picture HRef=\"../pictures/i1.jpg\"/>"
    "<Picture HRef=\"second.jpg\"/></Interference><Interference><Picture HRef=\"later.jpg\"/>"
    "</Interference></InterferenceElement>";

TEST(ZORClashParsing, PreviewOfASingleInterferenceStandsInThePublishDirectory) {
  const PlatformFolder folder;
  folder.WriteSettings("ClashPublish", "PublishDefDir = \"/pub\"\n");
  LoadedReader reader(kSingleInterference);
  EXPECT_EQ("/pub/pictures/i1.jpg", PreviewOf(reader, 1));
}

TEST(ZORClashParsing, PreviewOfASingleInterferenceIgnoresTheIndex) {
  const PlatformFolder folder;
  folder.WriteSettings("ClashPublish", "PublishDefDir = \"/pub\"\n");
  LoadedReader reader(kSingleInterference);
  for (int index : {-1, 0, 2, 99}) EXPECT_EQ("/pub/pictures/i1.jpg", PreviewOf(reader, index));
}

TEST(ZORClashParsing, PreviewWithAMissingSettingLosesTheParent) {
  const PlatformFolder folder;
  folder.WriteSettings("ClashPublish", "PictureZoom = 1\n");
  LoadedReader reader(kSingleInterference);
  EXPECT_EQ("/pictures/i1.jpg", PreviewOf(reader, 1));
}

TEST(ZORClashParsing, PreviewWithoutRepositoryKeepsTheParent) {
  const PlatformFolder folder;
  folder.WriteSettings("ClashPublish", "= damaged");
  LoadedReader reader(kSingleInterference);
  EXPECT_EQ("../pictures/i1.jpg", PreviewOf(reader, 1));
}

TEST(ZORClashParsing, PreviewReadsTheSettingAtEachCall) {
  const PlatformFolder folder;
  LoadedReader reader(kSingleInterference);
  folder.WriteSettings("ClashPublish", "PublishDefDir = \"/one\"\n");
  EXPECT_EQ("/one/pictures/i1.jpg", PreviewOf(reader, 1));
  folder.WriteSettings("ClashPublish", "PublishDefDir = \"/two\"\n");
  EXPECT_EQ("/two/pictures/i1.jpg", PreviewOf(reader, 1));
}

TEST(ZORClashParsing, PreviewSettingReplacesOnlyTheFirstParent) {
  const PlatformFolder folder;
  folder.WriteSettings("ClashPublish", "PublishDefDir = \"/pub\"\n");
  LoadedReader reader(
      "<InterferenceElement><Interference><Picture HRef=\"a/../../b.jpg\"/></Interference>"
      "</InterferenceElement>");
  EXPECT_EQ("a//pub/../b.jpg", PreviewOf(reader, 1));
}

TEST(ZORClashParsing, PreviewWithoutParentStaysAsItIs) {
  const PlatformFolder folder;
  folder.WriteSettings("ClashPublish", "PublishDefDir = \"/pub\"\n");
  LoadedReader reader(
      "<InterferenceElement><Interference><Picture HRef=\"b.jpg\"/></Interference>"
      "</InterferenceElement>");
  EXPECT_EQ("b.jpg", PreviewOf(reader, 1));
}

TEST(ZORClashParsing, PreviewOfAnEmptyReferenceStaysEmpty) {
  const PlatformFolder folder;
  folder.WriteSettings("ClashPublish", "PublishDefDir = \"/pub\"\n");
  LoadedReader reader(
      "<InterferenceElement><Interference><Picture/></Interference></InterferenceElement>");
  EXPECT_EQ("", PreviewOf(reader, 1));
}

// What the caller passed stands in for the picture that is missing, directory and all.
TEST(ZORClashParsing, PreviewWithoutPictureKeepsTheCallersTextAndPublishesIt) {
  const PlatformFolder folder;
  folder.WriteSettings("ClashPublish", "PublishDefDir = \"/pub\"\n");
  LoadedReader reader("<InterferenceElement><Interference/></InterferenceElement>");
  EXPECT_EQ(kUntouched, PreviewOf(reader, 1));
  ZORUnicodeString picture = "../mine.jpg";
  reader->GetClashPreviewURL(1, picture);
  EXPECT_EQ("/pub/mine.jpg", Text(picture));
}

TEST(ZORClashParsing, PreviewWithoutInterferenceLeavesTheOutput) {
  const PlatformFolder folder;
  folder.WriteSettings("ClashPublish", "PublishDefDir = \"/pub\"\n");
  LoadedReader reader("<InterferenceElement> <Other/></InterferenceElement>");
  ZORUnicodeString picture = "../mine.jpg";
  reader->GetClashPreviewURL(1, picture);
  EXPECT_EQ("../mine.jpg", Text(picture));
}

TEST(ZORClashParsing, PreviewOfARootWithoutChildrenLeavesTheOutput) {
  LoadedReader reader("<InterferenceElement/>");
  EXPECT_EQ(kUntouched, PreviewOf(reader, 1));
}

constexpr const char* kPictures =
    "<ClashElement>\n<ClashResult>"
    "<Interference><Picture HRef=\"../a1.jpg\"/></Interference><Other/>"
    "<Interference><Picture HRef=\"../a2.jpg\"/></Interference>"
    "<Interference><Picture HRef=\"../a3.jpg\"/></Interference></ClashResult>"
    "<ClashResult><Interference><Picture HRef=\"../b1.jpg\"/></Interference>"
    "<Interference/></ClashResult></ClashElement>";

TEST(ZORClashParsing, PreviewCountsWithinEachResultSetAndTheLastOneWins) {
  LoadedReader reader(kPictures);
  EXPECT_EQ("../b1.jpg", PreviewOf(reader, 1));
  EXPECT_EQ("../a3.jpg", PreviewOf(reader, 3));
}

TEST(ZORClashParsing, PreviewOfALaterSetWithoutPictureLeavesTheEarlierOne) {
  LoadedReader reader(kPictures);
  EXPECT_EQ("../a2.jpg", PreviewOf(reader, 2));
}

TEST(ZORClashParsing, PreviewInAResultSetIsNotPublished) {
  const PlatformFolder folder;
  folder.WriteSettings("ClashPublish", "PublishDefDir = \"/pub\"\n");
  LoadedReader reader(kPictures);
  EXPECT_EQ("../b1.jpg", PreviewOf(reader, 1));
}

TEST(ZORClashParsing, PreviewOutsideEveryResultSetLeavesTheOutput) {
  LoadedReader reader(kPictures);
  for (int index : {0, -2, 4, 2147483647}) EXPECT_EQ(kUntouched, PreviewOf(reader, index)) << index;
}

TEST(ZORClashParsing, PreviewMinusOneOfAClashDocumentLeavesTheOutput) {
  LoadedReader reader(kPictures);
  EXPECT_EQ(kUntouched, PreviewOf(reader, -1));
}

TEST(ZORClashParsing, PreviewMinusOneTakesAnInterferenceDirectlyUnderTheRoot) {
  const PlatformFolder folder;
  folder.WriteSettings("ClashPublish", "PublishDefDir = \"/pub\"\n");
  LoadedReader reader(
      "<ClashElement><ClashResult><Interference><Picture HRef=\"../a.jpg\"/></Interference>"
      "</ClashResult><Interference><Picture HRef=\"../b.jpg\"/></Interference></ClashElement>");
  EXPECT_EQ("/pub/b.jpg", PreviewOf(reader, -1));
  EXPECT_EQ("../a.jpg", PreviewOf(reader, 1));
}

TEST(ZORClashParsing, PreviewOfASingleInterferenceIgnoresResultSets) {
  const PlatformFolder folder;
  folder.WriteSettings("ClashPublish", "PublishDefDir = \"/pub\"\n");
  LoadedReader reader(
      "<InterferenceElement><ClashResult><Interference><Picture HRef=\"../a.jpg\"/></Interference>"
      "</ClashResult></InterferenceElement>");
  EXPECT_EQ(kUntouched, PreviewOf(reader, 1));
}

}  // namespace
