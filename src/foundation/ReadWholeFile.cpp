#include "foundation/ReadWholeFile.h"

#include <unistd.h>

#include <algorithm>
#include <cerrno>

namespace ZORFoundation {
namespace {

void CheckSize(std::uint64_t inSize, std::uint64_t inMaxSize, const std::string& inPath) {
  if (inSize > inMaxSize) throw FileError(inPath, EFBIG);
}

}  // namespace

std::size_t ReadSome(int inDescriptor, void* outBytes, std::size_t inMax,
                     const std::string& inName) {
  constexpr std::size_t kMaxAtOnce = 1 << 30;  // what every system's call takes
  for (;;) {
    const auto count =
        read(inDescriptor, outBytes, static_cast<unsigned int>(std::min(inMax, kMaxAtOnce)));
    if (count >= 0) return static_cast<std::size_t>(count);
    if (errno != EINTR) throw FileError(inName, errno);
  }
}

void Rewind(int inDescriptor, const std::string& inName) {
  if (lseek(inDescriptor, 0, SEEK_SET) != 0) throw FileError(inName, errno);
}

std::string ReadToEnd(int inDescriptor, const std::string& inName, std::uint64_t inMaxSize) {
  std::string bytes;
  // Growing step by step would copy large files several times.
  if (const std::uint64_t size = StampOfOpen(inDescriptor, inName).size; size > 0) {
    CheckSize(size, inMaxSize, inName);
    bytes.reserve(static_cast<std::size_t>(size));
  }
  char part[1 << 16];
  while (const std::size_t count = ReadSome(inDescriptor, part, sizeof part, inName)) {
    bytes.append(part, count);
    CheckSize(bytes.size(), inMaxSize, inName);
  }
  return bytes;
}

WholeFile ReadWholeFile(const std::string& inPath, const ReadOptions& inOptions) {
  const Descriptor file = OpenForReading(inPath, inOptions.mayBeStream);
  WholeFile whole;
  whole.before = StampOfOpen(file.Get(), inPath);
  whole.bytes = ReadToEnd(file.Get(), inPath, inOptions.maxSize);
  whole.after = StampOfOpen(file.Get(), inPath);
  return whole;
}

std::optional<WholeFile> TryReadWholeFile(const std::string& inPath, const ReadOptions& inOptions) {
  try {
    return ReadWholeFile(inPath, inOptions);
  } catch (const FileError&) {
    return std::nullopt;
  }
}

}  // namespace ZORFoundation
