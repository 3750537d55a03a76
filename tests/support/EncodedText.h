// Text in other encodings, for tests.
#ifndef ZOR_TESTS_SUPPORT_ENCODEDTEXT_H
#define ZOR_TESTS_SUPPORT_ENCODEDTEXT_H

#ifdef _WIN32
#include <unicode/ucnv.h>
#else
#include <iconv.h>
#endif

#include <string>

namespace support {

#ifdef _WIN32
/// UTF-8 text in another encoding, which the C library of Windows does not have: ICU's.
inline std::string Encoded(const std::string& inText, const std::string& inEncoding) {
  UErrorCode error = U_ZERO_ERROR;
  UConverter* const from = ucnv_open("UTF-8", &error);
  UConverter* const to = ucnv_open(inEncoding.c_str(), &error);
  if (U_SUCCESS(error))
    ucnv_setFromUCallBack(to, UCNV_FROM_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &error);
  std::string bytes(inText.size() * 8 + 64, '\0');
  char* target = bytes.data();
  const char* source = inText.data();
  ucnv_convertEx(to, from, &target, target + bytes.size(), &source, source + inText.size(), nullptr,
                 nullptr, nullptr, nullptr, true, true, &error);
  bytes.resize(static_cast<std::size_t>(target - bytes.data()));
  ucnv_close(from);
  ucnv_close(to);
  return U_SUCCESS(error) ? bytes : "";
}
#else
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
#endif

}  // namespace support

#endif
