// The characters of XML 1.0, fifth edition, how they are encoded, and the declaration of that.
#ifndef ZOR_DEFAULT_PLATFORM_XML_XMLCHARS_H
#define ZOR_DEFAULT_PLATFORM_XML_XMLCHARS_H

#include <string>
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

inline bool IsBlank(char inByte) {
  return inByte == ' ' || inByte == '\n' || inByte == '\t' || inByte == '\r';
}
inline const char* AfterBlanks(const char* inPlace) {
  while (IsBlank(*inPlace)) ++inPlace;
  return inPlace;
}
/// @return the value of a digit of base 10 or 16; -1 for another byte.
int DigitOf(char inByte, int inBase);

/// Decodes the character that begins at a byte beyond ASCII. No byte is looked at that follows one
/// that is wrong.
/// @return its number of bytes; 0 when they are ill-formed.
int DecodeUtf8Character(const char* inPlace, char32_t& outCharacter);
void AppendUtf16(char32_t inCharacter, std::u16string& ioText);

/// @param inText a document's begin, ended by a byte 0.
/// @return where its XML declaration ends; inText when it has none; null for one that is wrong, or
/// that declares another version than 1.0 or another encoding than UTF-8.
const char* EndOfUtf8Declaration(const char* inText);

#endif
