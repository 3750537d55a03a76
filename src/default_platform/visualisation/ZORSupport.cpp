#include "platform/visualisation/ZORSupport.h"

ZORSupport::ZORSupport() = default;

void ZORSupport::SetBackgroundColor(float inRed, float inGreen, float inBlue) {
  hasBackground_ = true;
  background_[0] = inRed;
  background_[1] = inGreen;
  background_[2] = inBlue;
}

void ZORSupport::SetViewMode(int inMode, int inValue) {
  ++viewModeChanges_;
  if (inMode == kShading) shading_ = inValue;
  if (inMode == kHiddenEdges) hiddenEdges_ = inValue;
}

bool ZORSupport::HasBackgroundColor() const { return hasBackground_; }
const float* ZORSupport::GetBackgroundColor() const { return background_; }
int ZORSupport::GetViewModeChanges() const { return viewModeChanges_; }

int ZORSupport::GetViewMode(int inMode) const {
  if (inMode == kShading) return shading_;
  return inMode == kHiddenEdges ? hiddenEdges_ : 0;
}
