// Reading XML of other tools; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_EXCHANGE_EXCHANGE_XML_H
#define ZOR_TOOLKIT_EXCHANGE_EXCHANGE_XML_H

#include <algorithm>
#include <cctype>
#include <memory>
#include <string>
#include <string_view>

#include "platform/xml/DOMParser.h"
#include "platform/xml/ZORXMLParseError.h"
#include "platform/xml/ZORXMLParser.h"
#include "toolkit/Error.h"
#include "toolkit/records/ElementWalk.h"

namespace ZORToolkit {

inline std::string LowerCase(std::string_view inText) {
  std::string text(inText);
  std::ranges::transform(text, text.begin(), [](unsigned char inByte) {
    return static_cast<char>(std::tolower(inByte));
  });
  return text;
}

/// The root element. Raises Error for what is not well-formed or has a document type.
inline DOM_Node ParseXml(const std::string& inName, const std::string& inBytes) {
  InputSource* made = nullptr;
  const HRESULT result = ZORXMLParser::CreateMemBufInputSource(
      reinterpret_cast<const unsigned char*>(inBytes.data()),
      static_cast<unsigned int>(inBytes.size()), FromUtf8(inName), 0, made);
  const std::unique_ptr<InputSource> source(made);
  if (FAILED(result)) throw Error(inName, "is too large");
  DOMParser parser;
  try {
    parser.parse(*source);
  } catch (const ZORXMLParseError& error) {
    throw Error(inName, error.reason, FilePlace{error.line, error.column});
  }
  if (!parser.getDocument().getDoctype().isNull())
    throw Error(inName, "has a document type, which no file of BCF has");
  return parser.getDocument().getDocumentElement();
}

// Some writers give every element a prefix.
inline std::string LocalName(const DOM_Node& inElement) {
  const std::string name = Utf8(inElement.getNodeName().DOMStringToZORUnicodeString());
  return name.substr(name.find(':') + 1);
}

template <class Visit>
void ForEachLocal(const DOM_Node& inParent, const char* inName, const Visit& inVisit) {
  ForEachElement(inParent, nullptr, [&](const DOM_Node& inChild) {
    if (LocalName(inChild) == inName) inVisit(inChild);
  });
}

inline DOM_Node Child(const DOM_Node& inParent, const char* inName) {
  DOM_Node found;
  ForEachLocal(inParent, inName, [&](const DOM_Node& inChild) {
    if (found.isNull()) found = inChild;
  });
  return found;
}

/// All text inside an element.
inline std::string TextOf(const DOM_Node& inElement) {
  std::string text;
  for (DOM_Node child = inElement.getFirstChild(); !child.isNull(); child = child.getNextSibling())
    if (child.getNodeType() == DOM_Node::TEXT_NODE ||
        child.getNodeType() == DOM_Node::CDATA_SECTION_NODE)
      text += Utf8(child.getNodeValue().DOMStringToZORUnicodeString());
  return text;
}

}  // namespace ZORToolkit

#endif
