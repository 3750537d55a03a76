// Drawing the pictures of one interference, and the settings by which they differ.
#ifndef ZOR_TOOLKIT_PUBLISHING_PICTURES_PICTURE_DRAWING_H
#define ZOR_TOOLKIT_PUBLISHING_PICTURES_PICTURE_DRAWING_H

#include <optional>
#include <string>

#include "default_platform/SettingOverride.h"
#include "toolkit/publishing/Publication.h"
#include "toolkit/publishing/pictures/PictureStore.h"

namespace ZORToolkit {

/// While this lives, the setting "PictureZoom" has the value of the options, if they have one.
class ZoomOfOptions {
 public:
  explicit ZoomOfOptions(const PublicationOptions& inOptions);

 private:
  std::optional<ZORDefault::SettingOverride> zoom_;
};

/// All settings by which pictures differ, as one text.
std::string PictureSettings();

/// The file of an interference's camera, in the folder of unfinished pictures.
std::string CameraName(int inNumber);

/// Draws in the folder of unfinished pictures, which is the current directory, so that no text has
/// to hold its path.
class PictureDrawing {
 public:
  PictureDrawing(int inNumber, const ResolvedInterference& inResolved, const PictureStore& inStore,
                 const PublicationOptions& inOptions);

  /// Without previews and camera.
  void DrawAlone() const { DrawMain(); }
  void Draw() const;

 private:
  void DrawMain() const;
  void DrawPreview(std::size_t inProduct) const;

  int number_;
  ZORDefault::InterferenceScene scene_;
  const PictureStore& store_;
  PictureSize size_;
  ZORUnicodeString format_;
};

}  // namespace ZORToolkit

#endif
