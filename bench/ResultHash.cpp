#include "ResultHash.h"

#include <fstream>
#include <stdexcept>
#include <vector>

namespace {
constexpr unsigned char kEndOfText = 0xFF;

bool IsHighSurrogate(char16_t inUnit) { return (inUnit & 0xFC00) == 0xD800; }
}  // namespace

void ResultHash::AddPart(std::string_view inUtf8) {
  for (char byte : inUtf8) AddByte(static_cast<unsigned char>(byte));
}

void ResultHash::Add(std::string_view inUtf8) {
  AddPart(inUtf8);
  AddByte(kEndOfText);
}

void ResultHash::Add(std::u16string_view inUtf16) {
  for (std::size_t i = 0; i < inUtf16.size(); ++i) {
    const char16_t unit = inUtf16[i];
    if (unit < 0x80) {
      AddByte(static_cast<unsigned char>(unit));
    } else if (IsHighSurrogate(unit) && i + 1 < inUtf16.size()) {
      const char32_t low = inUtf16[++i];
      AddCharacter(0x10000 + ((unit - char32_t{0xD800}) << 10) + (low - 0xDC00));
    } else {
      AddCharacter(unit);
    }
  }
  AddByte(kEndOfText);
}

void ResultHash::Add(std::uint64_t inNumber) {
  for (int i = 0; i < 8; ++i) AddByte(static_cast<unsigned char>(inNumber >> (8 * i)));
}

// A character from U+0080 on, as UTF-8.
void ResultHash::AddCharacter(char32_t inCharacter) {
  const auto tail = [&](int inShift) {
    AddByte(static_cast<unsigned char>(0x80 | ((inCharacter >> inShift) & 0x3F)));
  };
  if (inCharacter < 0x800) {
    AddByte(static_cast<unsigned char>(0xC0 | (inCharacter >> 6)));
  } else if (inCharacter < 0x10000) {
    AddByte(static_cast<unsigned char>(0xE0 | (inCharacter >> 12)));
    tail(6);
  } else {
    AddByte(static_cast<unsigned char>(0xF0 | (inCharacter >> 18)));
    tail(12);
    tail(6);
  }
  tail(0);
}

std::uint64_t HashOfBytes(const std::string& inPath) {
  std::ifstream file(inPath, std::ios::binary);
  if (!file) throw std::runtime_error("cannot read " + inPath);
  ResultHash hash;
  std::vector<char> part(std::size_t{1} << 20);
  while (file.read(part.data(), static_cast<std::streamsize>(part.size())), file.gcount() > 0)
    hash.AddPart({part.data(), static_cast<std::size_t>(file.gcount())});
  hash.Add(std::string_view());
  return hash.Value();
}
