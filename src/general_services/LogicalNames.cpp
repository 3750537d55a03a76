// The logical-name operations of the general services.
#include "BuildPath.h"
#include "ZORLyraGeneralServices.h"

namespace {
constexpr char kScheme[] = "ZORDLN://";
constexpr int kSchemeLength = 9;
// Three characters that are no part of a name; behind them an unknown name gives nothing.
constexpr char kMark[] = "\x01\x01\x01";
}  // namespace

// The scheme is taken to stand at the start, wherever it was found.
ZORUnicodeString ZORLyraGeneralServices::TransformFromDLName(ZORUnicodeString inName) {
  if (inName.SearchSubString(kScheme) < 0) return BuildPath::TransformFromDLName(inName);
  return BuildPath::TransformFromDLName(kMark + inName.SubString(kSchemeLength));
}

ZORUnicodeString ZORLyraGeneralServices::TransformPathnameFromDLName(ZORUnicodeString inReference) {
  return BuildPath::TransformPathnameFromDLName(inReference);
}
