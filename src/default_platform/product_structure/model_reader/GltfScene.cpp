#include "default_platform/product_structure/model_reader/GltfScene.h"

#include <cstdint>
#include <cstring>
#include <fstream>
#include <iterator>

namespace ZORDefault {

std::string ReadGltfScene(const std::string& inPath) {
  constexpr std::size_t kLengthAt = 12, kTextAt = 20;
  std::ifstream file(inPath, std::ios::binary);
  std::string bytes((std::istreambuf_iterator<char>(file)), {});
  if (!bytes.starts_with("glTF") || bytes.size() < kTextAt) return bytes;
  std::uint32_t length = 0;
  std::memcpy(&length, bytes.data() + kLengthAt, sizeof length);
  return bytes.substr(kTextAt, length);
}

}  // namespace ZORDefault
