#include "toolkit/publishing/pictures/PictureDrawing.h"

#include <algorithm>
#include <cstdlib>

#include "PrintPictures.h"
#include "foundation/AtomicFile.h"
#include "platform/system/ZORSettingRepository.h"
#include "platform/system/ZORSysSettingRepository.h"
#include "toolkit/publishing/pictures/PictureCamera.h"
#include "toolkit/records/DocumentText.h"

namespace ZORToolkit {
namespace {

constexpr char kSettings[] = "ClashPublish", kZoomSetting[] = "PictureZoom";
constexpr char kFound[] = "";  // no path: the products are resolved already

int ZoomNumber() {
  int zoom = 0;
  if (auto* const settings = ZORSettingRepository::GetRepository(kSettings))
    settings->ReadSetting(kZoomSetting, &zoom, 1);
  return zoom;
}

// Any value but 0 frames all that is shown, unknown ones too.
PictureZoom CurrentZoom() {
  return ZoomNumber() == 0 ? PictureZoom::kInterference : PictureZoom::kProducts;
}

}  // namespace

ZoomOfOptions::ZoomOfOptions(const PublicationOptions& inOptions) {
  if (inOptions.zoom) zoom_.emplace(kSettings, kZoomSetting, static_cast<int>(*inOptions.zoom));
}

std::string PictureSettings() {
  int subInterferences = 0;
  if (auto* const settings = ZORSysSettingRepository::GetRepository("Clash"))
    settings->ReadAttr("ModeOfSubInterf", &subInterferences);
  const char* const switchedOn = std::getenv("TRX_VELD_SUBINTERF");
  return std::to_string(ZoomNumber()) + " " + std::to_string(subInterferences) + " " +
         (switchedOn != nullptr ? switchedOn : "");
}

std::string CameraName(int inNumber) {
  return std::string("camera_").append(std::to_string(inNumber));
}

PictureDrawing::PictureDrawing(int inNumber, const ResolvedInterference& inResolved,
                               const PictureStore& inStore, const PublicationOptions& inOptions)
    : number_(inNumber),
      scene_(MakeScene(inResolved)),
      store_(inStore),
      size_(inOptions.size),
      format_(FormatName(inOptions.format)) {}

void PictureDrawing::Draw() const {
  for (std::size_t i = 0; i < 2; ++i) DrawPreview(i);
  DrawMain();
  const bool framesInterference = CurrentZoom() == PictureZoom::kInterference;
  ZORFoundation::WriteWholeFile(CameraName(number_),
                                TextOf(CameraOf(scene_, size_, framesInterference)));
}

void PictureDrawing::DrawMain() const {
  if (store_.Has(store_.PictureName(number_))) return;
  PrintPictures::PrintListVisuToFile(scene_.products[0], kFound, scene_.products[1], kFound,
                                     scene_.interference, FromUtf8(store_.PictureName(number_)),
                                     format_, size_.width, size_.height, 1, 0);
  store_.Finish(number_);
}

void PictureDrawing::DrawPreview(std::size_t inProduct) const {
  const std::string name = store_.PreviewName(number_, inProduct);
  if (scene_.products[inProduct].IsNull() || store_.Has(name)) return;
  PrintPictures::PrintListVisuToFilePreview(scene_.products[inProduct], kFound, FromUtf8(name),
                                            format_, std::max(1, size_.width / 2),
                                            std::max(1, size_.height / 2), 1, 0);
  store_.FinishPreview(number_, inProduct);
}

}  // namespace ZORToolkit
