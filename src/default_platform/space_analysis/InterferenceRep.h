// What is shown of an interference.
#ifndef ZOR_DEFAULT_PLATFORM_SPACE_ANALYSIS_INTERFERENCEREP_H
#define ZOR_DEFAULT_PLATFORM_SPACE_ANALYSIS_INTERFERENCEREP_H

#include <memory>
#include <vector>

#include "default_platform/system/ObjectCounters.h"
#include "default_platform/visualisation/SceneGraph.h"

namespace ZORDefault {

/// How markers are laid out.
struct MarkerStyle {
  double viewRadius = 1;     ///< half of what the picture's height shows; sizes go by it
  ZORMathVector sight;       ///< unit
  ZORMathVector up;          ///< unit
  bool isDimension = false;  ///< a line with arrow heads joins the two points
  PartColour colour{255, 0, 140, 255};
  double pinLength = 0;  ///< as a share of viewRadius; 0: without pins
};

/// Markers at some points, an overlay, and the sphere to frame when the interference is shown
/// alone: it holds what is needed of the surroundings to recognise the place.
class InterferenceRep final : public ZOR3DRep, private CountedObject<InterferenceRep> {
 public:
  static const char* CountedName() { return "InterferenceRep"; }

  /// @param inPoints at least one.
  InterferenceRep(const std::vector<ZORMathVector>& inPoints, const MarkerStyle& inStyle,
                  const ZOR3DBoundingSphere& inFramed);
  ZOR3DBoundingSphere GetShowBoundingElement() const override { return framed_; }
  void Accept(ZOR3DSceneVisitor& ioVisitor) const override { markers_->Accept(ioVisitor); }

 private:
  ~InterferenceRep() override { markers_->Destroy(); }

  PlacedMeshRep* markers_;
  ZOR3DBoundingSphere framed_;
};

}  // namespace ZORDefault

#endif
