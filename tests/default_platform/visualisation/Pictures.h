// Drawing scenes in tests.
#ifndef ZOR_TESTS_DEFAULT_PLATFORM_VISUALISATION_PICTURES_H
#define ZOR_TESTS_DEFAULT_PLATFORM_VISUALISATION_PICTURES_H

#include <functional>

#include "platform/visualisation/ZORPrint3DRepImage.h"
#include "support/Picture.h"

namespace pictures {

using support::Picture;

typedef std::function<void(ZORPrint3DRepImage&)> SetUp;

/// Draws a representation; inSetUp may change viewpoint and settings first.
inline Picture Draw(ZOR3DRep* inRep, int inWidth, int inHeight, const SetUp& inSetUp = nullptr) {
  auto* const image = new ZORPrint3DRepImage(inRep, inWidth, inHeight);
  if (inSetUp) inSetUp(*image);
  Picture picture{inWidth, inHeight, {}};
  if (ZORPixelImage* const pixels = image->Rasterize()) {
    picture.pixels = pixels->GetPixels();
    pixels->Release();
  }
  image->Release();
  return picture;
}

inline void White(ZORPrint3DRepImage& ioImage) {
  ioImage.GetSupport()->SetBackgroundColor(1, 1, 1);
}

/// From the front, along y, cylindric: one millimetre is inPixels pixels.
inline SetUp FromFront(double inPixelsPerMillimetre, const ZORMathVector& inCentre = {}) {
  return [=](ZORPrint3DRepImage& ioImage) {
    White(ioImage);
    ZOR3DViewpoint& viewpoint = *ioImage.GetViewpoint();
    viewpoint.projection = ZOR3DViewpoint::kCylindric;
    viewpoint.sight = {0, 1, 0};
    viewpoint.up = {0, 0, 1};
    viewpoint.origin = {inCentre.x, inCentre.y - 1000, inCentre.z};
    viewpoint.viewHeight = 100 / inPixelsPerMillimetre;  // of a picture 100 pixels high
  };
}

}  // namespace pictures

#endif
