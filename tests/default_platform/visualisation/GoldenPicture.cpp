#include "default_platform/visualisation/GoldenPicture.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>

#include "support/PngPicture.h"

namespace fs = std::filesystem;

namespace pictures {
namespace {

using support::ReadPng;

// On the processor that renewed them the pictures are the same to the byte. Another one may round
// otherwise: a pixel on a border may then fall to the other side.
constexpr int kComponentTolerance = 4;
constexpr double kDifferingShare = 0.001;

fs::path GoldenPath(const std::string& inName) {
  return fs::path(ZOR_SOURCE_DIR) / "tests/golden/pictures" / (inName + ".png");
}

void WritePng(const fs::path& inPath, const Picture& inPicture) {
  fs::create_directories(inPath.parent_path());
  const ZORPixelImage image(inPicture.width, inPicture.height, inPicture.pixels);
  ASSERT_EQ(image.Write("PNG", inPath.c_str()), S_OK);
}

/// How far each component lies from the golden one, made visible.
Picture Difference(const Picture& inActual, const Picture& inGolden) {
  Picture difference = inActual;
  for (std::size_t i = 0; i < difference.pixels.size(); ++i)
    difference.pixels[i] = static_cast<std::uint8_t>(
        std::min(255, 16 * std::abs(inActual.pixels[i] - inGolden.pixels[i])));
  return difference;
}

std::size_t CountDiffering(const Picture& inActual, const Picture& inGolden) {
  std::size_t count = 0;
  for (std::size_t i = 0; i < inActual.pixels.size(); i += 3) {
    int largest = 0;
    for (std::size_t j = i; j < i + 3; ++j)
      largest = std::max(largest, std::abs(inActual.pixels[j] - inGolden.pixels[j]));
    count += largest > kComponentTolerance ? 1 : 0;
  }
  return count;
}

}  // namespace

void CompareWithGolden(const std::string& inName, const Picture& inActual) {
  ASSERT_FALSE(inActual.pixels.empty());
  if (std::getenv("ZOR_RENEW_GOLDEN")) {
    WritePng(GoldenPath(inName), inActual);
    return;
  }
  const Picture golden = ReadPng(GoldenPath(inName));
  ASSERT_EQ(golden.width, inActual.width) << "no golden picture of this size: " << inName;
  ASSERT_EQ(golden.height, inActual.height);
  const std::size_t differing = CountDiffering(inActual, golden);
  const double allowed = kDifferingShare * inActual.width * inActual.height;
  if (static_cast<double>(differing) <= allowed) return;
  const fs::path folder = fs::path(ZOR_BINARY_DIR) / "golden-pictures";
  WritePng(folder / (inName + "-actual.png"), inActual);
  WritePng(folder / (inName + "-difference.png"), Difference(inActual, golden));
  ADD_FAILURE() << inName << ": " << differing << " pixels differ; see " << folder;
}

}  // namespace pictures
