// The character classes of XML 1.0, fifth edition.
#ifndef ZOR_DEFAULT_PLATFORM_XML_XMLCHARS_H
#define ZOR_DEFAULT_PLATFORM_XML_XMLCHARS_H

#include <string_view>

bool IsNameStart(char32_t inCharacter);
bool IsNameCharacter(char32_t inCharacter);
/// Whether a document may hold a character.
inline bool IsXMLCharacter(char32_t inCharacter) {
  if (inCharacter < 0x20) return inCharacter == '\t' || inCharacter == '\n' || inCharacter == '\r';
  return inCharacter < 0xD800 || (inCharacter >= 0xE000 && inCharacter < 0xFFFE) ||
         (inCharacter >= 0x10000 && inCharacter < 0x110000);
}

/// Whether a text is a name. Characters beyond U+FFFF are not taken, as in Xerces-C.
bool IsXMLName(std::u16string_view inName);
/// Whether a processing instruction's target is "xml" in any case, which is not free for use.
bool IsReservedTarget(std::u16string_view inTarget);

#endif
