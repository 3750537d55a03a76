#include "foundation/ScratchFolder.h"

#include <cerrno>
#include <cstdlib>
#include <filesystem>

#include "foundation/Descriptor.h"

namespace fs = std::filesystem;

namespace ZORFoundation {

ScratchFolder::ScratchFolder() : path_((fs::temp_directory_path() / "lyra-XXXXXX").string()) {
  if (mkdtemp(path_.data()) == nullptr) throw FileError(path_, errno);
}

ScratchFolder::~ScratchFolder() {
  std::error_code ignored;
  fs::remove_all(path_, ignored);
}

}  // namespace ZORFoundation
