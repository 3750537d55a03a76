// Documents from text and text from documents, for tests.
#ifndef ZOR_TESTS_SUPPORT_XMLTEXT_H
#define ZOR_TESTS_SUPPORT_XMLTEXT_H

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "platform/xml/DOMParser.h"
#include "platform/xml/DOM_DOMException.h"
#include "platform/xml/ZORXMLParseError.h"
#include "platform/xml/ZORXMLParser.h"

namespace support {

/// The document of a text in memory; raises ZORXMLParseError.
inline DOM_Document ParseText(std::string_view inText, const char* inIdentifier = "LIDPipodIBM") {
  InputSource* source = nullptr;
  ZORXMLParser::CreateMemBufInputSource(reinterpret_cast<const unsigned char*>(inText.data()),
                                        static_cast<unsigned int>(inText.size()), inIdentifier, 0,
                                        source);
  const std::unique_ptr<InputSource> owner(source);
  DOMParser parser(nullptr);
  parser.setDoValidation(false);
  parser.parse(*source);
  return parser.getDocument();
}

inline DOM_Element RootOf(std::string_view inText) {
  return ParseText(inText).getDocumentElement();
}

/// What ZORXMLParseError::what() says, "" when the text is read without error.
inline std::string ParseErrorOf(std::string_view inText) {
  try {
    ParseText(inText);
    return "";
  } catch (const ZORXMLParseError& error) {
    return error.what();
  }
}

/// The same for a file.
inline std::string FileErrorOf(const std::string& inPath) {
  DOMParser parser;
  try {
    parser.parse(inPath.c_str());
    return "";
  } catch (const ZORXMLParseError& error) {
    return error.what();
  }
}

/// The code of the exception with which a change of a tree is refused, 0 when it is done.
template <typename Change>
int CodeOf(Change inChange) {
  try {
    inChange();
    return 0;
  } catch (const DOM_DOMException& error) {
    return error.code;
  }
}

inline std::string Narrow(const DOMString& inText) {
  return inText.DOMStringToZORUnicodeString().ConvertToChar();
}

/// The written text of a node as UTF-8, "E_…" when it is refused.
inline std::string WrittenText(const DOM_Node& inNode) {
  DOMString text;
  const HRESULT result = ZORXMLParser::WriteXML(inNode, "UTF-8", text);
  if (result == E_FAIL) return "E_FAIL";
  if (result == E_INVALIDARG) return "E_INVALIDARG";
  const ZORUnicodeString units = text.DOMStringToZORUnicodeString();
  std::vector<char> bytes(static_cast<std::size_t>(units.GetLengthInChar()) * 3 + 1);
  std::size_t count = 0;
  units.ConvertToUTF8(bytes.data(), &count);
  return std::string(bytes.data(), count);
}

}  // namespace support

#endif
