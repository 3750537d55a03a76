// Taking a picture of a representation.
#ifndef ZOR_TOOLS_LYRA_COMMANDS_PICTURE_H
#define ZOR_TOOLS_LYRA_COMMANDS_PICTURE_H

#include <optional>
#include <string>

#include "platform/mathematics/ZORMathVector.h"
#include "platform/visualisation/ZOR3DRep.h"
#include "toolkit/publishing/PictureOptions.h"

namespace lyra {

/// A direction to look in, without perspective.
struct PictureView {
  ZORMathVector sight;
  ZORMathVector up;
};

struct PictureOptions {
  ZORToolkit::PictureFormat format = ZORToolkit::PictureFormat::kJpeg;
  ZORToolkit::PictureSize size;
  std::optional<PictureView> view;  ///< none: from a corner, in perspective
  bool keepsBackground = false;
};

// What users write; each raises UsageError for what it does not know.
/// By the ending of the picture's name, in any letter case.
ZORToolkit::PictureFormat FormatOfPicture(const std::string& inPath);
/// "WxH", 1 to 16384 each.
ZORToolkit::PictureSize SizeOf(const std::string& inText);
inline constexpr const char* kViewWords[] = {"iso",   "front", "back",  "left",
                                             "right", "top",   "bottom"};
/// One of these words; "iso" is none. The front is seen in the direction of the y axis, z upwards;
/// the top with the y axis upwards.
std::optional<PictureView> ViewOf(const std::string& inWord);

/// Writes a picture with all of a representation framed; no file when it cannot be drawn.
void TakePicture(ZOR3DRep& inRep, const PictureOptions& inOptions, const std::string& inPath);

}  // namespace lyra

#endif
