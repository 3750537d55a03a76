// Drawing the pictures of one interference.
#ifndef ZOR_TOOLKIT_PUBLISHING_PICTURE_DRAWING_H
#define ZOR_TOOLKIT_PUBLISHING_PICTURE_DRAWING_H

#include <algorithm>
#include <string>

#include "PrintPictures.h"
#include "foundation/AtomicFile.h"
#include "toolkit/publishing/PictureSettings.h"
#include "toolkit/publishing/PictureStore.h"
#include "toolkit/publishing/viewer/PictureCamera.h"
#include "toolkit/records/DocumentText.h"

namespace ZORToolkit {

/// In the folder of unfinished pictures.
inline std::string CameraName(int inNumber) {
  return std::string("camera_").append(std::to_string(inNumber));
}

/// Draws in the folder of unfinished pictures, which is the current one: no text has to carry its path.
class PictureDrawing {
 public:
  PictureDrawing(int inNumber, const ResolvedInterference& inResolved, const PictureStore& inStore,
                 const PublicationOptions& inOptions)
      : number_(inNumber),
        scene_(MakeScene(inResolved)),
        store_(inStore),
        size_(inOptions.size),
        format_(FormatName(inOptions.format)) {}

  /// Without previews and camera.
  void DrawAlone() const { DrawMain(); }
  void Draw() const {
    for (std::size_t i = 0; i < 2; ++i) DrawPreview(i);
    DrawMain();
    const bool framesInterference = CurrentZoom() == PictureZoom::kInterference;
    ZORFoundation::WriteWholeFile(CameraName(number_),
                                  TextOf(CameraOf(scene_, size_, framesInterference)));
  }

 private:
  static constexpr char kFound[] = "";  // no path: the products are found already

  void DrawMain() const {
    if (store_.Has(store_.PictureName(number_))) return;
    PrintPictures::PrintListVisuToFile(scene_.products[0], kFound, scene_.products[1], kFound,
                                       scene_.interference, FromUtf8(store_.PictureName(number_)),
                                       format_, size_.width, size_.height, 1, 0);
    store_.Finish(number_);
  }

  void DrawPreview(std::size_t inProduct) const {
    const std::string name = store_.PreviewName(number_, inProduct);
    if (scene_.products[inProduct].IsNull() || store_.Has(name)) return;
    PrintPictures::PrintListVisuToFilePreview(scene_.products[inProduct], kFound, FromUtf8(name),
                                              format_, std::max(1, size_.width / 2),
                                              std::max(1, size_.height / 2), 1, 0);
    store_.FinishPreview(number_, inProduct);
  }

  int number_;
  ZORDefault::InterferenceScene scene_;
  const PictureStore& store_;
  PictureSize size_;
  ZORUnicodeString format_;
};

}  // namespace ZORToolkit

#endif
