// How a picture is drawn.
#ifndef ZOR_PLATFORM_VISUALISATION_ZORSUPPORT_H
#define ZOR_PLATFORM_VISUALISATION_ZORSUPPORT_H

#include "ZORPlatformExport.h"

/// The settings of one picture's drawing. Belongs to its print image.
class ZOR_PLATFORM_EXPORT ZORSupport {
 public:
  /// What SetViewMode switches; each is on with a value that is not 0.
  enum ViewMode {
    kShading = 1,     ///< surfaces are shaded; off: only edges are drawn. On at first.
    kHiddenEdges = 2  ///< edges behind surfaces are drawn too, faintly. Off at first.
  };

  ZORSupport();
  /// A plain background, each component 0 to 1; without this call a soft vertical gradient.
  void SetBackgroundColor(float inRed, float inGreen, float inBlue);
  /// Switches a view mode; unknown modes are passed over.
  void SetViewMode(int inMode, int inValue);
  bool HasBackgroundColor() const;
  const float* GetBackgroundColor() const;  ///< three components
  int GetViewMode(int inMode) const;
  /// How often SetViewMode was called.
  int GetViewModeChanges() const;

 private:
  bool hasBackground_ = false;
  float background_[3] = {1, 1, 1};
  int shading_ = 1;
  int hiddenEdges_ = 0;
  int viewModeChanges_ = 0;
};

#endif
