// The steps that all pictures of representations share.
#ifndef ZOR_REP_CAPTURE_H
#define ZOR_REP_CAPTURE_H

#include "platform/system/ZORUnicodeString.h"
#include "platform/visualisation/ZORPrint3DRepImage.h"

/// Prepares how a print image draws.
/// @param ioSupport         may be null.
/// @param inKeepsBackground false: a white background.
/// @param inSetsViewModes   true: surfaces shaded and hidden edges off.
void SetUpSupport(ZORSupport* ioSupport, bool inKeepsBackground, bool inSetsViewModes);

/// Rasterises a print image and writes the pixels; whether writing succeeded is not looked at.
/// @return false when rasterising gave no pixels.
bool Capture(ZORPrint3DRepImage& ioImage, const ZORUnicodeString& inFormat,
             const ZORUnicodeString& inPath);

#endif
