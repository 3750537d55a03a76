// The searches by vector instructions beside the plain ones.
#include "default_platform/xml/ByteSearch.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <string>
#include <vector>

namespace {

/// A text at a place of any alignment, with what a search may read past its end.
class PlacedText {
 public:
  PlacedText(const std::string& inText, std::size_t inOffset)
      : bytes_(inOffset + inText.size() + ByteSearch::kPadding, '<'), offset_(inOffset) {
    std::copy(inText.begin(), inText.end(), bytes_.begin() + static_cast<std::ptrdiff_t>(offset_));
    bytes_[offset_ + inText.size()] = '\0';
  }
  const char* Begin() const { return bytes_.data() + offset_; }

 private:
  std::vector<char> bytes_;
  std::size_t offset_;
};

std::vector<const ByteSearch*> VectorSearches() {
  std::vector<const ByteSearch*> searches;
  for (const ByteSearch* const one : {ByteSearch::Sse2(), ByteSearch::Avx2()})
    if (one != nullptr) searches.push_back(one);
  return searches;
}

void ExpectSame(const ByteSearch& inSearch, const char* inText) {
  const ByteSearch& plain = ByteSearch::Plain();
  for (const char quote : {'"', '\''})
    EXPECT_EQ(inSearch.endOfValue(inText, quote) - inText,
              plain.endOfValue(inText, quote) - inText);
  EXPECT_EQ(inSearch.endOfText(inText) - inText, plain.endOfText(inText) - inText);
  EXPECT_EQ(inSearch.endOfName(inText) - inText, plain.endOfName(inText) - inText);
}

void ExpectSameOfAll(const std::string& inText, std::size_t inOffset) {
  const PlacedText text(inText, inOffset);
  for (const ByteSearch* const search : VectorSearches()) ExpectSame(*search, text.Begin());
  const ShortByteSearch shortOnes;
  const ByteSearch& plain = ByteSearch::Plain();
  EXPECT_EQ(shortOnes.EndOfValue(text.Begin(), '"'), plain.endOfValue(text.Begin(), '"'));
  EXPECT_EQ(shortOnes.EndOfText(text.Begin()), plain.endOfText(text.Begin()));
  EXPECT_EQ(shortOnes.EndOfName(text.Begin()), plain.endOfName(text.Begin()));
}

}  // namespace

TEST(ByteSearch, PlainStopsWhereItShould) {
  const ByteSearch& plain = ByteSearch::Plain();
  const auto value = [&](const char* inText) { return plain.endOfValue(inText, '"') - inText; };
  const auto text = [&](const char* inText) { return plain.endOfText(inText) - inText; };
  const auto name = [&](const char* inText) { return plain.endOfName(inText) - inText; };
  EXPECT_EQ(value("ab'> ]\x7F\"c"), 7);
  for (const char* const one :
       {"ab\"", "ab&", "ab<", "ab\t", "ab\n", "ab\r", "ab\x01", "ab\x80", "ab"})
    EXPECT_EQ(value(one), 2) << one;
  EXPECT_EQ(text("ab'\"> \t\n\x7F<"), 9);
  for (const char* const one : {"ab<", "ab&", "ab]", "ab\r", "ab\x01", "ab\xFF", "ab"})
    EXPECT_EQ(text(one), 2) << one;
  EXPECT_EQ(name("azAZ09:_-. "), 10);
  for (const char* const one :
       {"ab=", "ab/", "ab>", "ab@", "ab[", "ab`", "ab{", "ab;", "ab,", "ab\xC3", "ab"})
    EXPECT_EQ(name(one), 2) << one;
}

TEST(ByteSearch, ANameIsFoundWhereItIs) {
  const std::string all = "abcdefghijklmnopqrstu";
  for (std::size_t length = 0; length <= all.size(); ++length) {
    const NameStart name(all.substr(0, length));
    EXPECT_EQ(name.IsWhole(), length <= 16);
    for (std::size_t place = 0; place < all.size(); ++place) {
      std::string text = all;
      text[place] = '!';
      EXPECT_EQ(name.IsAt(PlacedText(text, place).Begin()),
                place >= std::min<std::size_t>(length, 16))
          << length << ' ' << place;
    }
  }
}

// Every byte at every place of three blocks of the widest search, at every alignment.
TEST(ByteSearch, EveryByteIsFoundAtEveryPlace) {
  for (std::size_t offset = 0; offset < 32; ++offset)
    for (std::size_t place = 0; place < 97; place += offset % 2 == 0 ? 1 : 3)
      for (int byte = 0; byte < 256; byte += offset == 0 ? 1 : 7) {
        std::string text(97, 'x');
        text[place] = static_cast<char>(byte);
        ExpectSameOfAll(text, offset);
        ASSERT_FALSE(HasFailure()) << "byte " << byte << " at " << place << ", offset " << offset;
      }
}

TEST(ByteSearch, TextsThatEndAtEveryPlaceAreRead) {
  for (std::size_t offset = 0; offset < 32; ++offset)
    for (std::size_t length = 0; length < 100; ++length) {
      ExpectSameOfAll(std::string(length, 'x'), offset);
      ASSERT_FALSE(HasFailure()) << length << " bytes, offset " << offset;
    }
}

TEST(ByteSearch, RandomTextsAreSearchedAlike) {
  std::mt19937 random(3);
  for (int step = 0; step < 20'000; ++step) {
    std::string text(random() % 200, ' ');
    for (char& byte : text)
      byte =
          random() % 40 == 0 ? static_cast<char>(random()) : static_cast<char>('a' + random() % 26);
    ExpectSameOfAll(text, random() % 64);
    ASSERT_FALSE(HasFailure()) << text;
  }
}
