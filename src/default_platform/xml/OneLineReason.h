// Reasons of the XML library as one line of narrow text.
#ifndef ZOR_DEFAULT_PLATFORM_XML_ONELINEREASON_H
#define ZOR_DEFAULT_PLATFORM_XML_ONELINEREASON_H

#include <string>

/// @param inText zero-terminated, or null.
std::string OneLineReason(const char16_t* inText);

#endif
