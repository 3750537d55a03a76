// Documents as the reader hands them out.
#ifndef ZOR_TESTS_SUPPORT_LOADED_DOCUMENT_H
#define ZOR_TESTS_SUPPORT_LOADED_DOCUMENT_H

#include <gtest/gtest.h>

#include <string>

#include "ZORClashParsing.h"

namespace support {

/// The document of a text, null where the reader refuses it.
inline DOM_Document Parsed(std::string inXml) {
  DOM_Document document;
  ZORUnicodeString kind;
  ZORClashParsing(inXml.data(), static_cast<int>(inXml.size())).LoadSequence(document, kind);
  return document;
}

/// The document of a file, which the reader must take.
inline DOM_Document Loaded(std::string inPath) {
  DOM_Document document;
  ZORUnicodeString kind;
  EXPECT_EQ(ZORClashParsing(inPath.data()).LoadSequence(document, kind), S_OK);
  return document;
}

}  // namespace support

#endif
