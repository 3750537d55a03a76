// The lock of a work folder: a file that nobody else can open, and that goes with its last handle.
#include <fcntl.h>
#include <io.h>

#include "foundation/WindowsCalls.h"
#include "toolkit/publishing/folder/WorkFolder.h"

namespace ZORToolkit {

void WorkFolder::RemoveFolder() {
  lock_.Close();  // which removes the file
  RemoveDirectoryW(ZORFoundation::WidePath(path_).c_str());
}

bool WorkFolder::TryLock() {
  const HANDLE file =
      CreateFileW(ZORFoundation::WidePath(lockPath_).c_str(), GENERIC_READ | GENERIC_WRITE | DELETE,
                  0, nullptr, CREATE_ALWAYS, FILE_FLAG_DELETE_ON_CLOSE, nullptr);
  if (file != INVALID_HANDLE_VALUE) {
    lock_ = ZORFoundation::Descriptor(
        _open_osfhandle(reinterpret_cast<std::intptr_t>(file), _O_BINARY | _O_NOINHERIT));
    return true;
  }
  const DWORD error = GetLastError();
  const bool isLocked = ZORFoundation::IsInUse(error) || error == ERROR_DELETE_PENDING;
  if (!isLocked && error != ERROR_PATH_NOT_FOUND)
    throw ZORFoundation::FileError(lockPath_, ZORFoundation::ErrorNumberOf(error));
  return false;
}

}  // namespace ZORToolkit
