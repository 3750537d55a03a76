// Pictures of representations for reports.
#include "ZORLyraXMLServices.h"
#include "platform/visualisation/ZORPrint3DRepImage.h"

namespace {

constexpr int kReportWidth = 756;
constexpr int kReportHeight = 506;
constexpr int kTrueColour = 2;

void SetUp(ZORSupport* ioSupport, bool inKeepsBackground, bool inSetsViewModes) {
  if (!ioSupport) return;
  if (!inKeepsBackground) ioSupport->SetBackgroundColor(1.0F, 1.0F, 1.0F);
  if (!inSetsViewModes) return;
  ioSupport->SetViewMode(1, 1);
  ioSupport->SetViewMode(2, 0);
}

/// @return false when rasterising gave no picture; whether writing succeeded is not looked at.
bool Capture(ZORPrint3DRepImage& ioImage, const ZORUnicodeString& inPath) {
  ZORPixelImage* const pixels = ioImage.Rasterize();
  if (!pixels) return false;
  pixels->Prepare(kTrueColour);
  pixels->Write("JPEG", inPath.ConvertToString());
  pixels->Release();
  return true;
}

}  // namespace

// A print image that gave no picture is left unreleased, here and with a viewpoint.
void ZORLyraXMLServices::TakeRepImage(ZORRep* inRep, ZORUnicodeString inPath,
                                      int inKeepBackground) {
  if (!inRep) return;
  auto* const image =
      new ZORPrint3DRepImage(static_cast<ZOR3DRep*>(inRep), kReportWidth, kReportHeight);
  SetUp(image->GetSupport(), inKeepBackground != 0, true);
  if (Capture(*image, inPath)) image->Release();
}

void ZORLyraXMLServices::TakeRepImage(ZORRep* inRep, ZORUnicodeString inPath, int inWidth,
                                      int inHeight, int inViewMode, int inKeepBackground) {
  if (!inRep) return;
  auto* const image = new ZORPrint3DRepImage(static_cast<ZOR3DRep*>(inRep), inWidth, inHeight);
  SetUp(image->GetSupport(), inKeepBackground != 0, inViewMode == 1);
  Capture(*image, inPath);
  image->Release();
}

void ZORLyraXMLServices::TakeRepImage(ZORRep* inRep, ZORUnicodeString inPath,
                                      ZOR3DViewpoint* inViewpoint, int inKeepBackground) {
  if (!inRep) return;
  auto* const image =
      new ZORPrint3DRepImage(static_cast<ZOR3DRep*>(inRep), kReportWidth, kReportHeight);
  SetUp(image->GetSupport(), inKeepBackground != 0, true);
  *image->GetViewpoint() = *inViewpoint;
  if (Capture(*image, inPath)) image->Release();
}
