#include "LogicalNames.h"

#include <memory>

#include "BuildPath.h"
#include "PlatformAdapter.h"
#include "platform/system/ZORDocumentLocation.h"

namespace {
constexpr int kMarkLength = 3;  // of what precedes a name after a first byte that is not ASCII text

ZORUnicodeString From(const ZORUnicodeString& inText, int inStart) {
  return inText.SubString(inStart, inText.GetLengthInChar() - inStart);
}

int Find(const ZORUnicodeString& inText, const ZORUnicodeString& inPart) {
  return inText.SearchSubString(inPart, 0, adapter::kSearchForward);
}

/// The directory as the table holds it, not expanded; null for a name that is not in it.
std::unique_ptr<ZORUnicodeString> LookUp(const ZORUnicodeString& inName) {
  ZORUnicodeString* found = nullptr;
  const HRESULT result = ZORGetDLName(inName, &found);
  std::unique_ptr<ZORUnicodeString> directory(found);
  if (FAILED(result)) directory.reset();
  return directory;
}

ZORUnicodeString DirectoryOr(const ZORUnicodeString& inName, const ZORUnicodeString& inUnknown) {
  const std::unique_ptr<ZORUnicodeString> directory = LookUp(inName);
  if (directory == nullptr) return inUnknown;
  return FAILED(ZORExpandString(directory.get())) ? ZORUnicodeString() : *directory;
}

// Compared as a signed byte, whatever the compiler's char is: bytes beyond ASCII are negative.
bool BeginsWithOrdinaryCharacter(const ZORUnicodeString& inName) {
  const char first = inName.ConvertToString()[0];
  return static_cast<signed char>(first) > 1;
}
}  // namespace

ZORUnicodeString DirectoryOfLogicalName(const ZORUnicodeString& inName) {
  if (BeginsWithOrdinaryCharacter(inName)) return DirectoryOr(inName, inName);
  return DirectoryOfPrefixedName(inName, kMarkLength);
}

ZORUnicodeString DirectoryOfPrefixedName(const ZORUnicodeString& inText, int inPrefixLength) {
  const bool isShort = inText.GetLengthInChar() <= inPrefixLength;
  return DirectoryOr(isShort ? ZORUnicodeString() : From(inText, inPrefixLength),
                     ZORUnicodeString());
}

ZORUnicodeString PathOfReference(const ZORUnicodeString& inReference) {
  const int scheme = Find(inReference, kLogicalNameScheme);
  if (scheme < 0) return inReference;
  const ZORUnicodeString rest = From(inReference, scheme + kLogicalNameSchemeLength);
  const ZORUnicodeString slash = BuildPath::AppendSlash();
  const int split = Find(rest, slash);

  const std::unique_ptr<ZORUnicodeString> path =
      LookUp(split < 0 ? rest : rest.SubString(0, split));
  if (path == nullptr) return ZORUnicodeString();
  if (FAILED(ZORExpandString(path.get()))) return ZORUnicodeString("error");
  path->Append(slash);
  if (split >= 0) path->Append(From(rest, split + 1));
  return *path;
}
