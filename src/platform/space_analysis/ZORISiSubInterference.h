// A part of an interference.
#ifndef ZOR_PLATFORM_SPACE_ANALYSIS_ZORISISUBINTERFERENCE_H
#define ZOR_PLATFORM_SPACE_ANALYSIS_ZORISISUBINTERFERENCE_H

#include "platform/system/ZORInterfaceHandle.h"

class ZOR3DViewpoint;

/// One of the places at which the products of an interference meet.
class ZOR_PLATFORM_EXPORT ZORISiSubInterference : public ZORBaseUnknown {
 public:
  static const IID& ClassId();
  /// Sets a viewpoint to this place's own.
  /// @return non-zero when it has one; otherwise the viewpoint is untouched.
  virtual int FillViewpoint(ZOR3DViewpoint* ioViewpoint) = 0;
};

typedef ZORInterfaceHandle<ZORISiSubInterference> ZORISiSubInterference_var;

#endif
