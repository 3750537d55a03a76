#include "platform/visualisation/ZORPrint3DRepImage.h"

#include <new>
#include <utility>

#include "default_platform/system/ObjectCounters.h"
#include "default_platform/visualisation/Rendering.h"
#include "platform/visualisation/ZORPixelImage.h"

ZORPrint3DRepImage::ZORPrint3DRepImage(ZOR3DRep* inRep, int inWidth, int inHeight)
    : rep_(inRep), width_(inWidth), height_(inHeight), viewpoint_(new ZOR3DViewpoint) {
  ++ZORDefault::CounterOf<ZORPrint3DRepImage>("ZORPrint3DRepImage").built;
  if (rep_) viewpoint_->scene_ = rep_->GetShowBoundingElement();
  viewpoint_->Reframe(static_cast<float>(width_), static_cast<float>(height_), 1, 1);
}

ZORPrint3DRepImage::~ZORPrint3DRepImage() {
  viewpoint_->Release();
  ++ZORDefault::CounterOf<ZORPrint3DRepImage>("ZORPrint3DRepImage").released;
}

ZORSupport* ZORPrint3DRepImage::GetSupport() { return &support_; }
ZOR3DViewpoint* ZORPrint3DRepImage::GetViewpoint() { return viewpoint_; }

ZORPixelImage* ZORPrint3DRepImage::Rasterize() try {
  if (!rep_ || !ZORDefault::IsPictureSize(width_, height_)) return nullptr;
  const ZORDefault::RayCaster* const rayCaster = ZORDefault::LoadRayCaster();
  if (!rayCaster) return nullptr;
  const ZORDefault::PictureRequest request =
      ZORDefault::MakePictureRequest(*rep_, *viewpoint_, width_, height_, &support_);
  std::vector<std::uint8_t> pixels;
  if (!rayCaster->render(request, pixels)) return nullptr;
  return new ZORPixelImage(width_, height_, std::move(pixels));
} catch (const std::bad_alloc&) {
  return nullptr;
}

ZORSupport::ZORSupport() = default;

void ZORSupport::SetBackgroundColor(float inRed, float inGreen, float inBlue) {
  hasBackground_ = true;
  background_[0] = inRed;
  background_[1] = inGreen;
  background_[2] = inBlue;
}

void ZORSupport::SetViewMode(int inMode, int inValue) {
  if (inMode == kShading) shading_ = inValue;
  if (inMode == kHiddenEdges) hiddenEdges_ = inValue;
}

bool ZORSupport::HasBackgroundColor() const { return hasBackground_; }
const float* ZORSupport::GetBackgroundColor() const { return background_; }

int ZORSupport::GetViewMode(int inMode) const {
  if (inMode == kShading) return shading_;
  return inMode == kHiddenEdges ? hiddenEdges_ : 0;
}
