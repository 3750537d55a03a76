// Another value of the setting "PictureZoom" for this run.
#ifndef ZOR_TOOLS_LYRA_PUBLISH_ZOOMSETTING_H
#define ZOR_TOOLS_LYRA_PUBLISH_ZOOMSETTING_H

#include <filesystem>
#include <optional>

namespace lyra {

/// Settings are files, so this is one in a folder of its own, which goes with this object.
class ZoomSetting {
 public:
  /// @param inZoom nothing: the user's setting stays.
  explicit ZoomSetting(std::optional<int> inZoom);
  ~ZoomSetting();
  ZoomSetting(const ZoomSetting&) = delete;
  ZoomSetting& operator=(const ZoomSetting&) = delete;

  /// From now on this process reads no other setting of how results are published.
  void Apply() const;

 private:
  std::filesystem::path folder_;  // empty for none
};

}  // namespace lyra

#endif
