// The texts of documents.
#ifndef ZOR_DEFAULT_PLATFORM_XML_DOM_TEXT_H
#define ZOR_DEFAULT_PLATFORM_XML_DOM_TEXT_H

#include <cstdint>
#include <cstring>
#include <string_view>

/// An immutable UTF-16 text: this head, then the code units. It lies in the arena of a tree, or in a
/// counted block of its own (see OwnedText in DOMString.cpp).
struct DOM_Text {
  std::uint32_t length;

  const char16_t* Units() const { return reinterpret_cast<const char16_t*>(this + 1); }
  char16_t* Units() { return reinterpret_cast<char16_t*>(this + 1); }
  std::u16string_view View() const { return {Units(), length}; }
};

/// As ==, which the standard library does unit by unit.
inline bool IsSameText(std::u16string_view inA, std::u16string_view inB) {
  return inA.size() == inB.size() &&
         (inA.empty() || std::memcmp(inA.data(), inB.data(), inA.size() * sizeof(char16_t)) == 0);
}

/// The same of a text and an ASCII one; a byte beyond ASCII stands for the unit of its number.
inline bool IsSameText(std::u16string_view inText, std::string_view inAscii) {
  if (inText.size() != inAscii.size()) return false;
  for (std::size_t i = 0; i < inAscii.size(); ++i)
    if (inText[i] != static_cast<unsigned char>(inAscii[i])) return false;
  return true;
}

/// A fast hash of UTF-16 text, eight bytes at a time.
inline std::uint64_t HashOfText(std::u16string_view inText) {
  constexpr std::uint64_t kFactor = 0x9E3779B97F4A7C15u;
  std::uint64_t hash = inText.size() * kFactor;
  const char16_t* at = inText.data();
  std::size_t left = inText.size() * sizeof(char16_t);
  for (; left >= 8; left -= 8, at += 4) {
    std::uint64_t part;
    std::memcpy(&part, at, 8);
    hash = (hash ^ part) * kFactor;
    hash ^= hash >> 29;
  }
  if (left > 0) {
    std::uint64_t part = 0;
    std::memcpy(&part, at, left);
    hash = (hash ^ part) * kFactor;
  }
  return hash ^ (hash >> 32);
}

#endif
