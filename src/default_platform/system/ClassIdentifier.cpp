#include "default_platform/system/ClassIdentifier.h"

namespace ZORDefault {
namespace {

__extension__ typedef unsigned __int128 Hash;

Hash HashOf(std::string_view inName) {
  constexpr Hash kOffset = (Hash{0x6c62272e07bb0142u} << 64) | 0x62b821756295c58du;
  constexpr Hash kPrime = (Hash{1} << 88) | 0x13b;
  Hash hash = kOffset;
  for (const char character : inName) {
    hash ^= static_cast<unsigned char>(character);
    hash *= kPrime;
  }
  return hash;
}

}  // namespace

GUID IdentifierOfName(std::string_view inName) {
  const Hash hash = HashOf(inName);
  GUID identifier{};
  identifier.Data1 = static_cast<std::uint32_t>(hash >> 96);
  identifier.Data2 = static_cast<std::uint16_t>(hash >> 80);
  identifier.Data3 = static_cast<std::uint16_t>(hash >> 64);
  for (int i = 0; i < 8; ++i)
    identifier.Data4[i] = static_cast<unsigned char>(hash >> (56 - 8 * i));
  return identifier;
}

}  // namespace ZORDefault
