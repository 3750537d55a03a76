// Making a picture of a representation without a screen.
#ifndef ZOR_PLATFORM_VISUALISATION_ZORPRINT3DREPIMAGE_H
#define ZOR_PLATFORM_VISUALISATION_ZORPRINT3DREPIMAGE_H

#include <memory>

#include "platform/system/ZORBaseUnknown.h"
#include "platform/visualisation/ZOR3DRep.h"
#include "platform/visualisation/ZOR3DViewpoint.h"
#include "platform/visualisation/ZORPixelImage.h"
#include "platform/visualisation/ZORSupport.h"

/// A print image of one representation, which must outlive it. Made with new, ended with Release.
class ZOR_PLATFORM_EXPORT ZORPrint3DRepImage : public ZORBaseUnknown {
 public:
  /// @param inWidth, inHeight in pixels, 1 to 16384 each; other sizes rasterise to nothing.
  ZORPrint3DRepImage(ZOR3DRep* inRep, int inWidth, int inHeight);
  ~ZORPrint3DRepImage() override;
  /// The drawing settings; this image's own, never null on the default platform.
  ZORSupport* GetSupport();
  /// The camera, at first framing all of the representation; this image's own.
  ZOR3DViewpoint* GetViewpoint();
  /// Draws the picture. The same scene gives the same pixels each time.
  /// @return a new image that the caller releases; null for an empty size or when it cannot be
  ///         drawn (no memory, no drawing library).
  ZORPixelImage* Rasterize();

 private:
  ZOR3DRep* rep_;
  int width_;
  int height_;
  ZORSupport support_;
  ZOR3DViewpoint* viewpoint_;
};

#endif
