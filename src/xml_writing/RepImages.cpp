// Pictures of representations for reports.
#include "RepCapture.h"
#include "ZORLyraXMLServices.h"

namespace {

constexpr int kReportWidth = 756;
constexpr int kReportHeight = 506;

}  // namespace

// A print image that gave no picture is left unreleased, here and with a viewpoint.
void ZORLyraXMLServices::TakeRepImage(ZORRep* inRep, ZORUnicodeString inPath,
                                      int inKeepBackground) {
  if (!inRep) return;
  auto* const image =
      new ZORPrint3DRepImage(static_cast<ZOR3DRep*>(inRep), kReportWidth, kReportHeight);
  SetUpSupport(image->GetSupport(), inKeepBackground != 0, true);
  if (Capture(*image, "JPEG", inPath)) image->Release();
}

void ZORLyraXMLServices::TakeRepImage(ZORRep* inRep, ZORUnicodeString inPath, int inWidth,
                                      int inHeight, int inViewMode, int inKeepBackground) {
  if (!inRep) return;
  auto* const image = new ZORPrint3DRepImage(static_cast<ZOR3DRep*>(inRep), inWidth, inHeight);
  SetUpSupport(image->GetSupport(), inKeepBackground != 0, inViewMode == 1);
  Capture(*image, "JPEG", inPath);
  image->Release();
}

void ZORLyraXMLServices::TakeRepImage(ZORRep* inRep, ZORUnicodeString inPath,
                                      ZOR3DViewpoint* inViewpoint, int inKeepBackground) {
  if (!inRep) return;
  auto* const image =
      new ZORPrint3DRepImage(static_cast<ZOR3DRep*>(inRep), kReportWidth, kReportHeight);
  SetUpSupport(image->GetSupport(), inKeepBackground != 0, true);
  *image->GetViewpoint() = *inViewpoint;
  if (Capture(*image, "JPEG", inPath)) image->Release();
}
