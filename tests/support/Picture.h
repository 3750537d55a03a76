// Pictures as pixels.
#ifndef ZOR_TESTS_SUPPORT_PICTURE_H
#define ZOR_TESTS_SUPPORT_PICTURE_H

#include <array>
#include <cstdint>
#include <vector>

namespace support {

struct Picture {
  int width = 0;
  int height = 0;
  std::vector<std::uint8_t> pixels;  // red, green, blue, row by row; empty when nothing was drawn

  /// Red, green and blue of a pixel.
  std::array<int, 3> At(int inX, int inY) const {
    const std::size_t place = 3 * (static_cast<std::size_t>(inY) * static_cast<std::size_t>(width) +
                                   static_cast<std::size_t>(inX));
    return {pixels[place], pixels[place + 1], pixels[place + 2]};
  }
};

}  // namespace support

#endif
