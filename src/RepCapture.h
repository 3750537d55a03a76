// Capturing a representation off screen.
#ifndef ZOR_REP_CAPTURE_H
#define ZOR_REP_CAPTURE_H

#include "Teardown.h"
#include "platform/system/ZORUnicodeString.h"
#include "platform/visualisation/ZORPrint3DRepImage.h"

struct RepCapture {
  const ZORUnicodeString& path;
  const ZORUnicodeString& format;
  int width;
  int height;
  bool setsViewModes;    ///< surfaces shaded and hidden edges off
  bool keepsBackground;  ///< false: a white one
  bool releasesAlways;   ///< else, by contract, no print image that could not be rasterised
};

/// Renders a representation and writes the picture; a failure to write is ignored. Does nothing
/// without a representation.
/// @param inAim called with the print image before it is rasterised.
template <class Aim>
void CaptureRep(ZORRep* inRep, const RepCapture& inCapture, const Aim& inAim) {
  if (!inRep) return;
  auto* const image =
      new ZORPrint3DRepImage(static_cast<ZOR3DRep*>(inRep), inCapture.width, inCapture.height);
  ZORPixelImage* pixels = nullptr;
  bool isReleased = true;
  Teardown release;
  release.Add([&] {
    if (pixels) pixels->Release();
  });
  release.Add([&] {
    if (isReleased) image->Release();
  });
  if (ZORSupport* const support = image->GetSupport()) {
    if (!inCapture.keepsBackground) support->SetBackgroundColor(1.0F, 1.0F, 1.0F);
    if (inCapture.setsViewModes) {
      support->SetViewMode(1, 1);
      support->SetViewMode(2, 0);
    }
  }
  inAim(*image);
  pixels = image->Rasterize();
  isReleased = pixels || inCapture.releasesAlways;
  if (pixels) {
    constexpr int kTrueColour = 2;
    pixels->Prepare(kTrueColour);
    pixels->Write(inCapture.format.ConvertToString(), inCapture.path.ConvertToString());
  }
  release.Run();
}

#endif
