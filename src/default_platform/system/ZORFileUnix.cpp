#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>

#include "default_platform/system/FileOperations.h"
#include "foundation/Descriptor.h"
#include "foundation/Utf8.h"

namespace ZORDefault {
namespace {

int FlagsOf(FileMode inMode) {
  switch (inMode) {
    case FileMode::kRead:
      return O_RDONLY;
    case FileMode::kReplace:
      return O_WRONLY | O_CREAT | O_TRUNC;
    case FileMode::kAppend:
      break;
  }
  return O_WRONLY | O_CREAT | O_APPEND;
}

}  // namespace

std::string NarrowPath(const wchar_t* inPath) {
  std::string narrow;
  for (; inPath && *inPath; ++inPath) {
    const char32_t character = static_cast<char32_t>(*inPath);
    if (character > 0x10FFFF || (character >= 0xD800 && character <= 0xDFFF)) return std::string();
    char bytes[4];
    narrow.append(bytes, ZORFoundation::EncodeCharacter(character, bytes));
  }
  return narrow;
}

int OpenFile(const std::string& inPath, FileMode inMode) {
  ZORFoundation::Descriptor file(open(inPath.c_str(), FlagsOf(inMode) | O_CLOEXEC, 0666));
  struct stat status;
  if (!file.IsOpen() || fstat(file.Get(), &status) != 0) return -1;
  if (!S_ISDIR(status.st_mode)) return file.Release();
  file.Close();
  errno = EISDIR;
  return -1;
}

unsigned int PermissionsOf(int inDescriptor) {
  struct stat status;
  return fstat(inDescriptor, &status) == 0 ? status.st_mode & 0777 : 0600;
}

}  // namespace ZORDefault

int ZORFileAccess(const char* inPath, int inMode) {
  if (!inPath || (inMode & ~6) != 0) return -1;
  const int read = inMode & 4 ? R_OK : 0;
  const int write = inMode & 2 ? W_OK : 0;
  return access(inPath, F_OK | read | write);
}
