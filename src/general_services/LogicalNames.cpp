// The logical-name operations of the general services.
#include "path_text/LogicalNames.h"

#include "ZORLyraGeneralServices.h"

ZORUnicodeString ZORLyraGeneralServices::TransformFromDLName(ZORUnicodeString inName) {
  return DirectoryOfSchemeName(inName);
}

ZORUnicodeString ZORLyraGeneralServices::TransformPathnameFromDLName(ZORUnicodeString inReference) {
  return PathOfReference(inReference);
}
