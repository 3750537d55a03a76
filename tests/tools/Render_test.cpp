// Pictures of CAD models from a shell.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <array>
#include <filesystem>
#include <vector>

#include "support/PngPicture.h"
#include "tools/Command.h"

using support::Picture;
using support::ReadPng;
using testing::HasSubstr;
using testing::MatchesRegex;

namespace fs = std::filesystem;

namespace {

const std::string kModel = "samples/as1-oc-214.stp";

bool IsWhite(const Picture& inPicture, int inColumn, int inRow) {
  return inPicture.At(inColumn, inRow) == std::array<int, 3>{255, 255, 255};
}

/// The part of a picture that is not white.
struct Extent {
  int left = 1 << 20, right = -1, top = 1 << 20, bottom = -1;
  int topColumn = 0;  // of the leftmost pixel of the top row
  int Width() const { return right - left + 1; }
  int Height() const { return bottom - top + 1; }
};

Extent ExtentOf(const Picture& inPicture) {
  Extent extent;
  for (int row = 0; row < inPicture.height; ++row) {
    for (int column = 0; column < inPicture.width; ++column) {
      if (IsWhite(inPicture, column, row)) continue;
      if (extent.bottom < 0) extent.topColumn = column;
      extent.left = std::min(extent.left, column);
      extent.right = std::max(extent.right, column);
      extent.top = std::min(extent.top, row);
      extent.bottom = row;
    }
  }
  return extent;
}

std::string ObjBox(int inFirst, double x0, double x1, double y0, double y1, double z0, double z1) {
  std::string text;
  for (double z : {z0, z1})
    for (double y : {y0, y1})
      for (double x : {x0, x1})
        text += "v " + std::to_string(x) + " " + std::to_string(y) + " " + std::to_string(z) + "\n";
  for (const char* corners : {"0132", "4576", "0154", "2376", "0264", "1375"}) {
    text += "f";
    for (const char* corner = corners; *corner; ++corner)
      text += " " + std::to_string(inFirst + *corner - '0');
    text += "\n";
  }
  return text;
}

/// A plate of 40 by 20 by 10 with a tower of 20 at its corner of most x and least y.
std::string PlateWithTower() {
  return "o plate\n" + ObjBox(1, 0, 40, 0, 20, 0, 10) + ObjBox(9, 30, 40, 0, 5, 10, 30);
}

class Render : public testing::Test {
 protected:
  Render() { setenv("XDG_CACHE_HOME", Cache().Path("").c_str(), 1); }
  /// One cache of models for the whole program.
  static const TemporaryDirectory& Cache() {
    static const TemporaryDirectory cache;
    return cache;
  }
  CommandResult RenderTo(const std::string& inName, std::vector<std::string> inMore = {}) {
    std::vector<std::string> arguments = {"render", kModel, "-o", directory.Path(inName)};
    arguments.insert(arguments.end(), inMore.begin(), inMore.end());
    return RunCommand(arguments);
  }
  std::string BytesOf(const std::string& inName, std::vector<std::string> inMore = {}) {
    const CommandResult result = RenderTo(inName, std::move(inMore));
    EXPECT_EQ(result.code, 0);
    EXPECT_EQ(result.out + result.error, "");
    return ReadFile(directory.Path(inName));
  }
  void ExpectWrongUsage(const std::string& inName, const std::vector<std::string>& inMore,
                        const std::string& inReason) {
    const CommandResult result = RenderTo(inName, inMore);
    EXPECT_EQ(result.code, 2);
    EXPECT_THAT(result.error, HasSubstr("lyra: " + inReason));
    EXPECT_EQ(FileCount(), 0);
  }
  void ExpectRefused(const std::string& inName, const std::vector<std::string>& inMore,
                     const std::string& inReason) {
    const CommandResult result = RenderTo(inName, inMore);
    EXPECT_EQ(result.code, 1);
    EXPECT_EQ(result.error, "lyra: " + inReason + "\n");
  }
  /// Of all names, hidden ones too.
  long FileCount() const {
    const fs::directory_iterator files(directory.Path(""));
    return std::distance(begin(files), end(files));
  }
  /// What the plate with its tower fills of a picture.
  Extent TowerSeen(const char* inView) {
    const std::string model = directory.Write("tower.obj", PlateWithTower());
    const std::string picture = directory.Path("tower.png");
    const CommandResult result =
        RunCommand({"render", model, "-o", picture, "--view", inView, "--size", "400x400"});
    EXPECT_EQ(result.code, 0) << result.error;
    return ExtentOf(ReadPng(picture));
  }

  const TemporaryDirectory directory;
};

TEST_F(Render, JpegNameGetsAJpegInTheSizeOfReports) {
  const std::string bytes = BytesOf("a.jpg");
  EXPECT_EQ(bytes.substr(0, 3), "\xFF\xD8\xFF");
  EXPECT_EQ(bytes, BytesOf("b.jpeg", {"--size", "756x506"}));
  EXPECT_EQ(FileCount(), 2);
}

TEST_F(Render, PngNameGetsARealPng) {
  EXPECT_EQ(BytesOf("a.png").substr(0, 8), "\x89PNG\r\n\x1A\n");
  const Picture picture = ReadPng(directory.Path("a.png"));
  EXPECT_EQ(picture.width, 756);
  EXPECT_EQ(picture.height, 506);
}

TEST_F(Render, EndingInCapitalsCounts) {
  EXPECT_EQ(BytesOf("A.PNG").substr(1, 3), "PNG");
  EXPECT_EQ(BytesOf("A.JPG").substr(0, 2), "\xFF\xD8");
}

TEST_F(Render, SizeIsThatOfThePicture) {
  BytesOf("a.png", {"--size", "1x16"});
  const Picture picture = ReadPng(directory.Path("a.png"));
  EXPECT_EQ(picture.width, 1);
  EXPECT_EQ(picture.height, 16);
}

TEST_F(Render, BackgroundIsWhiteUnlessItIsKept) {
  BytesOf("white.png", {"--size", "60x40"});
  BytesOf("kept.png", {"--size", "60x40", "--keep-background"});
  EXPECT_TRUE(IsWhite(ReadPng(directory.Path("white.png")), 0, 0));
  EXPECT_FALSE(IsWhite(ReadPng(directory.Path("kept.png")), 0, 0));
  EXPECT_NE(BytesOf("white.jpg"), BytesOf("kept.jpg", {"--keep-background"}));
}

TEST_F(Render, WholeModelIsFramed) {
  BytesOf("a.png");
  const Extent extent = ExtentOf(ReadPng(directory.Path("a.png")));
  EXPECT_GT(extent.left, 0);
  EXPECT_LT(extent.right, 755);
  EXPECT_GT(extent.top, 0);
  EXPECT_LT(extent.bottom, 505);
  EXPECT_GT(extent.Height(), 506 / 2);
}

TEST_F(Render, IsoIsTheViewWithoutAsking) {
  EXPECT_EQ(BytesOf("a.jpg"), BytesOf("b.jpg", {"--view", "iso"}));
}

TEST_F(Render, ViewAndSizeTogetherMakeAJpegToo) {
  EXPECT_EQ(BytesOf("a.jpg", {"--view", "top", "--size", "30x20"}).substr(0, 2), "\xFF\xD8");
}

// The tower stands at most x and least y.
TEST_F(Render, FrontIsXByZWithXToTheRight) {
  const Extent extent = TowerSeen("front");
  EXPECT_NEAR(extent.Width() / double(extent.Height()), 40.0 / 30, 0.04);
  EXPECT_GT(extent.topColumn, (extent.left + extent.right) / 2);
}

TEST_F(Render, BackIsXByZWithXToTheLeft) {
  const Extent extent = TowerSeen("back");
  EXPECT_NEAR(extent.Width() / double(extent.Height()), 40.0 / 30, 0.04);
  EXPECT_NEAR(extent.topColumn, extent.left, 2);
}

TEST_F(Render, RightIsYByZWithYToTheRight) {
  const Extent extent = TowerSeen("right");
  EXPECT_NEAR(extent.Width() / double(extent.Height()), 20.0 / 30, 0.03);
  EXPECT_NEAR(extent.topColumn, extent.left, 2);
}

TEST_F(Render, LeftIsYByZWithYToTheLeft) {
  const Extent extent = TowerSeen("left");
  EXPECT_NEAR(extent.Width() / double(extent.Height()), 20.0 / 30, 0.03);
  EXPECT_GT(extent.topColumn, (extent.left + extent.right) / 2);
}

TEST_F(Render, TopAndBottomAreXByY) {
  const Extent top = TowerSeen("top"), bottom = TowerSeen("bottom");
  EXPECT_NEAR(top.Width() / double(top.Height()), 2, 0.06);
  EXPECT_NEAR(bottom.Width() / double(bottom.Height()), 2, 0.06);
}

TEST_F(Render, ProductByItsPathIsShownAlone) {
  BytesOf("all.png");
  const std::string plate = BytesOf("a.png", {"--product", "plate_1"});
  EXPECT_NE(plate, ReadFile(directory.Path("all.png")));
  const Extent extent = ExtentOf(ReadPng(directory.Path("a.png")));
  EXPECT_LT(extent.Height(), ExtentOf(ReadPng(directory.Path("all.png"))).Height());
  const std::string bolt = BytesOf(
      "b.png", {"--product", "l-bracket-assembly_1 --++-- nut-bolt-assembly_2 --++-- bolt_1"});
  EXPECT_NE(bolt, plate);
}

TEST_F(Render, AliasThatOneProductHasIsEnough) {
  EXPECT_EQ(BytesOf("a.png", {"--product", "rod_1"}),
            BytesOf("b.png", {"--product", "rod-assembly_1 --++-- rod_1"}));
}

TEST_F(Render, AliasOfTheRootIsTheWholeModel) {
  EXPECT_EQ(BytesOf("a.png", {"--product", "as1"}), BytesOf("b.png"));
}

TEST_F(Render, AliasOfSeveralProductsIsRefusedWithAPath) {
  ExpectRefused("a.png", {"--product", "bolt_1"},
                kModel +
                    ": 6 products are called \"bolt_1\", such as \"l-bracket-assembly_1 --++-- "
                    "nut-bolt-assembly_1 --++-- bolt_1\"");
  EXPECT_EQ(FileCount(), 0);
}

TEST_F(Render, UnknownProductIsRefused) {
  ExpectRefused("a.png", {"--product", "Plate_1"}, kModel + ": there is no product \"Plate_1\"");
}

TEST_F(Render, SeveralProductsAreShownTogether) {
  const std::string plate = BytesOf("a.png", {"--product", "plate_1"});
  const std::string rod = BytesOf("a.png", {"--product", "rod_1"});
  const std::string both = BytesOf("a.png", {"--product", "rod_1", "--product", "plate_1"});
  EXPECT_NE(both, plate);
  EXPECT_NE(both, rod);
}

TEST_F(Render, ProductGivenTwiceIsShownOnce) {
  EXPECT_EQ(BytesOf("a.png", {"--product", "rod_1", "--product", "rod_1"}),
            BytesOf("b.png", {"--product", "rod_1"}));
}

TEST_F(Render, NameWithAnotherEndingIsWrongUsage) {
  for (const char* name : {"a.gif", "png", "a.jpg.txt"})
    ExpectWrongUsage(name, {}, "--output: the name of a picture ends in .jpg, .jpeg or .png, not ");
}

TEST_F(Render, SizeThatIsNoneIsWrongUsage) {
  for (const char* size : {"756", "x", "756x", "x506", "0x10", "10x0", "-1x5", "16385x1", "1x16385",
                           "10X10", "10x10x10", " 1x1", "1e2x5"})
    ExpectWrongUsage("a.png", {std::string("--size=") + size}, "--size: a size is such as 756x506");
}

TEST_F(Render, UnknownViewIsWrongUsage) {
  ExpectWrongUsage("a.png", {"--view", "Top"},
                   "--view: unknown word \"Top\"; known are iso, front, back, left, right, top, "
                   "bottom");
}

TEST_F(Render, WithoutAPictureToWriteItIsWrongUsage) {
  EXPECT_EQ(RunCommand({"render", kModel}).code, 2);
}

TEST_F(Render, MissingDirectoryIsRefused) {
  ExpectRefused("no/a.png", {}, directory.Path("no/a.png") + ": No such file or directory");
}

TEST_F(Render, DirectoryInTheWayIsRefused) {
  fs::create_directory(directory.Path("a.png"));
  ExpectRefused("a.png", {}, directory.Path("a.png") + ": Is a directory");
}

TEST_F(Render, FailureLeavesTheOldPictureWhole) {
  directory.Write("a.png", "old");
  RenderTo("a.png", {"--product", "nothing of this name"});
  EXPECT_EQ(ReadFile(directory.Path("a.png")), "old");
  EXPECT_EQ(FileCount(), 1);
}

TEST_F(Render, OldPictureIsReplaced) {
  directory.Write("a.jpg", "old");
  EXPECT_EQ(BytesOf("a.jpg").substr(0, 2), "\xFF\xD8");
  EXPECT_EQ(FileCount(), 1);
}

TEST_F(Render, OldPictureKeepsItsPermissions) {
  directory.Write("a.png", "old");
  constexpr fs::perms kOwnerOnly = fs::perms::owner_read | fs::perms::owner_write;
  fs::permissions(directory.Path("a.png"), kOwnerOnly);
  BytesOf("a.png", {"--size", "9x9"});
  EXPECT_EQ(fs::status(directory.Path("a.png")).permissions(), kOwnerOnly);
}

TEST_F(Render, LinkIsFollowed) {
  fs::create_symlink("target.png", directory.Path("link.png"));
  directory.Write("target.png", "old");
  BytesOf("link.png", {"--size", "9x9"});
  EXPECT_TRUE(fs::is_symlink(directory.Path("link.png")));
  EXPECT_EQ(ReadFile(directory.Path("target.png")).substr(1, 3), "PNG");
}

TEST_F(Render, MissingModelIsRefusedAndNothingWritten) {
  const CommandResult result = RunCommand({"render", "no/such.stp", "-o", directory.Path("a.png")});
  EXPECT_EQ(result.code, 1);
  EXPECT_EQ(result.error, "lyra: no/such.stp: does not exist\n");
  EXPECT_EQ(FileCount(), 0);
}

TEST_F(Render, WithoutTheDrawingLibraryNothingIsWritten) {
  const std::string line =
      "mkdir " + directory.Path("lib") +
      " && cp -P \"$(dirname \"$(command -v lyra)\")\"/../lib/lib*.so* " + directory.Path("lib") +
      " && cp -rP \"$(dirname \"$(command -v lyra)\")\"/../lib/ZORLyra " + directory.Path("lib") +
      " && rm " + directory.Path("lib/libZORRayCaster.so") +
      " && LD_LIBRARY_PATH=" + directory.Path("lib") + " lyra render " + kModel + " -o ";
  for (const char* name : {"a.png", "a.jpg"}) {
    const CommandResult result = RunShell(line + directory.Path(name));
    EXPECT_EQ(result.code, 1) << result.error;
    EXPECT_EQ(result.error,
              "lyra: " + directory.Path(name) + ": the picture cannot be drawn or written\n");
    EXPECT_FALSE(fs::exists(directory.Path(name)));
    fs::remove_all(directory.Path("lib"));
  }
}

}  // namespace
