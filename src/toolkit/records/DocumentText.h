// Texts between documents (UTF-16) and everything else (UTF-8).
#ifndef ZOR_TOOLKIT_RECORDS_DOCUMENT_TEXT_H
#define ZOR_TOOLKIT_RECORDS_DOCUMENT_TEXT_H

#include <string>
#include <string_view>

#include "ZORToolkitExport.h"
#include "platform/system/ZORUnicodeString.h"

namespace ZORToolkit {

/// Always valid UTF-8: lone surrogates become U+FFFD.
ZOR_TOOLKIT_EXPORT std::string Utf8(const ZORUnicodeString& inText);
/// Bytes that are no UTF-8 become U+FFFD.
ZOR_TOOLKIT_EXPORT ZORUnicodeString FromUtf8(std::string_view inBytes);

}  // namespace ZORToolkit

#endif
