// Paths of logical names and of references that hold one.
#ifndef ZOR_LOGICAL_NAMES_H
#define ZOR_LOGICAL_NAMES_H

#include "platform/system/ZORUnicodeString.h"

/// What a reference begins with, and its length.
constexpr char kLogicalNameScheme[] = "ZORDLN://";
constexpr int kLogicalNameSchemeLength = 9;

/// What BuildPath::TransformFromDLName answers.
ZORUnicodeString DirectoryOfLogicalName(const ZORUnicodeString& inName);

/// The directory of a logical name that a text holds after inPrefixLength other characters.
/// @return the empty string for a name that is not in the table or cannot be expanded.
ZORUnicodeString DirectoryOfPrefixedName(const ZORUnicodeString& inText, int inPrefixLength);

/// What BuildPath::TransformPathnameFromDLName answers.
ZORUnicodeString PathOfReference(const ZORUnicodeString& inReference);

#endif
