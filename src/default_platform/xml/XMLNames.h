// Which names XML allows.
#ifndef ZOR_DEFAULT_PLATFORM_XML_XMLNAMES_H
#define ZOR_DEFAULT_PLATFORM_XML_XMLNAMES_H

#include <string_view>

bool IsXMLName(std::u16string_view inName);
/// Raises INVALID_CHARACTER_ERR for what is not a name.
void RequireXMLName(std::u16string_view inName);
/// Whether a processing instruction's target is "xml" in any case, which is not free for use.
bool IsReservedTarget(std::u16string_view inTarget);

#endif
