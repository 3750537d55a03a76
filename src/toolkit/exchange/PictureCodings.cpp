// Pictures of any origin as PNG pictures that a BCF file may hold.
#include <png.h>
#include <turbojpeg.h>

#include <algorithm>
#include <memory>

#include "foundation/PluginFunction.h"
#include "toolkit/exchange/ExchangeLibrary.h"

namespace ZORToolkit {
namespace {

constexpr std::size_t kChannels = 3;
constexpr std::size_t kMaxSide = 1 << 14;  // pixels; more is no picture of an interference

struct Pixels {
  std::size_t width = 0, height = 0;
  std::vector<unsigned char> bytes;  // red, green, blue; rows from the top

  bool HasSize() const {
    return width >= 1 && height >= 1 && width <= kMaxSide && height <= kMaxSide;
  }
};

Pixels FromPng(const std::string& inPicture) {
  png_image image{};
  image.version = PNG_IMAGE_VERSION;
  if (png_image_begin_read_from_memory(&image, inPicture.data(), inPicture.size()) == 0) return {};
  image.format = PNG_FORMAT_RGB;
  Pixels pixels{image.width, image.height, {}};
  const png_color white{255, 255, 255};
  if (pixels.HasSize()) pixels.bytes.resize(PNG_IMAGE_SIZE(image));
  if (pixels.HasSize() &&
      png_image_finish_read(&image, &white, pixels.bytes.data(), 0, nullptr) != 0)
    return pixels;
  png_image_free(&image);
  return {};
}

Pixels FromJpeg(const std::string& inPicture) {
  const std::unique_ptr<void, int (*)(tjhandle)> reader(tjInitDecompress(), &tjDestroy);
  const auto* const bytes = reinterpret_cast<const unsigned char*>(inPicture.data());
  int width = 0, height = 0, sampling = 0, space = 0;
  if (tjDecompressHeader3(reader.get(), bytes, inPicture.size(), &width, &height, &sampling,
                          &space) != 0)
    return {};
  Pixels pixels{static_cast<std::size_t>(width), static_cast<std::size_t>(height), {}};
  if (!pixels.HasSize()) return {};
  pixels.bytes.resize(pixels.width * pixels.height * kChannels);
  if (tjDecompress2(reader.get(), bytes, inPicture.size(), pixels.bytes.data(), width, 0, height,
                    TJPF_RGB, 0) != 0)
    return {};
  return pixels;
}

/// Smaller by a whole number: each pixel is the mean of a square of them.
Pixels Shrunk(const Pixels& inPixels, std::size_t inBy) {
  Pixels pixels{std::max<std::size_t>(inPixels.width / inBy, 1),
                std::max<std::size_t>(inPixels.height / inBy, 1),
                {}};
  pixels.bytes.reserve(pixels.width * pixels.height * kChannels);
  for (std::size_t y = 0; y < pixels.height; ++y)
    for (std::size_t at = 0; at < pixels.width * kChannels; ++at) {
      const std::size_t left = at / kChannels * inBy, top = y * inBy;
      const std::size_t right = std::min(left + inBy, inPixels.width),
                        bottom = std::min(top + inBy, inPixels.height);
      std::size_t sum = 0;
      for (std::size_t row = top; row < bottom; ++row)
        for (std::size_t column = left; column < right; ++column)
          sum += inPixels.bytes[(row * inPixels.width + column) * kChannels + at % kChannels];
      pixels.bytes.push_back(static_cast<unsigned char>(sum / ((right - left) * (bottom - top))));
    }
  return pixels;
}

std::string ToPng(const Pixels& inPixels) {
  png_image image{};
  image.version = PNG_IMAGE_VERSION;
  image.width = static_cast<png_uint_32>(inPixels.width);
  image.height = static_cast<png_uint_32>(inPixels.height);
  image.format = PNG_FORMAT_RGB;
  png_alloc_size_t size = PNG_IMAGE_PNG_SIZE_MAX(image);
  std::string bytes(size, '\0');
  if (png_image_write_to_memory(&image, bytes.data(), &size, 0, inPixels.bytes.data(), 0,
                                nullptr) == 0)
    return {};
  bytes.resize(size);
  return bytes;
}

}  // namespace
}  // namespace ZORToolkit

ZOR_PLUGIN_FUNCTION bool ZORPngFromPicture(const std::string& inPicture, std::size_t inMaxSide,
                                           std::string& outPng) {
  using namespace ZORToolkit;
  Pixels pixels = FromPng(inPicture);
  if (pixels.bytes.empty()) pixels = FromJpeg(inPicture);
  if (pixels.bytes.empty()) return false;
  const std::size_t longest = std::max(pixels.width, pixels.height);
  if (longest > inMaxSide) pixels = Shrunk(pixels, (longest + inMaxSide - 1) / inMaxSide);
  outPng = ToPng(pixels);
  return !outPng.empty();
}
