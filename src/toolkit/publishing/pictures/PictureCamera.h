// The camera of the picture of an interference.
#ifndef ZOR_TOOLKIT_PUBLISHING_PICTURES_PICTURE_CAMERA_H
#define ZOR_TOOLKIT_PUBLISHING_PICTURES_PICTURE_CAMERA_H

#include <array>
#include <optional>
#include <string>

#include "default_platform/InterferenceScene.h"
#include "platform/visualisation/ZOR3DRep.h"
#include "toolkit/publishing/PictureOptions.h"

namespace ZORToolkit {

/// A camera as numbers: "perspective" or "orthographic", then the eye, the direction of sight and
/// up, then the distance of what is looked at, the full vertical angle in radians (perspective) or
/// the height that is shown (orthographic), the near and the far plane (0: none).
struct PictureCamera {
  bool isPerspective = true;
  ZORMathVector eye, sight, up;
  double focusDistance = 1, angle = 0.5, height = 1, nearPlane = 0, farPlane = 0;
};

/// The camera with which PrintPictures takes a picture of the scene.
/// @param inFramesInterference whether it frames the interference alone.
PictureCamera CameraOf(const ZORDefault::InterferenceScene& inScene, PictureSize inSize,
                       bool inFramesInterference);

/// The distance up to which a camera has to see to show both products of the scene whole.
double DepthOf(const ZORDefault::InterferenceScene& inScene, const PictureCamera& inCamera);

/// A camera that shows all of a representation from a corner.
PictureCamera OverviewCamera(const ZOR3DRep& inRep, PictureSize inSize);

/// Projects a point to the picture: shares of its width and height, from the left and the top.
/// Nothing for a point behind the camera or outside of the picture.
std::optional<std::array<double, 2>> Seen(const PictureCamera& inCamera, PictureSize inSize,
                                          const ZORMathVector& inPoint);

// A line of text, so that a process that draws can hand it to another.
std::string TextOf(const PictureCamera& inCamera);
std::optional<PictureCamera> CameraFrom(const std::string& inText);

}  // namespace ZORToolkit

#endif
