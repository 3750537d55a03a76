// Open files. The functions return 0, or the errno value of what failed; others raise it as
// FileError.
#ifndef ZOR_FOUNDATION_DESCRIPTOR_H
#define ZOR_FOUNDATION_DESCRIPTOR_H

#include <cstddef>
#include <cstdio>
#include <stdexcept>
#include <string>
#include <string_view>
#include <system_error>
#include <utility>

#include "ZORFoundationExport.h"

namespace ZORFoundation {

/// Writes all the bytes.
/// @param outWritten the number really written, also after a failure.
ZOR_FOUNDATION_EXPORT int WriteAll(int inDescriptor, std::string_view inBytes,
                                   std::size_t& outWritten);

/// Closes an open file. Written bytes may be lost when this fails.
ZOR_FOUNDATION_EXPORT int CloseDescriptor(int inDescriptor);

/// A file descriptor, closed when the scope ends.
class Descriptor {
 public:
  explicit Descriptor(int inDescriptor = -1) : descriptor_(inDescriptor) {}
  Descriptor(Descriptor&& ioOther) noexcept : descriptor_(std::exchange(ioOther.descriptor_, -1)) {}
  Descriptor& operator=(Descriptor&& ioOther) noexcept {
    std::swap(descriptor_, ioOther.descriptor_);
    return *this;
  }
  ~Descriptor() { Close(); }

  bool IsOpen() const { return descriptor_ >= 0; }
  int Get() const { return descriptor_; }
  int Release() { return std::exchange(descriptor_, -1); }
  int Close() { return IsOpen() ? CloseDescriptor(Release()) : 0; }

 private:
  int descriptor_;
};

/// Opens a file as a stream of the C library, which makes or empties it.
/// @return null when that failed; errno says why.
ZOR_FOUNDATION_EXPORT std::FILE* OpenStream(const std::string& inPath);

/// Copies the rest of one open file into another.
ZOR_FOUNDATION_EXPORT int CopyBytes(int inSource, int inTarget);

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
