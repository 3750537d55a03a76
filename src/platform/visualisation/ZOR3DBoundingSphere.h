// A sphere around something.
#ifndef ZOR_PLATFORM_VISUALISATION_ZOR3DBOUNDINGSPHERE_H
#define ZOR_PLATFORM_VISUALISATION_ZOR3DBOUNDINGSPHERE_H

#include "platform/ZORPlatformAdditions.h"
#include "platform/mathematics/ZORMathVector.h"

/// A sphere in millimetres. A negative radius is the sphere around nothing, the default.
struct ZOR3DBoundingSphere {
  ZOR3DBoundingSphere() = default;

#if ZOR_PLATFORM_ADDITIONS
  ZOR3DBoundingSphere(const ZORMathVector& inCentre, double inRadius)
      : centre(inCentre), radius(inRadius) {}
  bool IsEmpty() const { return !(radius >= 0); }
#else
 private:
#endif
  ZORMathVector centre;
  [[maybe_unused]] double radius = -1;
};

#endif
