// Writing a document in the place of a file.
#ifndef ZOR_TOOLKIT_RECORDS_WRITTEN_FILE_H
#define ZOR_TOOLKIT_RECORDS_WRITTEN_FILE_H

#include <functional>
#include <string>

#include "ZORToolkitExport.h"
#include "platform/system/ZORResult.h"

namespace ZORToolkit {

/// Raises ZORFoundation::FileError for a code that says that writing failed.
/// @param inPath what the error names.
ZOR_TOOLKIT_EXPORT void CheckWritten(HRESULT inResult, const std::string& inPath);

/// Makes or replaces a file once all of it is written; until then an old one is untouched. Raises
/// ZORFoundation::FileError, at once where nothing can be written there, and what inWrite raises.
/// @param inWrite writes at the path that it gets, UTF-8, and answers a negative code on failure.
ZOR_TOOLKIT_EXPORT void ReplaceFile(const std::string& inPath,
                                    const std::function<HRESULT(const std::string&)>& inWrite);

}  // namespace ZORToolkit

#endif
