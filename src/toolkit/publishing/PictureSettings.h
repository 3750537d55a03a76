// The settings by which pictures differ.
#ifndef ZOR_TOOLKIT_PUBLISHING_PICTURE_SETTINGS_H
#define ZOR_TOOLKIT_PUBLISHING_PICTURE_SETTINGS_H

#include <optional>
#include <string>

#include "default_platform/SettingOverride.h"
#include "toolkit/publishing/Publication.h"

namespace ZORToolkit {

/// While this lives, the setting is what the options say, if they do.
class ZoomOfOptions {
 public:
  explicit ZoomOfOptions(const PublicationOptions& inOptions);

 private:
  std::optional<ZORDefault::SettingOverride> zoom_;
};

PictureZoom CurrentZoom();
/// All of them, as one text.
std::string PictureSettings();

}  // namespace ZORToolkit

#endif
