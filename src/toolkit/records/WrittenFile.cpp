#include "toolkit/records/WrittenFile.h"

#include <cerrno>

#include "foundation/AtomicFile.h"
#include "platform/system/ZORFile.h"

namespace ZORToolkit {

using ZORFoundation::FileError;

void CheckWritten(HRESULT inResult, const std::string& inPath) {
  if (SUCCEEDED(inResult)) return;
  if (inResult == kZORFileNotFound) throw FileError(inPath, ENOENT);
  if (inResult == kZORFileAccessDenied) throw FileError(inPath, EACCES);
  if (inResult == kZORFileDiskFull) throw FileError(inPath, ENOSPC);
  throw FileError(inPath, EIO, "the file could not be written");
}

void ReplaceFile(const std::string& inPath,
                 const std::function<HRESULT(const std::string&)>& inWrite) {
  ZORFoundation::AtomicFile file(inPath);
  CheckWritten(inWrite(file.Temporary().Utf8Path()), inPath);
  file.Commit();
}

}  // namespace ZORToolkit
