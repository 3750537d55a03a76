// Logical names of document locations.
#ifndef ZOR_PLATFORM_SYSTEM_ZORDOCUMENTLOCATION_H
#define ZOR_PLATFORM_SYSTEM_ZORDOCUMENTLOCATION_H

#include "ZORPlatformExport.h"
#include "platform/system/ZORResult.h"
#include "platform/system/ZORUnicodeString.h"

/// Looks a logical name up in the table of document locations.
/// @param outDirectory set to a new string that the caller deletes; null on failure.
/// @return S_OK; E_FAIL when the name is not in the table or the table cannot be read; E_INVALIDARG
///         for a null output.
ZOR_PLATFORM_EXPORT HRESULT ZORGetDLName(const ZORUnicodeString& inName,
                                         ZORUnicodeString** outDirectory);

/// Replaces each ${VARIABLE} of a text by the environment's value, in place.
/// @return S_OK; E_FAIL, the text unchanged, for an unknown variable or an unclosed brace;
///         E_INVALIDARG for null.
ZOR_PLATFORM_EXPORT HRESULT ZORExpandString(ZORUnicodeString* ioText);

#endif
