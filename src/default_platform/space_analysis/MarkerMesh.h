// Shapes that show where something is.
#ifndef ZOR_DEFAULT_PLATFORM_SPACE_ANALYSIS_MARKERMESH_H
#define ZOR_DEFAULT_PLATFORM_SPACE_ANALYSIS_MARKERMESH_H

#include <cstdint>
#include <memory>
#include <vector>

#include "default_platform/visualisation/PartMesh.h"

namespace ZORDefault {

/// Collects balls, rods and cones in one mesh. Lengths above zero.
class MarkerMesh {
 public:
  /// @param inMiddle near all that is to be added.
  explicit MarkerMesh(const ZORMathVector& inMiddle);
  void AddBall(const ZORMathVector& inCentre, double inRadius) {
    AddSphere(inCentre, inRadius, kSides, kSides / 2);
  }
  /// With a quarter of the triangles.
  void AddCoarseBall(const ZORMathVector& inCentre, double inRadius) {
    AddSphere(inCentre, inRadius, kSides / 2, kSides / 4);
  }
  /// From one end to the other, with different radii; open at its ends.
  void AddCone(const ZORMathVector& inFrom, double inFromRadius, const ZORMathVector& inTo,
               double inToRadius);
  std::shared_ptr<const PartMesh> Take();

 private:
  static constexpr std::uint32_t kSides = 16;

  struct Ring {
    ZORMathVector centre;
    double radius;
    double normalAlong;  // share of the normal that points along the axis
  };
  void AddSphere(const ZORMathVector& inCentre, double inRadius, std::uint32_t inSides,
                 std::uint32_t inSlices);
  void AddRings(const ZORMathVector& inAxis, const std::vector<Ring>& inRings,
                std::uint32_t inSides);

  std::shared_ptr<PartMesh> mesh_;
};

}  // namespace ZORDefault

#endif
