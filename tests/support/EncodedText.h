// Text in other encodings, for tests.
#ifndef ZOR_TESTS_SUPPORT_ENCODEDTEXT_H
#define ZOR_TESTS_SUPPORT_ENCODEDTEXT_H

#include <iconv.h>

#include <string>

namespace support {

/// UTF-8 text in another encoding of the C library; "" when it cannot be told in it.
inline std::string Encoded(const std::string& inText, const std::string& inEncoding) {
  const iconv_t converter = iconv_open(inEncoding.c_str(), "UTF-8");
  if (converter == iconv_t(-1)) return "";
  std::string from = inText;
  std::string to(inText.size() * 8 + 64, '\0');
  char* fromAt = from.data();
  char* toAt = to.data();
  std::size_t fromLeft = from.size();
  std::size_t toLeft = to.size();
  const std::size_t result = iconv(converter, &fromAt, &fromLeft, &toAt, &toLeft);
  iconv(converter, nullptr, nullptr, &toAt, &toLeft);
  iconv_close(converter);
  if (result == std::size_t(-1)) return "";
  to.resize(to.size() - toLeft);
  return to;
}

}  // namespace support

#endif
