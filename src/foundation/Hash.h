// Hashes of bytes: XXH3 (Y. Collet, xxHash), the same on every run and machine. Not for secrets.
#ifndef ZOR_FOUNDATION_HASH_H
#define ZOR_FOUNDATION_HASH_H

#include <cstdint>
#include <string>
#include <string_view>

#include "ZORFoundationExport.h"

namespace ZORFoundation {

struct Hash128Value {
  std::uint64_t high = 0, low = 0;
  friend bool operator==(const Hash128Value&, const Hash128Value&) = default;
};

/// The hash of bytes in memory.
ZOR_FOUNDATION_EXPORT std::uint64_t Hash64Of(std::string_view inBytes, std::uint64_t inSeed = 0);
ZOR_FOUNDATION_EXPORT Hash128Value Hash128Of(std::string_view inBytes, std::uint64_t inSeed = 0);

/// 16 or 32 hexadecimal digits, lower case, the most significant first.
ZOR_FOUNDATION_EXPORT std::string HexText(std::uint64_t inHash);
ZOR_FOUNDATION_EXPORT std::string HexText(const Hash128Value& inHash);

/// The state shared by the two hashes below.
class ZOR_FOUNDATION_EXPORT HashState {
 protected:
  explicit HashState(std::uint64_t inSeed);
  void AddBytes(const void* inBytes, std::size_t inCount);
  std::uint64_t Digest64() const;
  Hash128Value Digest128() const;

 private:
  alignas(64) unsigned char state_[576];
};

/// A hash of bytes added piece by piece. Where the pieces are cut makes no difference, so texts of
/// variable length go through AddText.
template <class Value>
class IncrementalHash : private HashState {
 public:
  explicit IncrementalHash(std::uint64_t inSeed = 0) : HashState(inSeed) {}
  void Add(std::string_view inBytes) { AddBytes(inBytes.data(), inBytes.size()); }
  /// Adds the length, then the text.
  void AddText(std::string_view inText) {
    Add(inText.size());
    Add(inText);
  }
  /// Adds a number as eight bytes, whatever its type.
  void Add(std::uint64_t inNumber) { AddBytes(&inNumber, sizeof inNumber); }
  void Add(double inNumber) { AddBytes(&inNumber, sizeof inNumber); }
  Value Get() const {
    if constexpr (sizeof(Value) == sizeof(std::uint64_t))
      return Digest64();
    else
      return Digest128();
  }
};
using Hash64 = IncrementalHash<std::uint64_t>;
using Hash128 = IncrementalHash<Hash128Value>;

}  // namespace ZORFoundation

#endif
