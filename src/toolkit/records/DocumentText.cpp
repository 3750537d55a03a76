#include "toolkit/records/DocumentText.h"

namespace ZORToolkit {

std::string Utf8(const ZORUnicodeString& inText) {
  std::string bytes(3 * static_cast<std::size_t>(inText.GetLengthInChar()), '\0');
  std::size_t count = 0;
  inText.ConvertToUTF8(bytes.data(), &count);
  bytes.resize(count);
  return bytes;
}

ZORUnicodeString FromUtf8(std::string_view inBytes) {
  ZORUnicodeString text;
  text.BuildFromUTF8(inBytes.data(), inBytes.size());
  return text;
}

}  // namespace ZORToolkit
