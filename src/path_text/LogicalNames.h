// Paths of logical names and of references that hold one.
#ifndef ZOR_PATH_TEXT_LOGICAL_NAMES_H
#define ZOR_PATH_TEXT_LOGICAL_NAMES_H

#include "platform/system/ZORUnicodeString.h"

/// What BuildPath::TransformFromDLName answers.
ZORUnicodeString DirectoryOfLogicalName(const ZORUnicodeString& inName);

/// The same for a name that may begin with the scheme "ZORDLN://". Where the scheme occurs anywhere
/// in the name, nine characters are dropped from the name's start: the scheme is taken to stand
/// there. A failed look-up then gives the empty string.
ZORUnicodeString DirectoryOfSchemeName(const ZORUnicodeString& inName);

/// What BuildPath::TransformPathnameFromDLName answers.
ZORUnicodeString PathOfReference(const ZORUnicodeString& inReference);

#endif
