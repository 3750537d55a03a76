#include "platform/system/ZORToken.h"

#include <algorithm>
#include <string_view>

namespace {

std::u16string_view UnitsOf(const ZORUnicodeString& inText) {
  return {inText.ConvertToUCChar(), static_cast<std::size_t>(inText.GetLengthInChar())};
}

}  // namespace

ZORToken::ZORToken(const ZORUnicodeString& inText) : text_(inText) {}

ZORUnicodeString ZORToken::GetNextToken(const ZORUnicodeString& inSeparators) {
  const std::u16string_view text = UnitsOf(text_);
  const std::u16string_view separators = UnitsOf(inSeparators);
  const std::size_t begin = std::min(
      text.find_first_not_of(separators, static_cast<std::size_t>(position_)), text.size());
  const std::size_t end = std::min(text.find_first_of(separators, begin), text.size());
  position_ = static_cast<int>(end);
  ZORUnicodeString token;
  if (begin < end) token.BuildFromUTF16(text.data() + begin, end - begin);
  return token;
}
