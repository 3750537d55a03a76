#include "default_platform/visualisation/DrawnMesh.h"

#include <utility>

#include "default_platform/visualisation/PlacedMeshRep.h"
#include "default_platform/visualisation/ZOR3DSceneVisitor.h"
#include "platform/visualisation/ZOR3DBagRep.h"

namespace ZORDefault {
namespace {

/// The colour that a node hands to what is below it.
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
                       inMesh.IsDrawnOver()});
  }
  bool EnterBag(const ZOR3DBagRep& inBag) override {
    above_.push_back(Below(above_.back(), inBag));
    return true;
  }
  void LeaveBag(const ZOR3DBagRep&) override { above_.pop_back(); }
  std::vector<DrawnMesh> Take() { return std::move(meshes_); }

 private:
  std::vector<InheritedColour> above_{InheritedColour()};
  std::vector<DrawnMesh> meshes_;
};

}  // namespace

std::vector<DrawnMesh> CollectDrawnMeshes(const ZOR3DRep& inRep) {
  MeshCollector collector;
  inRep.Accept(collector);
  return collector.Take();
}

}  // namespace ZORDefault
