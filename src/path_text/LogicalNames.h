// Paths of logical names and of references that hold one.
#ifndef ZOR_PATH_TEXT_LOGICAL_NAMES_H
#define ZOR_PATH_TEXT_LOGICAL_NAMES_H

#include "platform/system/ZORUnicodeString.h"

/// What BuildPath::TransformFromDLName answers.
ZORUnicodeString DirectoryOfLogicalName(const ZORUnicodeString& inName);

/// What BuildPath::TransformPathnameFromDLName answers.
ZORUnicodeString PathOfReference(const ZORUnicodeString& inReference);

#endif
