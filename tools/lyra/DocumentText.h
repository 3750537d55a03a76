// Texts between documents (UTF-16) and the command (UTF-8).
#ifndef ZOR_TOOLS_LYRA_DOCUMENT_TEXT_H
#define ZOR_TOOLS_LYRA_DOCUMENT_TEXT_H

#include <string>
#include <string_view>

#include "platform/system/ZORUnicodeString.h"
#include "platform/xml/DOM_Node.h"

namespace lyra {

/// Always valid UTF-8: lone surrogates become U+FFFD.
std::string Utf8(const ZORUnicodeString& inText);
ZORUnicodeString FromUtf8(std::string_view inBytes);
/// The value of an attribute, empty when it is missing.
std::string AttributeText(const DOM_Node& inNode, const char* inName);
/// An attribute that holds a number: its first comma, which is a decimal one, becomes a point.
std::string NumberText(const DOM_Node& inNode, const char* inName);

}  // namespace lyra

#endif
