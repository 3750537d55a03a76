#include "default_platform/xml/OneLineReason.h"

#include <string_view>

#include "platform/system/ZORUnicodeString.h"

namespace {
// A name in a message may be as long as the document.
constexpr std::size_t kLongest = 400;
constexpr std::u16string_view kWrapping = u"Message:";
}  // namespace

std::string OneLineReason(const char16_t* inText) {
  std::u16string text = inText == nullptr ? u"" : inText;
  // The library wraps its own exceptions as "An exception occurred! Type:…, Message:…".
  const std::size_t wrapped = text.find(kWrapping);
  if (wrapped != std::u16string::npos && text.starts_with(u"An exception occurred"))
    text.erase(0, wrapped + kWrapping.size());
  if (text.size() > kLongest) text = text.substr(0, kLongest) + u"…";
  for (char16_t& unit : text)
    if (unit < u' ' || unit == 0x7F || unit == 0x85 || unit == 0x2028 || unit == 0x2029)
      unit = u' ';
  if (text.empty()) return "the XML library gives no reason";
  ZORUnicodeString reason;
  reason.BuildFromUTF16(text.data(), text.size());
  return reason.ConvertToChar();
}
