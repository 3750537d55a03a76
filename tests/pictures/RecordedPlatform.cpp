#include "pictures/RecordedPlatform.h"

#include <utility>

#include "platform/visualisation/ZOR3DBagRep.h"
#include "platform/visualisation/ZORLyraRepPathBuilder.h"
#include "platform/visualisation/ZORPrint3DRepImage.h"

RecordedPlatform recorded;

namespace {

std::string Described(const ZOR3DRep* inRep) {
  if (const auto* const named = dynamic_cast<const NamedRep*>(inRep)) return named->GetName();
  std::string text = "(";
  for (const ZOR3DRep* const child : dynamic_cast<const ZOR3DBagRep*>(inRep)->GetChildren())
    text += Described(child);
  return text + ")";
}

}  // namespace

ZORPrint3DRepImage::ZORPrint3DRepImage(ZOR3DRep* inRep, int inWidth, int inHeight)
    : rep_(inRep), width_(inWidth), height_(inHeight), viewpoint_(new ZOR3DViewpoint) {
  recorded.Note("image " + std::to_string(width_) + "x" + std::to_string(height_));
  recorded.scenes += Described(inRep);
  viewpoint_->scene_ = inRep->GetShowBoundingElement();
}
ZORPrint3DRepImage::~ZORPrint3DRepImage() {
  viewpoint_->Release();
  recorded.Note("image released");
}
ZORSupport* ZORPrint3DRepImage::GetSupport() { return &support_; }
ZOR3DViewpoint* ZORPrint3DRepImage::GetViewpoint() { return viewpoint_; }
ZORPixelImage* ZORPrint3DRepImage::Rasterize() {
  recorded.eye = viewpoint_->origin;
  recorded.focusDistance = viewpoint_->focusDistance;
  recorded.Note("rasterise");
  return recorded.canRasterize ? new ZORPixelImage(width_, height_, {}) : nullptr;
}

void ZORSupport::SetBackgroundColor(float inRed, float inGreen, float inBlue) {
  const bool isWhite = inRed == 1.0F && inGreen == 1.0F && inBlue == 1.0F;
  recorded.Note(isWhite ? "white" : "another background");
}
void ZORSupport::SetViewMode(int inMode, int inValue) {
  recorded.Note("mode " + std::to_string(inMode) + "=" + std::to_string(inValue));
}

ZORPixelImage::ZORPixelImage(int inWidth, int inHeight, std::vector<std::uint8_t> inPixels)
    : width_(inWidth), height_(inHeight), pixels_(std::move(inPixels)) {}
ZORPixelImage::~ZORPixelImage() { recorded.Note("pixels released"); }
HRESULT ZORPixelImage::Prepare(int inDepth) {
  recorded.Note("prepare " + std::to_string(inDepth));
  return S_OK;
}
HRESULT ZORPixelImage::Write(const ZORString& inFormat, const ZORString& inPath) const {
  recorded.Note(std::string("write ") + inFormat.CastToCharPtr() + " " + inPath.CastToCharPtr());
  return E_FAIL;  // which nobody looks at
}

ZORRepPath::ZORRepPath(ZORLyraRepPathBuilder* inBuilder, ZORRep* inRep)
    : builder_(inBuilder), reps_{inRep}, next_(1) {}
ZORRepPath::~ZORRepPath() {
  if (builder_) {
    std::erase(builder_->paths_, this);
    recorded.Note("path deleted");
  }
}
void ZORRepPath::Rewind() { next_ = 0; }
ZORRep* ZORRepPath::NextChildRep() { return next_ < reps_.size() ? reps_[next_++] : nullptr; }

ZORLyraRepPathBuilder::ZORLyraRepPathBuilder(int inLoadingStrategy) {
  recorded.Note("builder " + std::to_string(inLoadingStrategy));
}
ZORLyraRepPathBuilder::~ZORLyraRepPathBuilder() {
  for (ZORRepPath* const path : paths_) {
    path->builder_ = nullptr;
    delete path;
  }
  recorded.Note("builder deleted");
}
HRESULT ZORLyraRepPathBuilder::GetRepPathFromSpecObjV4(ZORIProduct_var, ZORUnicodeString inPath,
                                                       ZORRepPath*& outPath) {
  recorded.Note(std::string("path of ") + inPath.ConvertToChar());
  outPath = nullptr;
  if (FAILED(recorded.pathResult) || !recorded.givesPath) return recorded.pathResult;
  outPath = new ZORRepPath(this, recorded.findRep(inPath.ConvertToChar()));
  paths_.push_back(outPath);
  return recorded.pathResult;
}
