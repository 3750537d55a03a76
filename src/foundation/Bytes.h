// Bytes compared and hashed in place, without a call: most texts and names are short.
#ifndef ZOR_FOUNDATION_BYTES_H
#define ZOR_FOUNDATION_BYTES_H

#include <cstddef>
#include <cstdint>
#include <cstring>

namespace ZORFoundation {

/// Up to eight bytes as a number, different for different bytes of one count; free of calls.
inline std::uint64_t ShortBytes(const char* inBytes, std::size_t inCount) {
  if (inCount >= 4) {
    std::uint32_t first = 0, last = 0;
    std::memcpy(&first, inBytes, 4);
    std::memcpy(&last, inBytes + inCount - 4, 4);
    return first | std::uint64_t{last} << 32;
  }
  if (inCount == 0) return 0;
  const auto byte = [&](std::size_t inAt) {
    return std::uint64_t{static_cast<unsigned char>(inBytes[inAt])};
  };
  return byte(0) | byte(inCount / 2) << 8 | byte(inCount - 1) << 16;
}

/// As memcmp does it.
inline bool AreSameBytes(const char* inA, const char* inB, std::size_t inCount) {
  constexpr std::size_t kLong = 64;
  if (inCount < 8) return ShortBytes(inA, inCount) == ShortBytes(inB, inCount);
  if (inCount > kLong) return std::memcmp(inA, inB, inCount) == 0;
  const auto eight = [](const char* inBytes) {
    std::uint64_t bytes = 0;
    std::memcpy(&bytes, inBytes, 8);
    return bytes;
  };
  for (std::size_t i = 0; i + 8 < inCount; i += 8)
    if (eight(inA + i) != eight(inB + i)) return false;
  return eight(inA + inCount - 8) == eight(inB + inCount - 8);
}

/// A fast hash of bytes, eight at a time, for tables in memory; Hash.h has those that are written.
inline std::uint64_t HashOfBytes(const void* inBytes, std::size_t inCount) {
  constexpr std::uint64_t kFactor = 0x9E3779B97F4A7C15u;
  std::uint64_t hash = inCount * kFactor;
  const char* at = static_cast<const char*>(inBytes);
  for (; inCount >= 8; inCount -= 8, at += 8) {
    std::uint64_t part = 0;
    std::memcpy(&part, at, 8);
    hash = (hash ^ part) * kFactor;
    hash ^= hash >> 29;
  }
  if (inCount > 0) hash = (hash ^ ShortBytes(at, inCount)) * kFactor;
  return hash ^ (hash >> 32);
}

}  // namespace ZORFoundation

#endif
