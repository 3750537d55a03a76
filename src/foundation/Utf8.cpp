#include "foundation/Utf8.h"

#include <unicode/utf16.h>
#include <unicode/utf8.h>

#include <cstdint>
#include <cstring>

namespace ZORFoundation {
namespace {

constexpr std::size_t kBlock = 8;

bool IsAsciiBlock(const char* inBytes) {
  std::uint64_t block = 0;
  std::memcpy(&block, inBytes, kBlock);
  return (block & 0x8080808080808080u) == 0;
}

bool IsAsciiBlock(const char16_t* inUnits) {
  std::uint64_t low = 0, high = 0;
  std::memcpy(&low, inUnits, kBlock);
  std::memcpy(&high, inUnits + 4, kBlock);
  return ((low | high) & 0xFF80FF80FF80FF80u) == 0;
}

// Blocks of ASCII from a position on, which most texts are made of; the ICU macros take one
// character at a time.
template <class From, class To>
void CopyAsciiBlocks(std::basic_string_view<From> inText, std::size_t& ioPosition, To*& ioTo) {
  while (ioPosition + kBlock <= inText.size() && IsAsciiBlock(inText.data() + ioPosition)) {
    for (std::size_t i = 0; i < kBlock; ++i) ioTo[i] = static_cast<To>(inText[ioPosition + i]);
    ioPosition += kBlock;
    ioTo += kBlock;
  }
}

inline char32_t NextOfUtf16(std::u16string_view inUnits, std::size_t& ioPosition) {
  char32_t character = 0;
  U16_NEXT_OR_FFFD(inUnits.data(), ioPosition, inUnits.size(), character);
  return character;
}

inline char* Encode(char32_t inCharacter, char* outBytes) {
  std::size_t count = 0;
  U8_APPEND_UNSAFE(outBytes, count, inCharacter);
  return outBytes + count;
}

}  // namespace

bool IsUtf8(std::string_view inBytes) {
  for (std::size_t position = 0; position < inBytes.size();) {
    UChar32 character = 0;
    U8_NEXT(inBytes.data(), position, inBytes.size(), character);
    if (character < 0) return false;
  }
  return true;
}

std::size_t DecodeUtf8(std::string_view inBytes, char16_t* outUnits) {
  char16_t* units = outUnits;
  for (std::size_t position = 0; position < inBytes.size();) {
    CopyAsciiBlocks(inBytes, position, units);
    // A block that is not all ASCII, or the last few bytes, goes character by character.
    const std::size_t blockEnd = std::min(position + kBlock, inBytes.size());
    while (position < blockEnd) {
      UChar32 character = 0;
      U8_NEXT_OR_FFFD(inBytes.data(), position, inBytes.size(), character);
      std::size_t count = 0;
      U16_APPEND_UNSAFE(units, count, character);
      units += count;
    }
  }
  return static_cast<std::size_t>(units - outUnits);
}

std::size_t Utf8Length(std::u16string_view inUnits) {
  std::size_t length = inUnits.size();
  for (const char16_t unit : inUnits) {
    length += unit >= 0x80;
    length += unit >= 0x800;
  }
  // A pair was counted as twice three bytes and takes four.
  for (std::size_t i = 0; i + 1 < inUnits.size(); ++i)
    if (IsHighSurrogate(inUnits[i]) && IsLowSurrogate(inUnits[i + 1])) length -= 2;
  return length;
}

char32_t NextCharacter(std::u16string_view inUnits, std::size_t& ioPosition) {
  return NextOfUtf16(inUnits, ioPosition);
}

char32_t NextCharacter(std::string_view inBytes, std::size_t& ioPosition) {
  char32_t character = 0;
  U8_NEXT_OR_FFFD(inBytes.data(), ioPosition, inBytes.size(), character);
  return character;
}

char* EncodeCharacter(char32_t inCharacter, char* outBytes) {
  return Encode(inCharacter, outBytes);
}

std::size_t EncodeUtf8(std::u16string_view inUnits, char* outBytes) {
  char* bytes = outBytes;
  for (std::size_t position = 0; position < inUnits.size();) {
    CopyAsciiBlocks(inUnits, position, bytes);
    const std::size_t blockEnd = std::min(position + kBlock, inUnits.size());
    while (position < blockEnd) bytes = Encode(NextOfUtf16(inUnits, position), bytes);
  }
  return static_cast<std::size_t>(bytes - outBytes);
}

}  // namespace ZORFoundation
