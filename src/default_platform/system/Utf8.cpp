#include "default_platform/system/Utf8.h"

#include <cstdint>
#include <cstring>

namespace ZORDefault {
namespace {

constexpr std::size_t kBlock = 8;

bool IsAsciiBlock(const char* inBytes) {
  std::uint64_t block;
  std::memcpy(&block, inBytes, kBlock);
  return (block & 0x8080808080808080u) == 0;
}

bool IsAsciiBlock(const char16_t* inUnits) {
  std::uint64_t low, high;
  std::memcpy(&low, inUnits, kBlock);
  std::memcpy(&high, inUnits + 4, kBlock);
  return ((low | high) & 0xFF80FF80FF80FF80u) == 0;
}

// What may follow a lead byte: how many bytes, and the bounds of the first of them, which shut out
// overlong forms, surrogates and numbers past U+10FFFF (Unicode Standard, table 3-7).
struct Lead {
  int followers;
  unsigned char low, high;
};

Lead LeadOf(unsigned char inByte) {
  if (inByte >= 0xC2 && inByte <= 0xDF) return {1, 0x80, 0xBF};
  if (inByte == 0xE0) return {2, 0xA0, 0xBF};
  if (inByte == 0xED) return {2, 0x80, 0x9F};
  if (inByte >= 0xE1 && inByte <= 0xEF) return {2, 0x80, 0xBF};
  if (inByte == 0xF0) return {3, 0x90, 0xBF};
  if (inByte >= 0xF1 && inByte <= 0xF3) return {3, 0x80, 0xBF};
  if (inByte == 0xF4) return {3, 0x80, 0x8F};
  return {0, 0, 0};
}

char16_t* PutCharacter(char32_t inCharacter, char16_t* outUnits) {
  if (inCharacter < 0x10000) {
    *outUnits++ = static_cast<char16_t>(inCharacter);
    return outUnits;
  }
  *outUnits++ = static_cast<char16_t>(0xD7C0 + (inCharacter >> 10));
  *outUnits++ = static_cast<char16_t>(0xDC00 + (inCharacter & 0x3FF));
  return outUnits;
}

// Reads one sequence that does not start with an ASCII byte.
const char* DecodeSequence(const char* inBytes, const char* inEnd, char16_t*& ioUnits) {
  const unsigned char first = static_cast<unsigned char>(*inBytes++);
  Lead lead = LeadOf(first);
  char32_t character = first & (0x3Fu >> lead.followers);
  bool valid = lead.followers > 0;
  for (int left = lead.followers; left > 0; --left) {
    const unsigned char next = inBytes < inEnd ? static_cast<unsigned char>(*inBytes) : 0;
    if (next < lead.low || next > lead.high) {
      valid = false;
      break;
    }
    character = (character << 6) | (next & 0x3Fu);
    lead.low = 0x80;
    lead.high = 0xBF;
    ++inBytes;
  }
  ioUnits = PutCharacter(valid ? character : kReplacementCharacter, ioUnits);
  return inBytes;
}

}  // namespace

std::size_t DecodeUtf8(std::string_view inBytes, char16_t* outUnits) {
  const char* bytes = inBytes.data();
  const char* const end = bytes + inBytes.size();
  char16_t* units = outUnits;
  while (bytes < end) {
    while (end - bytes >= static_cast<std::ptrdiff_t>(kBlock) && IsAsciiBlock(bytes)) {
      for (std::size_t i = 0; i < kBlock; ++i) units[i] = static_cast<unsigned char>(bytes[i]);
      bytes += kBlock;
      units += kBlock;
    }
    // A block that is not all ASCII, or the last few bytes, goes character by character.
    const char* const blockEnd =
        end - bytes > static_cast<std::ptrdiff_t>(kBlock) ? bytes + kBlock : end;
    while (bytes < blockEnd) {
      if (static_cast<unsigned char>(*bytes) < 0x80)
        *units++ = static_cast<unsigned char>(*bytes++);
      else
        bytes = DecodeSequence(bytes, end, units);
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
  const char32_t unit = inUnits[ioPosition++];
  if (IsHighSurrogate(unit) && ioPosition < inUnits.size() && IsLowSurrogate(inUnits[ioPosition]))
    return 0x10000 + ((unit & 0x3FF) << 10) + (inUnits[ioPosition++] & 0x3FFu);
  return IsHighSurrogate(unit) || IsLowSurrogate(unit) ? char32_t{kReplacementCharacter} : unit;
}

char* EncodeCharacter(char32_t inCharacter, char* outBytes) {
  const auto put = [&outBytes](char32_t inByte) { *outBytes++ = static_cast<char>(inByte); };
  if (inCharacter < 0x80) {
    put(inCharacter);
  } else if (inCharacter < 0x800) {
    put(0xC0 | (inCharacter >> 6));
    put(0x80 | (inCharacter & 0x3F));
  } else {
    if (inCharacter < 0x10000) {
      put(0xE0 | (inCharacter >> 12));
    } else {
      put(0xF0 | (inCharacter >> 18));
      put(0x80 | ((inCharacter >> 12) & 0x3F));
    }
    put(0x80 | ((inCharacter >> 6) & 0x3F));
    put(0x80 | (inCharacter & 0x3F));
  }
  return outBytes;
}

std::size_t EncodeUtf8(std::u16string_view inUnits, char* outBytes) {
  char* bytes = outBytes;
  std::size_t position = 0;
  while (position < inUnits.size()) {
    while (position + kBlock <= inUnits.size() && IsAsciiBlock(inUnits.data() + position)) {
      for (std::size_t i = 0; i < kBlock; ++i) bytes[i] = static_cast<char>(inUnits[position + i]);
      position += kBlock;
      bytes += kBlock;
    }
    const std::size_t blockEnd =
        inUnits.size() - position > kBlock ? position + kBlock : inUnits.size();
    while (position < blockEnd) bytes = EncodeCharacter(NextCharacter(inUnits, position), bytes);
  }
  return static_cast<std::size_t>(bytes - outBytes);
}

}  // namespace ZORDefault
