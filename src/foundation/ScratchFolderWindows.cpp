#include <cerrno>
#include <filesystem>

#include "foundation/Hash.h"
#include "foundation/ScratchFolder.h"
#include "foundation/WindowsCalls.h"

namespace fs = std::filesystem;

namespace ZORFoundation {

ScratchFolder::ScratchFolder() {
  const std::string folder = fs::temp_directory_path().string();
  DWORD error = ERROR_SUCCESS;
  do {
    LARGE_INTEGER ticks{};
    QueryPerformanceCounter(&ticks);
    path_ = folder + "/lyra-" +
            HexText(Hash64Of(std::to_string(GetCurrentProcessId()),
                             static_cast<std::uint64_t>(ticks.QuadPart)));
    error = CreateDirectoryW(WidePath(path_).c_str(), nullptr) != FALSE ? ERROR_SUCCESS
                                                                        : GetLastError();
  } while (error == ERROR_ALREADY_EXISTS);
  if (error != ERROR_SUCCESS) throw FileError(path_, ErrorNumberOf(error));
}

ScratchFolder::~ScratchFolder() {
  std::error_code ignored;
  fs::remove_all(path_, ignored);
}

}  // namespace ZORFoundation
