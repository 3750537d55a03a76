// Texts between documents (UTF-16) and everything else (UTF-8).
#ifndef ZOR_TOOLKIT_RECORDS_DOCUMENT_TEXT_H
#define ZOR_TOOLKIT_RECORDS_DOCUMENT_TEXT_H

#include <string>
#include <string_view>

#include "platform/system/ZORUnicodeString.h"

namespace ZORToolkit {

/// Always valid UTF-8: lone surrogates become U+FFFD.
inline std::string Utf8(const ZORUnicodeString& inText) {
  std::string bytes(3 * static_cast<std::size_t>(inText.GetLengthInChar()), '\0');
  std::size_t count = 0;
  inText.ConvertToUTF8(bytes.data(), &count);
  bytes.resize(count);
  return bytes;
}
/// Bytes that are no UTF-8 become U+FFFD.
inline ZORUnicodeString FromUtf8(std::string_view inBytes) {
  ZORUnicodeString text;
  text.BuildFromUTF8(inBytes.data(), inBytes.size());
  return text;
}

}  // namespace ZORToolkit

#endif
