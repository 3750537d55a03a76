#include "foundation/Hash.h"

#define XXH_INLINE_ALL
#include <xxhash.h>

#include <bit>
#include <new>

namespace ZORFoundation {
namespace {

static_assert(std::endian::native == std::endian::little, "numbers are added as they lie");

XXH3_state_t* StateIn(unsigned char* inPlace) {
  return std::launder(reinterpret_cast<XXH3_state_t*>(inPlace));
}
const XXH3_state_t* StateIn(const unsigned char* inPlace) {
  return std::launder(reinterpret_cast<const XXH3_state_t*>(inPlace));
}

}  // namespace

std::uint64_t Hash64Of(std::string_view inBytes, std::uint64_t inSeed) {
  return XXH3_64bits_withSeed(inBytes.data(), inBytes.size(), inSeed);
}

Hash128Value Hash128Of(std::string_view inBytes, std::uint64_t inSeed) {
  const XXH128_hash_t hash = XXH3_128bits_withSeed(inBytes.data(), inBytes.size(), inSeed);
  return {hash.high64, hash.low64};
}

std::string HexText(std::uint64_t inHash) {
  std::string digits(16, '0');
  for (auto digit = digits.rbegin(); inHash != 0; ++digit, inHash >>= 4)
    *digit = "0123456789abcdef"[inHash & 0xF];
  return digits;
}

std::string HexText(const Hash128Value& inHash) {
  return HexText(inHash.high) + HexText(inHash.low);
}

HashState::HashState(std::uint64_t inSeed) {
  static_assert(sizeof state_ == sizeof(XXH3_state_t) && alignof(XXH3_state_t) <= 64);
  XXH3_64bits_reset_withSeed(new (state_) XXH3_state_t, inSeed);
}

// Both hashes share their state; only the digests differ.
void HashState::AddBytes(const void* inBytes, std::size_t inCount) {
  if (inCount > 0) XXH3_64bits_update(StateIn(state_), inBytes, inCount);
}

std::uint64_t HashState::Digest64() const { return XXH3_64bits_digest(StateIn(state_)); }

Hash128Value HashState::Digest128() const {
  const XXH128_hash_t hash = XXH3_128bits_digest(StateIn(state_));
  return {hash.high64, hash.low64};
}

}  // namespace ZORFoundation
