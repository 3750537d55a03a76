// Pictures of representations as they are drawn and written for real.
#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <memory>
#include <sstream>
#include <string>
#include <vector>

#include "ZORLyraXMLServices.h"
#include "default_platform/system/ObjectCounters.h"
#include "default_platform/visualisation/SceneGraph.h"
#include "platform/visualisation/ZOR3DViewpoint.h"
// After <cstdio>, which it needs.
#include <jpeglib.h>

namespace fs = std::filesystem;

namespace {

struct Picture {
  int width = 0, height = 0;
  std::vector<unsigned char> pixels;
  const unsigned char* At(int inColumn, int inRow) const {
    return &pixels[3 * static_cast<std::size_t>(inRow * width + inColumn)];
  }
  bool IsAllWhite() const {
    for (unsigned char byte : pixels)
      if (byte < 250) return false;
    return true;
  }
};

/// Decodes a JPEG file; the decoder ends the program on what is none.
Picture ReadJpeg(const std::string& inPath) {
  Picture picture;
  std::FILE* const file = std::fopen(inPath.c_str(), "rb");
  if (!file) return picture;
  jpeg_decompress_struct decoder;
  jpeg_error_mgr errors;
  decoder.err = jpeg_std_error(&errors);
  jpeg_create_decompress(&decoder);
  jpeg_stdio_src(&decoder, file);
  jpeg_read_header(&decoder, 1);
  decoder.out_color_space = JCS_RGB;
  jpeg_start_decompress(&decoder);
  picture.width = static_cast<int>(decoder.output_width);
  picture.height = static_cast<int>(decoder.output_height);
  picture.pixels.resize(std::size_t{3} * decoder.output_width * decoder.output_height);
  while (decoder.output_scanline < decoder.output_height) {
    JSAMPROW row = &picture.pixels[std::size_t{3} * decoder.output_width * decoder.output_scanline];
    jpeg_read_scanlines(&decoder, &row, 1);
  }
  jpeg_finish_decompress(&decoder);
  jpeg_destroy_decompress(&decoder);
  std::fclose(file);
  return picture;
}

std::string Bytes(const std::string& inPath) {
  std::ostringstream bytes;
  bytes << std::ifstream(inPath, std::ios::binary).rdbuf();
  return bytes.str();
}

/// A triangle of some 17 mm that the default viewpoint looks at from the front.
std::shared_ptr<const PartMesh> Triangle() {
  const auto mesh = std::make_shared<PartMesh>();
  mesh->points = {{10, 0, 0}, {0, 10, 0}, {0, 0, 10}};
  mesh->normals = {{0.57735F, 0.57735F, 0.57735F},
                   {0.57735F, 0.57735F, 0.57735F},
                   {0.57735F, 0.57735F, 0.57735F}};
  mesh->triangles = {{0, 1, 2}};
  mesh->sphere = ZOR3DBoundingSphere(ZORMathVector(3.3, 3.3, 3.3), 9);
  return mesh;
}

/// What of each class of drawing objects is not released yet.
long Unreleased() {
  long count = 0;
  for (const char* name : {"ZORPrint3DRepImage", "ZORPixelImage", "ZOR3DViewpoint"}) {
    const ZORDefault::ObjectCounts counts = ZORDefault::CountsOf(name);
    count += counts.built - counts.released;
  }
  return count;
}

class RepPictures : public testing::Test {
 protected:
  RepPictures() {
    directory = fs::temp_directory_path() / ("rep_pictures_" + std::to_string(getpid()));
    fs::create_directories(directory);
  }
  ~RepPictures() override {
    rep->Destroy();
    viewpoint->Release();
    EXPECT_EQ(0, Unreleased());
    fs::remove_all(directory);
  }
  std::string Path(const char* inName) const { return (directory / inName).string(); }

  const PartColour red{255, 0, 0, 255};
  fs::path directory;
  ZOR3DRep* rep = new PlacedMeshRep(Triangle(), ZORMathTransformation(), &red);
  ZOR3DViewpoint* viewpoint = new ZOR3DViewpoint;
};

TEST_F(RepPictures, FramedIsAJpegInTheSizeOfReports) {
  ZORLyraXMLServices::TakeRepImage(rep, Path("a.jpg").c_str(), 0);
  const Picture picture = ReadJpeg(Path("a.jpg"));
  EXPECT_EQ(756, picture.width);
  EXPECT_EQ(506, picture.height);
  EXPECT_FALSE(picture.IsAllWhite());
}

TEST_F(RepPictures, SizedIsAJpegInTheSizeGiven) {
  ZORLyraXMLServices::TakeRepImage(rep, Path("a.jpg").c_str(), 40, 30, 1, 0);
  const Picture picture = ReadJpeg(Path("a.jpg"));
  EXPECT_EQ(40, picture.width);
  EXPECT_EQ(30, picture.height);
  EXPECT_FALSE(picture.IsAllWhite());
}

TEST_F(RepPictures, SizedInTheSizeOfReportsIsTheSamePictureAsFramed) {
  ZORLyraXMLServices::TakeRepImage(rep, Path("a.jpg").c_str(), 1);
  ZORLyraXMLServices::TakeRepImage(rep, Path("b.jpg").c_str(), 756, 506, 1, 1);
  ASSERT_NE("", Bytes(Path("a.jpg")));
  EXPECT_EQ(Bytes(Path("a.jpg")), Bytes(Path("b.jpg")));
}

TEST_F(RepPictures, ThroughAFramingViewpointIsTheSamePictureAsFramed) {
  viewpoint->Reframe(756, 506, 1, 1, rep->GetShowBoundingElement());
  ZORLyraXMLServices::TakeRepImage(rep, Path("a.jpg").c_str(), 0);
  ZORLyraXMLServices::TakeRepImage(rep, Path("b.jpg").c_str(), viewpoint, 0);
  ASSERT_NE("", Bytes(Path("a.jpg")));
  EXPECT_EQ(Bytes(Path("a.jpg")), Bytes(Path("b.jpg")));
}

TEST_F(RepPictures, ThroughAViewpointThatLooksAwayShowsNothing) {
  viewpoint->Reframe(756, 506, 1, 1, rep->GetShowBoundingElement());
  viewpoint->sight = ZORMathVector(1, 1, 1);
  ZORLyraXMLServices::TakeRepImage(rep, Path("a.jpg").c_str(), viewpoint, 0);
  const Picture picture = ReadJpeg(Path("a.jpg"));
  EXPECT_EQ(756, picture.width);
  EXPECT_EQ(506, picture.height);
  EXPECT_TRUE(picture.IsAllWhite());
}

TEST_F(RepPictures, BackgroundIsWhiteUnlessItIsKept) {
  ZORLyraXMLServices::TakeRepImage(rep, Path("white.jpg").c_str(), 40, 30, 0, 0);
  ZORLyraXMLServices::TakeRepImage(rep, Path("kept.jpg").c_str(), 40, 30, 0, 1);
  const Picture white = ReadJpeg(Path("white.jpg")), kept = ReadJpeg(Path("kept.jpg"));
  for (int component = 0; component < 3; ++component) EXPECT_GE(white.At(0, 0)[component], 250);
  EXPECT_LT(kept.At(0, 0)[0], 250);
  EXPECT_NE(kept.At(0, 0)[0], kept.At(0, 29)[0]);
}

TEST_F(RepPictures, PathWithAnotherEndingStillGetsAJpeg) {
  ZORLyraXMLServices::TakeRepImage(rep, Path("a.png").c_str(), 40, 30, 0, 0);
  EXPECT_EQ("\xFF\xD8\xFF", Bytes(Path("a.png")).substr(0, 3));
  EXPECT_FALSE(fs::exists(Path("a.png.jpg")));
  EXPECT_FALSE(fs::exists(Path("a.jpg")));
}

TEST_F(RepPictures, NullRepresentationWritesNoFile) {
  ZORLyraXMLServices::TakeRepImage(nullptr, Path("a.jpg").c_str(), 0);
  ZORLyraXMLServices::TakeRepImage(nullptr, Path("a.jpg").c_str(), 40, 30, 1, 0);
  ZORLyraXMLServices::TakeRepImage(nullptr, Path("a.jpg").c_str(), viewpoint, 0);
  EXPECT_TRUE(fs::is_empty(directory));
}

TEST_F(RepPictures, SizeThatCannotBeDrawnWritesNoFileAndReleasesAll) {
  for (int size : {0, -1, 16385}) {
    const long before = ZORDefault::CountsOf("ZORPrint3DRepImage").released;
    ZORLyraXMLServices::TakeRepImage(rep, Path("a.jpg").c_str(), size, 30, 1, 0);
    ZORLyraXMLServices::TakeRepImage(rep, Path("a.jpg").c_str(), 30, size, 1, 0);
    EXPECT_EQ(before + 2, ZORDefault::CountsOf("ZORPrint3DRepImage").released);
  }
  EXPECT_TRUE(fs::is_empty(directory));
}

TEST_F(RepPictures, FileThatCannotBeWrittenIsNotReportedAndReleasesAll) {
  ZORLyraXMLServices::TakeRepImage(rep, Path("no/such/a.jpg").c_str(), 40, 30, 1, 0);
  EXPECT_TRUE(fs::is_empty(directory));
  EXPECT_EQ(1, Unreleased());  // the test's own viewpoint
}

TEST_F(RepPictures, PictureIsDrawnTheSameEachTime) {
  ZORLyraXMLServices::TakeRepImage(rep, Path("a.jpg").c_str(), 0);
  ZORLyraXMLServices::TakeRepImage(rep, Path("b.jpg").c_str(), 0);
  ASSERT_NE("", Bytes(Path("a.jpg")));
  EXPECT_EQ(Bytes(Path("a.jpg")), Bytes(Path("b.jpg")));
}

}  // namespace
