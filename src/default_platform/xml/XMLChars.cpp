#include "default_platform/xml/XMLChars.h"

#include <algorithm>
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
