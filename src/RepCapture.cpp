#include "RepCapture.h"

void SetUpSupport(ZORSupport* ioSupport, bool inKeepsBackground, bool inSetsViewModes) {
  if (!ioSupport) return;
  if (!inKeepsBackground) ioSupport->SetBackgroundColor(1.0F, 1.0F, 1.0F);
  if (!inSetsViewModes) return;
  ioSupport->SetViewMode(1, 1);
  ioSupport->SetViewMode(2, 0);
}

bool Capture(ZORPrint3DRepImage& ioImage, const ZORUnicodeString& inFormat,
             const ZORUnicodeString& inPath) {
  constexpr int kTrueColour = 2;
  ZORPixelImage* const pixels = ioImage.Rasterize();
  if (!pixels) return false;
  pixels->Prepare(kTrueColour);
  pixels->Write(inFormat.ConvertToString(), inPath.ConvertToString());
  pixels->Release();
  return true;
}
