#include "toolkit/publishing/PictureSettings.h"

#include <cstdlib>

#include "platform/system/ZORSettingRepository.h"
#include "platform/system/ZORSysSettingRepository.h"

namespace ZORToolkit {
namespace {
constexpr char kSettings[] = "ClashPublish", kZoomSetting[] = "PictureZoom";

int ZoomNumber() {
  int zoom = 0;
  if (auto* const settings = ZORSettingRepository::GetRepository(kSettings))
    settings->ReadSetting(kZoomSetting, &zoom, 1);
  return zoom;
}
}  // namespace

ZoomOfOptions::ZoomOfOptions(const PublicationOptions& inOptions) {
  if (inOptions.zoom) zoom_.emplace(kSettings, kZoomSetting, static_cast<int>(*inOptions.zoom));
}

// What is no known value frames all that is shown, as another than 0 does.
PictureZoom CurrentZoom() {
  return ZoomNumber() == 0 ? PictureZoom::kInterference : PictureZoom::kProducts;
}

std::string PictureSettings() {
  int subInterferences = 0;
  if (auto* const settings = ZORSysSettingRepository::GetRepository("Clash"))
    settings->ReadAttr("ModeOfSubInterf", &subInterferences);
  const char* const switchedOn = std::getenv("TRX_VELD_SUBINTERF");
  return std::to_string(ZoomNumber()) + " " + std::to_string(subInterferences) + " " +
         (switchedOn != nullptr ? switchedOn : "");
}

}  // namespace ZORToolkit
