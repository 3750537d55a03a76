// A 1-based list of texts.
#ifndef ZOR_PLATFORM_SYSTEM_ZORLISTVALZORUNICODESTRING_H
#define ZOR_PLATFORM_SYSTEM_ZORLISTVALZORUNICODESTRING_H

#include "platform/system/ZORListVal.h"
#include "platform/system/ZORUnicodeString.h"

typedef ZORListVal<ZORUnicodeString> ZORListValZORUnicodeString;

#endif
