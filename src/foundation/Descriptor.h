// Open files. The functions return 0, or the errno value of what failed.
#ifndef ZOR_FOUNDATION_DESCRIPTOR_H
#define ZOR_FOUNDATION_DESCRIPTOR_H

#include <cstddef>
#include <string_view>
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

/// Copies the rest of one open file into another.
ZOR_FOUNDATION_EXPORT int CopyBytes(int inSource, int inTarget);

}  // namespace ZORFoundation

#endif
