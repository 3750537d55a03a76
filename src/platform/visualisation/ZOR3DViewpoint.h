// A camera.
#ifndef ZOR_PLATFORM_VISUALISATION_ZOR3DVIEWPOINT_H
#define ZOR_PLATFORM_VISUALISATION_ZOR3DVIEWPOINT_H

#include "platform/ZORPlatformAdditions.h"
#include "platform/mathematics/ZORMathVector.h"
#include "platform/system/ZORBaseUnknown.h"
#include "platform/visualisation/ZOR3DBoundingSphere.h"

/// Where a picture is taken from. Lengths in millimetres, angles in radians, right-handed. The
/// default looks from a corner (direction (-1, -1, -1), z upwards), conic.
class ZOR_PLATFORM_EXPORT ZOR3DViewpoint : public ZORBaseUnknown {
 public:
  ZOR3DViewpoint();
  /// A copy has its own reference count.
  ZOR3DViewpoint(const ZOR3DViewpoint& inOther);
  /// Takes the camera over; the reference count stays this object's own.
  ZOR3DViewpoint& operator=(const ZOR3DViewpoint& inOther);
  ~ZOR3DViewpoint() override;

  /// Moves the camera along its direction so that a sphere fills a picture of the given width and
  /// height (any unit; the last two arguments scale them, both 1.0 normally). An empty sphere, or
  /// one of radius 0, is framed as a sphere of 1 mm.
  void Reframe(float inWidth, float inHeight, float inWidthScale, float inHeightScale,
               const ZOR3DBoundingSphere& inSphere);
  /// Frames all that the print image that owns this viewpoint shows; without owner, as above with
  /// an empty sphere.
  void Reframe(float inWidth, float inHeight, float inWidthScale, float inHeightScale);

#if !ZOR_PLATFORM_ADDITIONS
 private:
#endif
  enum Projection { kConic, kCylindric };
  Projection projection = kConic;
  ZORMathVector origin;  ///< where the eye is
  ZORMathVector sight;   ///< unit vector into the picture
  ZORMathVector up;      ///< unit vector, not parallel to sight
  double focusDistance;  ///< from the eye to what is looked at
  double viewAngle;      ///< conic: full vertical angle
  double viewHeight;     ///< cylindric: what the picture's height shows
  double nearPlane = 0;  ///< distances from the eye; far 0: not limited
  double farPlane = 0;

 private:
  friend class ZORPrint3DRepImage;
  ZOR3DBoundingSphere scene_;  // of the owning print image
};

#endif
