// Pictures of publications: small ones of points, where products stand, and runs that end early.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

#include "tools/Command.h"

using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

namespace fs = std::filesystem;

namespace {

constexpr const char* kModel = "samples/as1-oc-214.stp";
constexpr const char* kNut = "rod-assembly_1 --++-- nut_1";
constexpr const char* kRod = "rod-assembly_1 --++-- rod_1";

std::string ProductText(const std::string& inPath, const std::string& inMatrix) {
  return "<Product DescriptionID='" + inPath + "' Alias='" + inPath + "'>" + inMatrix +
         "</Product>";
}

/// No turn, and a place.
std::string MatrixAt(const std::string& inUx) {
  return "<Matrix><Point Ux='" + inUx +
         "' Uy='75' Uz='60'/><Vector CorrespondingData='Rx' Vx='1' Vy='0' Vz='0'/>"
         "<Vector CorrespondingData='Ry' Vx='0' Vy='1' Vz='0'/>"
         "<Vector CorrespondingData='Rz' Vx='0' Vy='0' Vz='1'/></Matrix>";
}

/// A nut and a rod with two points between them.
std::string NutAndRod(const std::string& inNutMatrix, const std::string& inRodMatrix) {
  return "<ClashElement Version='1.2' ZORDocument='d'><ClashResult Name='r' NbInterf='1'>"
         "<Interference ResultType='Contact'>" +
         ProductText(kNut, inNutMatrix) + ProductText(kRod, inRodMatrix) +
         "<GeometricAspect><Point Ux='178' Uy='75' Uz='65'/><Point Ux='178' Uy='75' Uz='55'/>"
         "</GeometricAspect></Interference></ClashResult></ClashElement>";
}

class PublishedPictures : public testing::Test {
 protected:
  CommandResult Run(const std::string& inDocument, std::vector<std::string> inMore = {}) {
    std::vector<std::string> words = {"publish", "-",    "-o",     folder_,
                                      "--model", kModel, "--size", "90x60"};
    words.insert(words.end(), inMore.begin(), inMore.end());
    return RunCommand(words, inDocument);
  }
  /// With small pictures switched on.
  CommandResult RunWithSmallOnes(const std::string& inFormat) {
    const std::string document = directory_.Write("in.xml", NutAndRod("", ""));
    fs::create_directories(directory_.Path("system"));
    directory_.Write("system/Clash.toml", "ModeOfSubInterf = 1\n");
    return RunShell("TRX_VELD_SUBINTERF=TRUE ZOR_SETTINGS_PATH=" + directory_.Path("") +
                    " lyra publish --resume --size 90x60 --format " + inFormat + " --model " +
                    kModel + " -o " + folder_ + " " + document);
  }
  /// A run on the sample that is ended when its first picture is there.
  CommandResult RunEndedBy(const std::string& inSignal) {
    fs::create_directories(directory_.Path("tmp"));
    return RunShell("TMPDIR=" + directory_.Path("tmp") +
                    " lyra publish --jobs 1 --zoom interference --size 200x134 --model " + kModel +
                    " -o " + folder_ + " samples/as1.clash.xml & for i in {1..3000}; do ls " +
                    folder_ + "/pictures/*.jpg >/dev/null 2>&1 && break; sleep 0.01; done; kill -" +
                    inSignal + " $!; wait $!");
  }

  std::string Page() const { return ReadFile(folder_ + "/index.html"); }
  std::string Picture(const std::string& inName) const { return folder_ + "/pictures/" + inName; }
  std::string BytesOf(const std::string& inName) const { return ReadFile(Picture(inName)); }
  std::vector<std::string> Hidden(const std::string& inFolder) const {
    std::vector<std::string> names;
    for (const fs::directory_entry& entry : fs::directory_iterator(inFolder)) {
      const std::string name = entry.path().filename().string();
      if (name.starts_with('.') && name != ".lyra-publish") names.push_back(name);
    }
    return names;
  }

  TemporaryDirectory directory_;
  std::string folder_ = directory_.Path("out");
};

}  // namespace

// Small pictures

TEST_F(PublishedPictures, SmallOnesOfPointsAreThereWhereSwitchedOn) {
  const CommandResult result = RunWithSmallOnes("png");
  ASSERT_EQ(result.code, 0) << result.error;
  for (const char* name : {"interference_1_SubItf_1.png", "interference_1_SubItf_2.png"}) {
    EXPECT_EQ(BytesOf(name).substr(16, 8), std::string("\0\0\0\x48\0\0\0\x32", 8)) << name;
    EXPECT_THAT(Page(), HasSubstr(std::string("src=\"pictures/") + name + "\"")) << name;
  }
  EXPECT_NE(BytesOf("interference_1_SubItf_1.png"), BytesOf("interference_1_SubItf_2.png"));
  EXPECT_FALSE(fs::exists(Picture("interference_1_SubItf_3.png")));
  EXPECT_THAT(Hidden(folder_ + "/pictures"), IsEmpty());
}

// All of them have the name that follows from that of the main picture.
TEST_F(PublishedPictures, OneSmallOneIsLeftBesideAJpeg) {
  ASSERT_EQ(RunWithSmallOnes("jpeg").code, 0);
  EXPECT_EQ(BytesOf("interference_1.jpg.png").substr(0, 2), "\xFF\xD8");
  EXPECT_THAT(Page(), HasSubstr("src=\"pictures/interference_1.jpg.png\""));
}

TEST_F(PublishedPictures, SmallOnesAreNotThereOtherwise) {
  ASSERT_EQ(Run(NutAndRod("", ""), {"--format", "png"}).code, 0);
  EXPECT_FALSE(fs::exists(Picture("interference_1_SubItf_1.png")));
  EXPECT_THAT(Page(), Not(HasSubstr("_SubItf_")));
}

TEST_F(PublishedPictures, SwitchingSmallOnesOnDrawsAllAnew) {
  ASSERT_EQ(Run(NutAndRod("", ""), {"--format", "png"}).code, 0);
  EXPECT_THAT(RunWithSmallOnes("png").error, HasSubstr("show something else: all are drawn"));
  EXPECT_TRUE(fs::exists(Picture("interference_1_SubItf_2.png")));
}

// Where products stand

TEST_F(PublishedPictures, ProductsStandWhereTheResultSays) {
  ASSERT_EQ(Run(NutAndRod(MatrixAt("175"), MatrixAt("-10"))).code, 0);
  const std::string there = BytesOf("interference_1.jpg");
  ASSERT_EQ(Run(NutAndRod(MatrixAt("165"), MatrixAt("-10"))).code, 0);
  EXPECT_NE(BytesOf("interference_1.jpg"), there);
  EXPECT_THAT(Page(), Not(HasSubstr("where they stand in the model")));
}

TEST_F(PublishedPictures, ProductsStandAsInTheModelWhenAskedFor) {
  const std::vector<std::string> asked = {"--positions", "model"};
  ASSERT_EQ(Run(NutAndRod(MatrixAt("175"), MatrixAt("-10")), asked).code, 0);
  const std::string there = BytesOf("interference_1.jpg");
  ASSERT_EQ(Run(NutAndRod(MatrixAt("165"), MatrixAt("-10")), asked).code, 0);
  EXPECT_EQ(BytesOf("interference_1.jpg"), there);
  EXPECT_THAT(Page(), HasSubstr("The pictures show the products where they stand in the model."));
}

TEST_F(PublishedPictures, PageSaysWhichPlacementsCannotBeUsed) {
  const CommandResult result = Run(NutAndRod(MatrixAt("175"), MatrixAt("-10,5")));
  ASSERT_EQ(result.code, 0) << result.error;
  EXPECT_THAT(Page(), HasSubstr("<strong>1</strong> of 1 interferences are drawn with the"));
  EXPECT_THAT(Page(), HasSubstr(std::string("As in the model: <bdi>") + kRod +
                                ": its numbers are cut at a decimal comma</bdi>"));
}

TEST_F(PublishedPictures, LongNamesAreCutInWarnings) {
  const std::string name(3000, 'x');
  const CommandResult result =
      Run("<InterferenceElement><Interference><Product Alias='" + name + "'/><Product Alias='" +
          kNut + "'/></Interference></InterferenceElement>");
  ASSERT_EQ(result.code, 0) << result.error;
  EXPECT_THAT(result.error, HasSubstr("\"" + std::string(160, 'x') + "…\""));
  EXPECT_THAT(result.error, Not(HasSubstr(std::string(161, 'x'))));
  EXPECT_THAT(Page(), HasSubstr("<bdi>" + std::string(240, 'x') + "</bdi>…"));
  EXPECT_THAT(Page(), HasSubstr("<strong><bdi>" + name + "</bdi></strong>"));
}

TEST_F(PublishedPictures, UnknownPositionsAreWrongUsage) {
  const CommandResult result = Run(NutAndRod("", ""), {"--positions", "here"});
  EXPECT_EQ(result.code, 2);
  EXPECT_THAT(result.error, HasSubstr("known are result, model"));
}

// Runs that end early

TEST_F(PublishedPictures, TerminatedRunLeavesNothingUnfinished) {
  EXPECT_EQ(RunEndedBy("TERM").code, 128 + 15);
  EXPECT_THAT(Hidden(folder_), IsEmpty());
  EXPECT_THAT(Hidden(folder_ + "/pictures"), IsEmpty());
  EXPECT_TRUE(fs::is_empty(directory_.Path("tmp")));
  EXPECT_FALSE(fs::exists(folder_ + "/index.html"));
  EXPECT_FALSE(fs::exists(Picture("interference_32.jpg")));
}

TEST_F(PublishedPictures, TerminatedRunGoesOn) {
  RunEndedBy("TERM");
  const auto first = fs::last_write_time(Picture("interference_1.jpg"));
  const CommandResult result =
      RunCommand({"publish", "samples/as1.clash.xml", "--model", kModel, "--zoom", "interference",
                  "--size", "200x134", "--resume", "-o", folder_});
  EXPECT_EQ(result.error, "");
  EXPECT_THAT(result.out, testing::EndsWith("32 interferences, 32 with a picture\n"));
  EXPECT_EQ(fs::last_write_time(Picture("interference_1.jpg")), first);
}

TEST_F(PublishedPictures, WhatAKilledRunLeftUnfinishedGoes) {
  ASSERT_EQ(Run(NutAndRod("", "")).code, 0);
  for (const char* folder : {"out", "out/pictures"}) {
    const std::string work = std::string(folder) + "/.lyra-unfinished";
    fs::create_directory(directory_.Path(work));
    for (const char* name : {"/lock", "/.zorlyra-fedcba9876543210", "/interference_1.jpg"})
      directory_.Write(work + name, "unfinished");
  }
  ASSERT_EQ(Run(NutAndRod("", ""), {"--resume"}).code, 0);
  EXPECT_THAT(Hidden(folder_), IsEmpty());
  EXPECT_THAT(Hidden(folder_ + "/pictures"), IsEmpty());
}

TEST_F(PublishedPictures, UnfinishedFilesOfOthersStay) {
  ASSERT_EQ(Run(NutAndRod("", "")).code, 0);
  for (const char* name : {"out/.zorlyra-fedcba9876543210", "out/pictures/.mine",
                           "out/pictures/.zorlyra-0123456789abcdef"})
    directory_.Write(name, "unfinished");
  ASSERT_EQ(Run(NutAndRod("", "")).code, 0);
  EXPECT_THAT(Hidden(folder_), testing::ElementsAre(".zorlyra-fedcba9876543210"));
  EXPECT_THAT(Hidden(folder_ + "/pictures"),
              testing::UnorderedElementsAre(".mine", ".zorlyra-0123456789abcdef"));
}

// Stopped ones would otherwise go on with their pictures at any later time.
TEST_F(PublishedPictures, ProcessesThatDrawEndWithAKilledRun) {
  // In a session of its own, whose processes can be told from others'.
  const CommandResult result = RunShell(
      "setsid lyra publish --jobs 3 --size 1500x1000 --model " + std::string(kModel) + " -o " +
      folder_ + " samples/as1.clash.xml & for i in {1..3000}; do ls " + folder_ +
      "/pictures/*.jpg >/dev/null 2>&1 && break; sleep 0.01; done; pkill -STOP -P $!;"
      " for i in {1..300}; do [ $(ps -s $! -o stat= | grep -c T) = 3 ] && echo stopped && break;"
      " sleep 0.01; done; kill -9 $!; wait $!; sleep 0.2;"
      " ps -s $! -o stat= | grep -vc Z; pkill -KILL -s $!");
  EXPECT_EQ(result.out, "stopped\n0\n");
}

TEST_F(PublishedPictures, AKilledRunsPicturesAreNotMixedWithThoseOfTheNext) {
  RunEndedBy("KILL");
  const std::vector<std::string> words = {
      "publish", "samples/as1.clash.xml", "--model", kModel, "--size", "90x60", "-o"};
  std::vector<std::string> here = words, elsewhere = words;
  here.push_back(folder_);
  elsewhere.push_back(directory_.Path("whole"));
  EXPECT_EQ(RunCommand(here).error, "");
  ASSERT_EQ(RunCommand(elsewhere).code, 0);
  EXPECT_EQ(RunShell("diff -r " + directory_.Path("whole") + " " + folder_).out, "");
}

// Folders that others use

TEST_F(PublishedPictures, FolderThatAnotherPublishesIntoIsRefused) {
  ASSERT_EQ(Run(NutAndRod("", "")).code, 0);
  const std::string before = RunShell("cd " + folder_ + " && find . -type f | xargs md5sum").out;
  fs::create_directory(folder_ + "/.lyra-unfinished");
  const CommandResult result =
      RunShell("flock " + folder_ + "/.lyra-unfinished/lock lyra publish -o " + folder_ +
               " samples/as1.clash.xml");
  EXPECT_EQ(result.code, 1);
  EXPECT_EQ(result.error, "lyra: " + folder_ + ": another lyra publishes into this folder\n");
  fs::remove_all(folder_ + "/.lyra-unfinished");
  EXPECT_EQ(RunShell("cd " + folder_ + " && find . -type f | xargs md5sum").out, before);
}

TEST_F(PublishedPictures, OfTwoAtOnceOnePublishes) {
  const std::string publish = "lyra publish --jobs 2 --size 200x134 --model " +
                              std::string(kModel) + " -o " + folder_ + " samples/as1.clash.xml";
  const CommandResult result =
      RunShell("setsid " + publish + " & for i in {1..3000}; do ls " + folder_ +
               "/pictures/*.jpg >/dev/null 2>&1 && break; sleep 0.01; done; pkill -STOP -s $!; " +
               publish + "; echo $?; pkill -CONT -s $!; wait $!; echo $?");
  EXPECT_EQ(result.out, "1\n" + folder_ + "/index.html: 32 interferences, 32 with a picture\n0\n");
  EXPECT_EQ(result.error, "lyra: " + folder_ + ": another lyra publishes into this folder\n");
}

TEST_F(PublishedPictures, PictureOfAnotherIsNeverReplaced) {
  fs::create_directories(folder_ + "/pictures");
  const std::string picture = directory_.Write("out/pictures/interference_1.jpg", "another's");
  for (const std::vector<std::string>& more :
       {std::vector<std::string>(), std::vector<std::string>{"--resume"}}) {
    const CommandResult result = Run(NutAndRod("", ""), more);
    EXPECT_EQ(result.code, 1);
    EXPECT_THAT(result.error, HasSubstr("lyra: " + picture + ": is in the way of a picture"));
    EXPECT_EQ(ReadFile(picture), "another's");
    EXPECT_FALSE(fs::exists(folder_ + "/index.html"));
    EXPECT_FALSE(fs::exists(Picture(".lyra-publish")));
  }
}

TEST_F(PublishedPictures, PicturesOfOthersStay) {
  fs::create_directories(folder_ + "/pictures");
  directory_.Write("out/pictures/interference_2.jpg", "another's");
  directory_.Write("out/pictures/interference_1.png", "another's");
  ASSERT_EQ(Run(NutAndRod("", "")).code, 0);
  ASSERT_EQ(Run(NutAndRod("", "")).code, 0);
  EXPECT_EQ(BytesOf("interference_2.jpg"), "another's");
  EXPECT_EQ(BytesOf("interference_1.png"), "another's");
}

TEST_F(PublishedPictures, OwnPicturesThatAreNotDrawnAnyMoreGo) {
  ASSERT_EQ(RunCommand({"publish", "samples/as1.clash.xml", "--model", kModel, "--size", "90x60",
                        "-o", folder_})
                .code,
            0);
  ASSERT_EQ(Run(NutAndRod("", "")).code, 0);
  EXPECT_TRUE(fs::exists(Picture("interference_1.jpg")));
  EXPECT_FALSE(fs::exists(Picture("interference_32.jpg")));
}

// Former versions drew without a list; what they drew was theirs.
TEST_F(PublishedPictures, StampWithoutAListStandsForThePicturesThatAreDrawn) {
  ASSERT_EQ(Run(NutAndRod("", "")).code, 0);
  const std::string stamp = BytesOf(".lyra-publish");
  directory_.Write("out/pictures/.lyra-publish", stamp.substr(0, stamp.find("drawn")));
  directory_.Write("out/pictures/interference_1.jpg", "former");
  directory_.Write("out/pictures/interference_9.jpg", "another's");
  ASSERT_EQ(Run(NutAndRod("", ""), {"--resume"}).code, 0);
  EXPECT_EQ(BytesOf("interference_1.jpg"), "former");
  directory_.Write("out/pictures/.lyra-publish", "result of before\n");
  ASSERT_EQ(Run(NutAndRod("", "")).code, 0);
  EXPECT_NE(BytesOf("interference_1.jpg"), "former");
  EXPECT_EQ(BytesOf("interference_9.jpg"), "another's");
  EXPECT_EQ(BytesOf(".lyra-publish"), stamp);
}

TEST_F(PublishedPictures, ListOfAStampLeadsNowhereElse) {
  ASSERT_EQ(Run(NutAndRod("", "")).code, 0);
  directory_.Write("out/kept.jpg", "kept");
  const std::string stamp = BytesOf(".lyra-publish");
  directory_.Write("out/pictures/.lyra-publish", "else " + stamp + "\n../kept.jpg");
  ASSERT_EQ(Run(NutAndRod("", "")).code, 0);
  EXPECT_EQ(ReadFile(folder_ + "/kept.jpg"), "kept");
}
