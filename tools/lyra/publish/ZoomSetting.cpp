#include "lyra/publish/ZoomSetting.h"

#include <cstdlib>
#include <fstream>
#include <string>

#include "lyra/CommandErrors.h"

namespace fs = std::filesystem;

namespace lyra {

ZoomSetting::ZoomSetting(std::optional<int> inZoom) {
  if (!inZoom) return;
  std::string pattern = (fs::temp_directory_path() / "lyra-zoom-XXXXXX").string();
  if (mkdtemp(pattern.data()) == nullptr)
    throw InputError("no folder can be made in " + fs::temp_directory_path().string());
  folder_ = pattern;
  std::ofstream stream(folder_ / "ClashPublish.toml");
  stream << "PictureZoom = " << *inZoom << "\n";
  if (!stream.flush()) throw InputError(folder_.string() + ": cannot be written");
}

ZoomSetting::~ZoomSetting() {
  std::error_code ignored;
  if (!folder_.empty()) fs::remove_all(folder_, ignored);
}

void ZoomSetting::Apply() const {
  if (folder_.empty()) return;
  const char* const others = std::getenv("ZOR_SETTINGS_PATH");
  std::string path = folder_.string();
  if (others != nullptr) path.append(1, ':').append(others);
  setenv("ZOR_SETTINGS_PATH", path.c_str(), 1);
}

}  // namespace lyra
