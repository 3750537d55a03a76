// Pictures of PNG files.
#ifndef ZOR_TESTS_SUPPORT_PNG_PICTURE_H
#define ZOR_TESTS_SUPPORT_PNG_PICTURE_H

#include <png.h>

#include <string>

#include "support/Picture.h"

namespace support {

/// A picture without pixels for what is no PNG file.
inline Picture ReadPng(const std::string& inPath) {
  png_image image{};
  image.version = PNG_IMAGE_VERSION;
  Picture picture;
  if (!png_image_begin_read_from_file(&image, inPath.c_str())) return picture;
  image.format = PNG_FORMAT_RGB;
  picture.width = static_cast<int>(image.width);
  picture.height = static_cast<int>(image.height);
  picture.pixels.resize(PNG_IMAGE_SIZE(image));
  png_image_finish_read(&image, nullptr, picture.pixels.data(), 0, nullptr);
  return picture;
}

}  // namespace support

#endif
