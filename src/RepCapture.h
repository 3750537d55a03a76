// Capturing a representation off screen.
#ifndef ZOR_REP_CAPTURE_H
#define ZOR_REP_CAPTURE_H

#include "platform/system/ZORUnicodeString.h"
#include "platform/visualisation/ZORPrint3DRepImage.h"

/// Sets background and view modes.
/// @param ioSupport         may be null.
/// @param inKeepsBackground false: a white background.
/// @param inSetsViewModes   true: surfaces shaded and hidden edges off.
void SetUpSupport(ZORSupport* ioSupport, bool inKeepsBackground, bool inSetsViewModes);

/// Rasterises a print image and writes the pixels; a failure to write is ignored.
/// @return false if it could not be rasterised.
bool Capture(ZORPrint3DRepImage& ioImage, const ZORUnicodeString& inFormat,
             const ZORUnicodeString& inPath);

#endif
