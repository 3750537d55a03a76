// Where the picture of an interference is taken from.
#ifndef ZOR_TOOLKIT_PUBLISHING_PICTURES_PICTURE_CAMERA_H
#define ZOR_TOOLKIT_PUBLISHING_PICTURES_PICTURE_CAMERA_H

#include <array>
#include <optional>
#include <string>

#include "default_platform/InterferenceScene.h"
#include "platform/visualisation/ZOR3DRep.h"
#include "toolkit/publishing/PictureOptions.h"

namespace ZORToolkit {

/// A camera as numbers: "perspective" or "orthographic", then the eye, the direction of sight and up,
/// then the distance of what is looked at, the full vertical angle in radians (perspective) or the
/// height that is shown (orthographic), the near and the far plane (0: none).
struct PictureCamera {
  bool isPerspective = true;
  ZORMathVector eye, sight, up;
  double focusDistance = 1, angle = 0.5, height = 1, nearPlane = 0, farPlane = 0;
};

/// The camera with which PrintPictures takes a picture of the scene.
/// @param inFramesInterference whether it frames the interference alone.
PictureCamera CameraOf(const ZORDefault::InterferenceScene& inScene, PictureSize inSize,
                       bool inFramesInterference);

/// How deep a camera sees until both products of the scene lie before that.
double DepthOf(const ZORDefault::InterferenceScene& inScene, const PictureCamera& inCamera);

/// The camera with which all of a representation is shown from a corner.
PictureCamera OverviewCamera(const ZOR3DRep& inRep, PictureSize inSize);

/// Where a camera sees a point: shares of the picture's width and height, from its left and its top.
/// Nothing for what is behind it or beside the picture.
std::optional<std::array<double, 2>> Seen(const PictureCamera& inCamera, PictureSize inSize,
                                          const ZORMathVector& inPoint);

// A line of text, so that a process that draws can hand it to another.
std::string TextOf(const PictureCamera& inCamera);
std::optional<PictureCamera> CameraFrom(const std::string& inText);

}  // namespace ZORToolkit

#endif
