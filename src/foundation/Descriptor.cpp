#include "foundation/Descriptor.h"

#include <unistd.h>

#include <algorithm>
#include <cerrno>

namespace ZORFoundation {

int WriteAll(int inDescriptor, std::string_view inBytes, std::size_t& outWritten) {
  for (outWritten = 0; outWritten < inBytes.size();) {
    constexpr std::size_t kMost = 1 << 30;  // what every system's call takes at a time
    const auto count =
        write(inDescriptor, inBytes.data() + outWritten,
              static_cast<unsigned int>(std::min(kMost, inBytes.size() - outWritten)));
    if (count >= 0)
      outWritten += static_cast<std::size_t>(count);
    else if (errno != EINTR)
      return errno;
  }
  return 0;
}

// An interrupted close has closed: trying again might close another's file.
int CloseDescriptor(int inDescriptor) {
  return close(inDescriptor) == 0 || errno == EINTR ? 0 : errno;
}

int CopyBytes(int inSource, int inTarget) {
  char block[1 << 16];
  for (;;) {
    const auto count = read(inSource, block, sizeof block);
    if (count == 0) return 0;
    if (count < 0 && errno == EINTR) continue;
    if (count < 0) return errno;
    std::size_t written = 0;
    const int error = WriteAll(inTarget, {block, static_cast<std::size_t>(count)}, written);
    if (error != 0) return error;
  }
}

}  // namespace ZORFoundation
