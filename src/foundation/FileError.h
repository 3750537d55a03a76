// Why a file could not be read or written.
#ifndef ZOR_FOUNDATION_FILEERROR_H
#define ZOR_FOUNDATION_FILEERROR_H

#include <stdexcept>
#include <string>
#include <system_error>

#include "ZORFoundationExport.h"

namespace ZORFoundation {

/// A file operation failed. Its text is "PATH: REASON".
class ZOR_FOUNDATION_EXPORT FileError : public std::runtime_error {
 public:
  /// @param inCode an errno value, whose text is the reason.
  FileError(const std::string& inPath, int inCode)
      : FileError(inPath, inCode, std::generic_category().message(inCode)) {}
  FileError(const std::string& inPath, int inCode, const std::string& inReason)
      : std::runtime_error(inPath + ": " + inReason), reasonStart_(inPath.size() + 2) {
    code_ = inCode;
  }

  /// The errno value; ESPIPE for what is neither a file nor a folder, EFBIG for what is too large.
  int Code() const { return code_; }
  std::string Path() const { return std::string(what(), reasonStart_ - 2); }
  std::string Reason() const { return what() + reasonStart_; }

 private:
  std::size_t reasonStart_;
  int code_ = 0;
};

}  // namespace ZORFoundation

#endif
