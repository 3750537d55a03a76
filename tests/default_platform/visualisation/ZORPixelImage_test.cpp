#include "platform/visualisation/ZORPixelImage.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <jpeglib.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <string>

#include "platform/system/ZORFile.h"
#include "support/PngPicture.h"

namespace fs = std::filesystem;

namespace {

/// A folder of its own for each test.
class ZORPixelImageFiles : public testing::Test {
 protected:
  ZORPixelImageFiles()
      : folder_(fs::path(testing::TempDir()) /
                testing::UnitTest::GetInstance()->current_test_info()->name()) {
    fs::remove_all(folder_);
    fs::create_directories(folder_);
  }
  ~ZORPixelImageFiles() override { fs::remove_all(folder_); }

  std::string PathOf(const std::string& inName) const { return (folder_ / inName).string(); }
  std::vector<std::string> Files() const {
    std::vector<std::string> names;
    for (const auto& entry : fs::directory_iterator(folder_))
      names.push_back(entry.path().filename().string());
    return names;
  }
  void WriteText(const std::string& inName, const std::string& inText) const {
    std::ofstream(PathOf(inName)) << inText;
  }
  std::string Read(const std::string& inName) const {
    std::ifstream file(PathOf(inName), std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(file), {});
  }

  fs::path folder_;
};

constexpr int kWidth = 16, kHeight = 9;

std::vector<std::uint8_t> SomePixels() {
  std::vector<std::uint8_t> pixels;
  for (int y = 0; y < kHeight; ++y)
    for (int x = 0; x < kWidth; ++x)
      for (const int component : {x * 15, y * 25, 128 + x})
        pixels.push_back(static_cast<std::uint8_t>(component));
  return pixels;
}

std::vector<std::uint8_t> DecodedJpeg(const std::string& inPath) {
  jpeg_decompress_struct state;
  jpeg_error_mgr errors;
  state.err = jpeg_std_error(&errors);
  jpeg_create_decompress(&state);
  std::FILE* const file = std::fopen(inPath.c_str(), "rb");
  jpeg_stdio_src(&state, file);
  jpeg_read_header(&state, TRUE);
  jpeg_start_decompress(&state);
  std::vector<std::uint8_t> pixels(std::size_t{3} * state.output_width * state.output_height);
  while (state.output_scanline < state.output_height) {
    JSAMPROW row = pixels.data() + std::size_t{3} * state.output_width * state.output_scanline;
    jpeg_read_scanlines(&state, &row, 1);
  }
  jpeg_finish_decompress(&state);
  jpeg_destroy_decompress(&state);
  std::fclose(file);
  return pixels;
}

ZORPixelImage Sample() { return ZORPixelImage(kWidth, kHeight, SomePixels()); }

TEST_F(ZORPixelImageFiles, PngHoldsTheVeryPixels) {
  const ZORPixelImage image(kWidth, kHeight, SomePixels());
  EXPECT_EQ(image.Write("PNG", PathOf("a.png").c_str()), S_OK);
  EXPECT_EQ(support::ReadPng(PathOf("a.png")).pixels, SomePixels());
}

TEST_F(ZORPixelImageFiles, JpegHoldsNearlyThePixels) {
  const ZORPixelImage image(kWidth, kHeight, SomePixels());
  EXPECT_EQ(image.Write("JPEG", PathOf("a.jpg").c_str()), S_OK);
  const auto decoded = DecodedJpeg(PathOf("a.jpg"));
  const auto pixels = SomePixels();
  ASSERT_EQ(decoded.size(), pixels.size());
  for (std::size_t i = 0; i < pixels.size(); ++i) EXPECT_NEAR(decoded[i], pixels[i], 14) << i;
}

TEST_F(ZORPixelImageFiles, FormatDecidesNotTheEndingOfThePath) {
  const ZORPixelImage image(kWidth, kHeight, SomePixels());
  EXPECT_EQ(image.Write("jpeg", PathOf("a.png").c_str()), S_OK);
  EXPECT_EQ(Read("a.png").substr(0, 2), "\xFF\xD8");
  EXPECT_EQ(image.Write("Png", PathOf("b").c_str()), S_OK);
  EXPECT_EQ(Read("b").substr(1, 3), "PNG");
}

TEST_F(ZORPixelImageFiles, UnknownFormatIsRefusedAndLeavesNoFile) {
  const ZORPixelImage image(kWidth, kHeight, SomePixels());
  for (const char* const format : {"", "JPG", "BMP", "JPEG ", "PNGX", "TIFF"})
    EXPECT_EQ(image.Write(format, PathOf("a.jpg").c_str()), E_INVALIDARG) << format;
  EXPECT_TRUE(Files().empty());
}

TEST_F(ZORPixelImageFiles, UnknownFormatLeavesTheOldFile) {
  WriteText("a.jpg", "old");
  const ZORPixelImage image(kWidth, kHeight, SomePixels());
  EXPECT_EQ(image.Write("BMP", PathOf("a.jpg").c_str()), E_INVALIDARG);
  EXPECT_EQ(Read("a.jpg"), "old");
}

TEST_F(ZORPixelImageFiles, OldFileIsReplacedAndNothingElseIsLeft) {
  WriteText("a.png", "old");
  const ZORPixelImage image(kWidth, kHeight, SomePixels());
  EXPECT_EQ(image.Write("PNG", PathOf("a.png").c_str()), S_OK);
  EXPECT_EQ(support::ReadPng(PathOf("a.png")).pixels, SomePixels());
  EXPECT_THAT(Files(), testing::ElementsAre("a.png"));
}

TEST_F(ZORPixelImageFiles, MissingFolderIsReported) {
  const ZORPixelImage image(kWidth, kHeight, SomePixels());
  EXPECT_EQ(image.Write("PNG", PathOf("missing/a.png").c_str()), kZORFileNotFound);
  EXPECT_TRUE(Files().empty());
}

TEST_F(ZORPixelImageFiles, FolderInItsPlaceIsReported) {
  fs::create_directory(PathOf("a.png"));
  const ZORPixelImage image(kWidth, kHeight, SomePixels());
  EXPECT_EQ(image.Write("PNG", PathOf("a.png").c_str()), kZORFileIsDirectory);
  EXPECT_THAT(Files(), testing::ElementsAre("a.png"));
}

TEST_F(ZORPixelImageFiles, LinkStaysAndItsTargetIsReplaced) {
  WriteText("target.png", "old");
  fs::create_symlink("target.png", PathOf("link.png"));
  const ZORPixelImage image(kWidth, kHeight, SomePixels());
  EXPECT_EQ(image.Write("PNG", PathOf("link.png").c_str()), S_OK);
  EXPECT_TRUE(fs::is_symlink(PathOf("link.png")));
  EXPECT_EQ(support::ReadPng(PathOf("target.png")).pixels, SomePixels());
}

TEST_F(ZORPixelImageFiles, DanglingLinkStaysAndLeadsToThePicture) {
  fs::create_symlink("real.png", PathOf("link.png"));
  EXPECT_EQ(Sample().Write("PNG", PathOf("link.png").c_str()), S_OK);
  EXPECT_TRUE(fs::is_symlink(PathOf("link.png")));
  EXPECT_EQ(support::ReadPng(PathOf("real.png")).pixels, SomePixels());
}

TEST_F(ZORPixelImageFiles, LinkInACircleIsRefusedAndStays) {
  fs::create_symlink("one.png", PathOf("one.png"));
  EXPECT_EQ(Sample().Write("PNG", PathOf("one.png").c_str()), kZORFileBadPath);
  EXPECT_TRUE(fs::is_symlink(PathOf("one.png")));
}

TEST_F(ZORPixelImageFiles, OldFileKeepsItsPermissions) {
  WriteText("a.png", "old");
  fs::permissions(PathOf("a.png"), fs::perms(0640));
  EXPECT_EQ(Sample().Write("PNG", PathOf("a.png").c_str()), S_OK);
  EXPECT_EQ(fs::status(PathOf("a.png")).permissions(), fs::perms(0640));
}

// Also for root, who may put a file in a device's place.
TEST_F(ZORPixelImageFiles, DeviceStaysADevice) {
  constexpr dev_t kNull = 0x103;  // what /dev/null is
  if (mknod(PathOf("null").c_str(), S_IFCHR | 0666, kNull) != 0)
    GTEST_SKIP() << "no devices may be made here";
  EXPECT_EQ(Sample().Write("PNG", PathOf("null").c_str()), S_OK);
  EXPECT_TRUE(fs::is_character_file(PathOf("null")));
  EXPECT_EQ(Files(), std::vector<std::string>{"null"});
  EXPECT_EQ(Sample().Write("PNG", "/dev/full"), kZORFileDiskFull);
}

TEST_F(ZORPixelImageFiles, NamesInAnyLanguageAreWritten) {
  const ZORPixelImage image(kWidth, kHeight, SomePixels());
  EXPECT_EQ(image.Write("PNG", PathOf("Bild \xC3\xA9\xE6\x97\xA5.png").c_str()), S_OK);
  EXPECT_THAT(Files(), testing::ElementsAre("Bild \xC3\xA9\xE6\x97\xA5.png"));
}

TEST_F(ZORPixelImageFiles, FoldersInAnyLanguageAreFound) {
  fs::create_directory(PathOf("\xC3\xA9\xE6\x97\xA5"));
  const ZORPixelImage image(kWidth, kHeight, SomePixels());
  EXPECT_EQ(image.Write("PNG", PathOf("\xC3\xA9\xE6\x97\xA5/a.png").c_str()), S_OK);
  EXPECT_EQ(support::ReadPng(PathOf("\xC3\xA9\xE6\x97\xA5/a.png")).pixels, SomePixels());
}

TEST_F(ZORPixelImageFiles, NameThatIsNoTextIsKept) {
  const ZORPixelImage image(kWidth, kHeight, SomePixels());
  EXPECT_EQ(image.Write("PNG", PathOf("\xFF\xFE.png").c_str()), S_OK);
  EXPECT_THAT(Files(), testing::ElementsAre("\xFF\xFE.png"));
}

TEST(ZORPixelImage, EmptyPathIsRefused) {
  const ZORPixelImage image(kWidth, kHeight, SomePixels());
  EXPECT_TRUE(FAILED(image.Write("PNG", "")));
}

TEST_F(ZORPixelImageFiles, TooFewPixelsAreRefused) {
  const ZORPixelImage image(kWidth, kHeight, {1, 2, 3});
  EXPECT_TRUE(FAILED(image.Write("PNG", PathOf("a.png").c_str())));
  EXPECT_TRUE(Files().empty());
}

TEST(ZORPixelImage, PrepareTakesTrueColourAlone) {
  ZORPixelImage image(1, 1, {1, 2, 3});
  EXPECT_EQ(image.Prepare(2), S_OK);
  EXPECT_EQ(image.Prepare(0), E_INVALIDARG);
  EXPECT_EQ(image.Prepare(3), E_INVALIDARG);
  EXPECT_EQ(image.GetWidth(), 1);
  EXPECT_EQ(image.GetPixels(), (std::vector<std::uint8_t>{1, 2, 3}));
}

}  // namespace
