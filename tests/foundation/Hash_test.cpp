#include "foundation/Hash.h"

#include <gtest/gtest.h>

#include <map>
#include <random>
#include <set>

using ZORFoundation::Hash128;
using ZORFoundation::Hash128Of;
using ZORFoundation::Hash64;
using ZORFoundation::Hash64Of;
using ZORFoundation::HexText;

// Published values of XXH3.
TEST(Hash, KnownTextsHaveTheirPublishedHash) {
  EXPECT_EQ(HexText(Hash64Of("")), "2d06800538d394c2");
  EXPECT_EQ(HexText(Hash128Of("")), "99aa06d3014798d86001c324468d497f");
  EXPECT_EQ(HexText(Hash64Of("abc")), "78af5f94892f3950");
  EXPECT_EQ(HexText(Hash128Of("abc")), "06b05ab6733a618578af5f94892f3950");
}

TEST(Hash, PiecesGiveTheHashOfTheWhole) {
  std::mt19937 random(7);
  for (std::size_t size : {0U, 1U, 16U, 17U, 240U, 241U, 1024U, 5000U}) {
    std::string bytes(size, '\0');
    for (char& byte : bytes) byte = static_cast<char>(random());
    Hash64 hash64(99);
    Hash128 hash128(99);
    for (std::size_t start = 0; start < size;) {
      const std::size_t count = 1 + random() % 300;
      hash64.Add(std::string_view(bytes).substr(start, count));
      hash128.Add(std::string_view(bytes).substr(start, count));
      start += count;
    }
    EXPECT_EQ(hash64.Get(), Hash64Of(bytes, 99)) << size;
    EXPECT_EQ(hash128.Get(), Hash128Of(bytes, 99)) << size;
  }
}

TEST(Hash, SeedMakesAnotherHash) {
  EXPECT_NE(Hash64Of("a"), Hash64Of("a", 1));
  EXPECT_NE(Hash128Of("a"), Hash128Of("a", 1));
}

TEST(Hash, TextsHaveTheirEndsInTheHash) {
  Hash64 first, second;
  first.AddText("ab");
  first.AddText("c");
  second.AddText("a");
  second.AddText("bc");
  EXPECT_NE(first.Get(), second.Get());
}

TEST(Hash, NumberIsItsEightBytes) {
  Hash64 hash;
  hash.Add(std::uint64_t{0x0807060504030201});
  EXPECT_EQ(hash.Get(), Hash64Of("\x01\x02\x03\x04\x05\x06\x07\x08"));
}

TEST(Hash, CopyGoesOnByItself) {
  Hash64 hash;
  hash.Add("a");
  Hash64 copy = hash;
  copy.Add("b");
  EXPECT_EQ(hash.Get(), Hash64Of("a"));
  EXPECT_EQ(copy.Get(), Hash64Of("ab"));
}

TEST(Hash, HexTextHasAllDigits) {
  EXPECT_EQ(HexText(std::uint64_t{0}), "0000000000000000");
  EXPECT_EQ(HexText(std::uint64_t{0xABC}), "0000000000000abc");
}
