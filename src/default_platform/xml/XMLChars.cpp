#include "default_platform/xml/XMLChars.h"

#include <algorithm>
#include <cstring>
#include <iterator>

namespace {

struct Range {
  char32_t first, last;
};

constexpr Range kNameStart[] = {
    {':', ':'},       {'A', 'Z'},       {'_', '_'},       {'a', 'z'},       {0xC0, 0xD6},
    {0xD8, 0xF6},     {0xF8, 0x2FF},    {0x370, 0x37D},   {0x37F, 0x1FFF},  {0x200C, 0x200D},
    {0x2070, 0x218F}, {0x2C00, 0x2FEF}, {0x3001, 0xD7FF}, {0xF900, 0xFDCF}, {0xFDF0, 0xFFFD},
};
constexpr Range kNameOnly[] = {
    {'-', '.'}, {'0', '9'}, {0xB7, 0xB7}, {0x300, 0x36F}, {0x203F, 0x2040},
};

template <std::size_t kCount>
bool IsIn(const Range (&inRanges)[kCount], char32_t inCharacter) {
  return std::any_of(std::begin(inRanges), std::end(inRanges), [&](const Range& inRange) {
    return inCharacter >= inRange.first && inCharacter <= inRange.last;
  });
}

bool IsContinuation(char inByte) { return (inByte & 0xC0) == 0x80; }

}  // namespace

bool IsNameStart(char32_t inCharacter) { return IsIn(kNameStart, inCharacter); }

bool IsNameCharacter(char32_t inCharacter) {
  return IsNameStart(inCharacter) || IsIn(kNameOnly, inCharacter);
}

bool IsXMLName(std::u16string_view inName) {
  return !inName.empty() && IsNameStart(inName[0]) &&
         std::all_of(inName.begin(), inName.end(), &IsNameCharacter);
}

bool IsReservedTarget(std::u16string_view inTarget) {
  return inTarget.size() == 3 && (inTarget[0] | 0x20) == u'x' && (inTarget[1] | 0x20) == u'm' &&
         (inTarget[2] | 0x20) == u'l';
}

int DigitOf(char inByte, int inBase) {
  if (inByte >= '0' && inByte <= '9') return inByte - '0';
  if (inBase == 10) return -1;
  const char small = static_cast<char>(inByte | 0x20);
  return small >= 'a' && small <= 'f' ? small - 'a' + 10 : -1;
}

// Unicode Standard, table 3-7.
int DecodeUtf8Character(const char* inPlace, char32_t& outCharacter) {
  const auto byte = [inPlace](int inAt) { return static_cast<unsigned char>(inPlace[inAt]); };
  const unsigned char lead = byte(0);
  if (lead < 0xC2 || lead > 0xF4 || !IsContinuation(inPlace[1])) return 0;
  if (lead < 0xE0) {
    outCharacter = static_cast<char32_t>((lead & 0x1F) << 6 | (byte(1) & 0x3F));
    return 2;
  }
  if (!IsContinuation(inPlace[2])) return 0;
  if (lead < 0xF0) {
    outCharacter =
        static_cast<char32_t>((lead & 0x0F) << 12 | (byte(1) & 0x3F) << 6 | (byte(2) & 0x3F));
    return outCharacter < 0x800 || (outCharacter >= 0xD800 && outCharacter < 0xE000) ? 0 : 3;
  }
  if (!IsContinuation(inPlace[3])) return 0;
  outCharacter = static_cast<char32_t>((lead & 0x07) << 18 | (byte(1) & 0x3F) << 12 |
                                       (byte(2) & 0x3F) << 6 | (byte(3) & 0x3F));
  return outCharacter < 0x10000 || outCharacter > 0x10FFFF ? 0 : 4;
}

void AppendUtf16(char32_t inCharacter, std::u16string& ioText) {
  if (inCharacter < 0x10000) {
    ioText += static_cast<char16_t>(inCharacter);
  } else {
    ioText += static_cast<char16_t>(0xD7C0 + (inCharacter >> 10));
    ioText += static_cast<char16_t>(0xDC00 + (inCharacter & 0x3FF));
  }
}

// ---- the declaration

namespace {

bool StartsWith(const char* inText, std::string_view inBegin) {
  return std::strncmp(inText, inBegin.data(), inBegin.size()) == 0;
}

/// Takes one pseudo-attribute of an XML declaration, with the blanks before it.
/// @return whether there is one of that name; outValue is then its value.
bool TakePseudoAttribute(const char*& ioPlace, std::string_view inName,
                         std::string_view& outValue) {
  const char* at = AfterBlanks(ioPlace);
  if (at == ioPlace || !StartsWith(at, inName)) return false;
  at = AfterBlanks(at + inName.size());
  if (*at != '=') return false;
  at = AfterBlanks(at + 1);
  const char quote = *at;
  if (quote != '"' && quote != '\'') return false;
  const char* const value = ++at;
  while (*at != quote && *at > ' ') ++at;
  if (*at != quote) return false;
  outValue = {value, static_cast<std::size_t>(at - value)};
  ioPlace = at + 1;
  return true;
}

bool IsUtf8(std::string_view inEncoding) {
  constexpr std::string_view kName = "utf-8";
  return std::equal(inEncoding.begin(), inEncoding.end(), kName.begin(), kName.end(),
                    [](char inA, char inB) { return inA == inB || (inA | 0x20) == inB; });
}

}  // namespace

const char* EndOfUtf8Declaration(const char* inText) {
  constexpr std::string_view kBegin = "<?xml";
  if (!StartsWith(inText, kBegin) || !IsBlank(inText[kBegin.size()])) return inText;
  const char* at = inText + kBegin.size();
  std::string_view value;
  if (!TakePseudoAttribute(at, "version", value) || value != "1.0") return nullptr;
  if (TakePseudoAttribute(at, "encoding", value) && !IsUtf8(value)) return nullptr;
  if (TakePseudoAttribute(at, "standalone", value) && value != "yes" && value != "no")
    return nullptr;
  at = AfterBlanks(at);
  return at[0] == '?' && at[1] == '>' ? at + 2 : nullptr;
}
