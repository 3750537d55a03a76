#include <png.h>

#include <csetjmp>

#include "default_platform/visualisation/ray_caster/DrawPicture.h"

namespace ZORRayCaster {
namespace {

constexpr int kCompressionLevel = 4;  // beyond it, files shrink little and take much longer

void AppendBytes(png_structp inWriter, png_bytep inBytes, std::size_t inCount) {
  auto& file = *static_cast<std::string*>(png_get_io_ptr(inWriter));
  file.append(inBytes, inBytes + inCount);
}

bool WritePng(png_structp inWriter, png_infop inInfo, int inWidth, int inHeight,
              const std::uint8_t* inPixels, std::string& outFile) {
  if (setjmp(png_jmpbuf(inWriter)) != 0) return false;
  png_set_write_fn(inWriter, &outFile, &AppendBytes, nullptr);
  png_set_compression_level(inWriter, kCompressionLevel);
  png_set_filter(inWriter, PNG_FILTER_TYPE_BASE, PNG_FILTER_SUB | PNG_FILTER_UP);
  png_set_IHDR(inWriter, inInfo, static_cast<png_uint_32>(inWidth),
               static_cast<png_uint_32>(inHeight), 8, PNG_COLOR_TYPE_RGB, PNG_INTERLACE_NONE,
               PNG_COMPRESSION_TYPE_DEFAULT, PNG_FILTER_TYPE_DEFAULT);
  png_set_sRGB(inWriter, inInfo, PNG_sRGB_INTENT_PERCEPTUAL);
  png_write_info(inWriter, inInfo);
  for (int y = 0; y < inHeight; ++y)
    png_write_row(inWriter, inPixels + std::size_t{3} * static_cast<std::size_t>(inWidth) *
                                           static_cast<std::size_t>(y));
  png_write_end(inWriter, nullptr);
  return true;
}

}  // namespace

std::string PngFile(int inWidth, int inHeight, const std::uint8_t* inPixels) {
  std::string file;
  png_structp writer = png_create_write_struct(PNG_LIBPNG_VER_STRING, nullptr, nullptr, nullptr);
  png_infop info = writer ? png_create_info_struct(writer) : nullptr;
  const bool isWritten = info && WritePng(writer, info, inWidth, inHeight, inPixels, file);
  png_destroy_write_struct(&writer, &info);
  return isWritten ? file : std::string();
}

}  // namespace ZORRayCaster
