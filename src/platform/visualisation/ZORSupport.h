// How a picture is drawn.
#ifndef ZOR_PLATFORM_VISUALISATION_ZORSUPPORT_H
#define ZOR_PLATFORM_VISUALISATION_ZORSUPPORT_H

#include "ZORPlatformExport.h"
#include "platform/ZORPlatformAdditions.h"

/// The settings of one picture's drawing. Belongs to its print image.
class ZOR_PLATFORM_EXPORT ZORSupport {
 public:
  ZORSupport();
  /// A plain background, each component 0 to 1; without this call a soft vertical gradient.
  void SetBackgroundColor(float inRed, float inGreen, float inBlue);
  /// Switches a view mode.
  /// @param inMode  1: surfaces are shaded, at first on; off: only edges are drawn. 2: edges behind
  ///                surfaces are drawn too, faintly, at first off. Unknown modes are passed over.
  /// @param inValue 0: off; else on.
  void SetViewMode(int inMode, int inValue);

#if ZOR_PLATFORM_ADDITIONS
  enum ViewMode { kShading = 1, kHiddenEdges = 2 };
  bool HasBackgroundColor() const;
  const float* GetBackgroundColor() const;  ///< three components
  int GetViewMode(int inMode) const;
#endif

 private:
  bool hasBackground_ = false;
  float background_[3] = {1, 1, 1};
  int shading_ = 1;
  int hiddenEdges_ = 0;
};

#endif
