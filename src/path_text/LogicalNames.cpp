#include "path_text/LogicalNames.h"

#include <memory>

#include "BuildPath.h"
#include "platform/system/ZORDocumentLocation.h"

namespace {
constexpr char kScheme[] = "ZORDLN://";
constexpr int kSchemeLength = 9;
constexpr int kMarkLength = 3;  // what stands before a name that begins with no ordinary character

// The directory as the table holds it, not expanded; null when the name is not there.
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

// Bytes beyond ASCII count as negative, whatever the compiler's char is.
bool BeginsWithOrdinaryCharacter(const ZORUnicodeString& inName) {
  return inName.ConvertToString()[0].SignedValue() > 1;
}
}  // namespace

ZORUnicodeString DirectoryOfLogicalName(const ZORUnicodeString& inName) {
  if (BeginsWithOrdinaryCharacter(inName)) return DirectoryOr(inName, inName);
  return DirectoryOr(inName.SubString(kMarkLength), ZORUnicodeString());
}

ZORUnicodeString PathOfReference(const ZORUnicodeString& inReference) {
  const int scheme = inReference.SearchSubString(kScheme);
  if (scheme < 0) return inReference;
  const ZORUnicodeString rest = inReference.SubString(scheme + kSchemeLength);
  const ZORUnicodeString slash = BuildPath::AppendSlash();
  const int split = rest.SearchSubString(slash);

  const std::unique_ptr<ZORUnicodeString> path =
      LookUp(split < 0 ? rest : rest.SubString(0, split));
  if (path == nullptr) return ZORUnicodeString();
  if (FAILED(ZORExpandString(path.get()))) return ZORUnicodeString("error");
  path->Append(slash);
  if (split >= 0) path->Append(rest.SubString(split + 1));
  return *path;
}
