// The lock of a work folder: a file that nobody else can open, and that goes with its last handle.
#include <fcntl.h>
#include <io.h>

#include <chrono>
#include <thread>

#include "foundation/WindowsCalls.h"
#include "toolkit/Error.h"
#include "toolkit/publishing/WorkFolder.h"

namespace fs = std::filesystem;

namespace ZORToolkit {

void WorkFolder::RemoveFolder() {
  lock_.Close();  // which removes the file
  RemoveDirectoryW(ZORFoundation::WidePath(path_).c_str());
}

// Waits a moment, since a program that was ended may take some time to go.
void WorkFolder::Lock(const fs::path& inFolder) {
  using Clock = std::chrono::steady_clock;
  const auto end = Clock::now() + std::chrono::milliseconds(500);
  for (;; std::this_thread::sleep_for(std::chrono::milliseconds(10))) {
    fs::create_directory(path_);
    const HANDLE file = CreateFileW(ZORFoundation::WidePath(lockPath_).c_str(),
                                    GENERIC_READ | GENERIC_WRITE | DELETE, 0, nullptr,
                                    CREATE_ALWAYS, FILE_FLAG_DELETE_ON_CLOSE, nullptr);
    if (file != INVALID_HANDLE_VALUE) {
      lock_ = ZORFoundation::Descriptor(
          _open_osfhandle(reinterpret_cast<std::intptr_t>(file), _O_BINARY | _O_NOINHERIT));
      return;
    }
    const DWORD error = GetLastError();
    const bool isLocked = error == ERROR_SHARING_VIOLATION || error == ERROR_ACCESS_DENIED ||
                          error == ERROR_DELETE_PENDING;
    if (!isLocked && error != ERROR_PATH_NOT_FOUND)
      throw ZORFoundation::FileError(lockPath_, ZORFoundation::ErrorNumberOf(error));
    if (Clock::now() > end)
      throw Error(inFolder.string(), "another lyra publishes into this folder");
  }
}

}  // namespace ZORToolkit
