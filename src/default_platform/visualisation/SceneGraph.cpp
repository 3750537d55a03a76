#include "default_platform/visualisation/SceneGraph.h"

#include <algorithm>
#include <utility>

#include "default_platform/system/ObjectCounters.h"
#include "default_platform/visualisation/BoundingSphere.h"
#include "platform/visualisation/ZOR3DBagRep.h"
#include "platform/visualisation/ZORIVisProperties.h"
#include "platform/visualisation/ZORRep.h"

ZORRep::ZORRep() = default;
ZORRep::~ZORRep() = default;

void ZORRep::SetColorRGBA(unsigned int inRed, unsigned int inGreen, unsigned int inBlue,
                          unsigned int inAlpha) {
  const unsigned int wanted[4] = {inRed, inGreen, inBlue, inAlpha};
  for (int i = 0; i < 4; ++i) colour_[i] = std::min(wanted[i], 255u);
}

void ZORRep::SetInheritanceMode(unsigned int inMode) { inheritanceMode_ = inMode; }
unsigned int ZORRep::GetInheritanceMode() const { return inheritanceMode_; }

void ZORRep::GetColorRGBA(unsigned int outColour[4]) const {
  std::copy(colour_, colour_ + 4, outColour);
}

void ZORRep::Destroy() { delete this; }

ZOR3DRep::ZOR3DRep() = default;
ZOR3DRep::~ZOR3DRep() = default;

PlacedMeshRep::PlacedMeshRep(std::shared_ptr<const PartMesh> inMesh,
                             const ZORMathTransformation& inRootFromPart,
                             const PartColour* inOwnColour)
    : mesh_(std::move(inMesh)), rootFromPart_(inRootFromPart) {
  if (!inOwnColour) return;
  SetColorRGBA((*inOwnColour)[0], (*inOwnColour)[1], (*inOwnColour)[2], (*inOwnColour)[3]);
  SetInheritanceMode(kOwnColour);
}

PlacedMeshRep::~PlacedMeshRep() = default;

ZOR3DBoundingSphere PlacedMeshRep::GetShowBoundingElement() const {
  ZORDefault::BoundingSphere sphere;
  sphere.AddMesh(*mesh_, rootFromPart_);
  return sphere.Get();
}

void PlacedMeshRep::Accept(ZOR3DSceneVisitor& ioVisitor) const { ioVisitor.VisitMesh(*this); }

namespace {

void AddTo(ZORDefault::BoundingSphere& ioSphere, const ZOR3DRep& inRep) {
  if (const auto* const bag = dynamic_cast<const ZOR3DBagRep*>(&inRep)) {
    for (const ZOR3DRep* const child : bag->GetChildren()) AddTo(ioSphere, *child);
  } else if (const auto* const mesh = dynamic_cast<const PlacedMeshRep*>(&inRep)) {
    ioSphere.AddMesh(*mesh->GetMesh(), mesh->GetRootFromPart());
  } else {
    ioSphere.AddSphere(inRep.GetShowBoundingElement());
  }
}

}  // namespace

ZOR3DBagRep::ZOR3DBagRep() { ++ZORDefault::CounterOf<ZOR3DBagRep>("ZOR3DBagRep").built; }
ZOR3DBagRep::~ZOR3DBagRep() { ++ZORDefault::CounterOf<ZOR3DBagRep>("ZOR3DBagRep").released; }

void ZOR3DBagRep::AddChild(ZORRep* inChild) {
  if (auto* const child = dynamic_cast<ZOR3DRep*>(inChild)) children_.push_back(child);
}

void ZOR3DBagRep::RemoveChild(ZORRep* inChild) {
  const auto found = std::find(children_.begin(), children_.end(), inChild);
  if (found != children_.end()) children_.erase(found);
}

const std::vector<ZOR3DRep*>& ZOR3DBagRep::GetChildren() const { return children_; }

ZOR3DBoundingSphere ZOR3DBagRep::GetShowBoundingElement() const {
  ZORDefault::BoundingSphere sphere;
  AddTo(sphere, *this);
  return sphere.Get();
}

void ZOR3DBagRep::Accept(ZOR3DSceneVisitor& ioVisitor) const {
  if (!ioVisitor.EnterBag(*this)) return;
  for (const ZOR3DRep* const child : children_) child->Accept(ioVisitor);
  ioVisitor.LeaveBag(*this);
}

namespace ZORDefault {
namespace {

/// The colour that a node passes on to its descendants.
struct InheritedColour {
  PartColour colour{210, 210, 210, 255};
  bool isImposed = false;
};

PartColour ColourOf(const ZORRep& inRep) {
  unsigned int colour[4];
  inRep.GetColorRGBA(colour);
  PartColour result;
  for (std::size_t i = 0; i < 4; ++i) result[i] = static_cast<std::uint8_t>(colour[i]);
  return result;
}

InheritedColour Below(const InheritedColour& inAbove, const ZORRep& inRep) {
  const unsigned int mode = inRep.GetInheritanceMode();
  if (inAbove.isImposed || !(mode & (ZORRep::kImposeColour | ZORRep::kOwnColour))) return inAbove;
  return {ColourOf(inRep), (mode & ZORRep::kImposeColour) != 0};
}

class MeshCollector final : public ZOR3DSceneVisitor {
 public:
  void VisitMesh(const PlacedMeshRep& inMesh) override {
    const InheritedColour colour = Below(above_.back(), inMesh);
    meshes_.push_back({inMesh.GetMesh(), inMesh.GetRootFromPart(), colour.colour, colour.isImposed,
                       inMesh.IsOverlay()});
  }
  bool EnterBag(const ZOR3DBagRep& inBag) override {
    above_.push_back(Below(above_.back(), inBag));
    return true;
  }
  void LeaveBag(const ZOR3DBagRep&) override { above_.pop_back(); }
  std::vector<MeshInstance> Take() { return std::move(meshes_); }

 private:
  std::vector<InheritedColour> above_{InheritedColour()};
  std::vector<MeshInstance> meshes_;
};

}  // namespace

std::vector<MeshInstance> CollectMeshInstances(const ZOR3DRep& inRep) {
  MeshCollector collector;
  inRep.Accept(collector);
  return collector.Take();
}

}  // namespace ZORDefault

HRESULT ZORVisPropertiesValues::GetInheritance(int inPropertyType, unsigned int& outFlag) const {
  if (inPropertyType != kColour) return E_INVALIDARG;
  if (!hasColour_) return E_FAIL;
  outFlag = colourInheritance_;
  return S_OK;
}

HRESULT ZORVisPropertiesValues::GetColor(unsigned int& outRed, unsigned int& outGreen,
                                         unsigned int& outBlue) const {
  if (!hasColour_) return E_FAIL;
  outRed = colour_[0];
  outGreen = colour_[1];
  outBlue = colour_[2];
  return S_OK;
}

void ZORVisPropertiesValues::SetColor(unsigned int inRed, unsigned int inGreen,
                                      unsigned int inBlue) {
  hasColour_ = true;
  colour_[0] = inRed;
  colour_[1] = inGreen;
  colour_[2] = inBlue;
}

void ZORVisPropertiesValues::SetInheritance(int inPropertyType, unsigned int inFlag) {
  if (inPropertyType == kColour) colourInheritance_ = inFlag;
}
