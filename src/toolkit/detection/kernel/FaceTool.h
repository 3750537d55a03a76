// Feet of points on one exact face.
#ifndef ZOR_TOOLKIT_DETECTION_KERNEL_FACETOOL_H
#define ZOR_TOOLKIT_DETECTION_KERNEL_FACETOOL_H

#include <BRepAdaptor_Curve.hxx>
#include <BRepAdaptor_Surface.hxx>
#include <BRepTopAdaptor_FClass2d.hxx>
#include <memory>
#include <optional>
#include <vector>

#include "toolkit/detection/kernel/Body.h"

namespace ZORDetection {

/// The point of a trimmed face that is nearest to some other point.
struct FaceFoot {
  gp_XYZ point;
  gp_XY parameters;
  double distance = 0;
  int edge = -1;          ///< of the face, when the foot lies on its border
  double parameter = 0;   ///< on that edge
  bool isVertex = false;  ///< at an end of that edge
};

/// Evaluates one face. Holds adaptors and classifiers, which keep caches inside const calls: each
/// thread needs its own.
class FaceTool {
 public:
  FaceTool(const Body& inBody, std::uint32_t inFace);

  /// The foot within the trims.
  /// @param inGuess where on the surface to begin.
  FaceFoot Foot(const gp_XYZ& inPoint, const gp_XY& inGuess);

  /// The foot on the nearest of the face's edges but its seams; infinitely far away without any.
  FaceFoot BorderFoot(const gp_XYZ& inPoint) {
    FaceFoot foot;
    TryEdges(inPoint, false, foot);
    return foot;
  }

  /// The foot on the surface, wherever the trims are.
  gp_XY SurfaceFoot(const gp_XYZ& inPoint, const gp_XY& inGuess) const;

  gp_XYZ ValueAt(const gp_XY& inParameters) const {
    return surface_.Value(inParameters.X(), inParameters.Y()).XYZ();
  }

  /// @param inPoint of the surface, and where that is on it.
  bool IsInTrims(const gp_XYZ& inPoint, const gp_XY& inParameters);

  /// Of unit length, outwards for a solid; none where the surface has none.
  std::optional<gp_XYZ> NormalAt(const gp_XY& inParameters) const;

  const BodyFace& Face() const { return face_; }
  const BRepAdaptor_Surface& Surface() const { return surface_; }
  const BRepAdaptor_Curve& Curve(int inEdge);

 private:
  gp_XY NewtonFoot(const gp_XYZ& inPoint, gp_XY inGuess) const;
  bool IsInOutline(gp_XY inParameters) const;
  bool IsInByKernel(const gp_XY& inParameters);
  void TryEdges(const gp_XYZ& inPoint, bool inWithSeams, FaceFoot& ioFoot);
  double CurveFoot(int inEdge, const gp_XYZ& inPoint, double inGuess);

  const Body& body_;
  const BodyFace& face_;
  BRepAdaptor_Surface surface_;
  std::unique_ptr<BRepTopAdaptor_FClass2d> classifier_;
  std::vector<std::unique_ptr<BRepAdaptor_Curve>> curves_;
};

}  // namespace ZORDetection

#endif
