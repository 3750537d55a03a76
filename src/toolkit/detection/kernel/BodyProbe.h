// Exact distances from points to a body.
#ifndef ZOR_TOOLKIT_DETECTION_KERNEL_BODYPROBE_H
#define ZOR_TOOLKIT_DETECTION_KERNEL_BODYPROBE_H

#include <memory>
#include <vector>

#include "toolkit/detection/kernel/FaceTool.h"

namespace ZORDetection {

/// The point of a body's boundary nearest to some other point.
struct BodyFoot {
  FaceFoot foot;
  std::uint32_t face = 0;
  std::uint32_t triangle = 0;
  /// Sum of the outward normals of all faces that hold the foot; null when unknown.
  gp_XYZ normal{0, 0, 0};
  double meshError = 0;  ///< largest deflection of the faces near the foot
  double distance = std::numeric_limits<double>::infinity();
  bool IsFound() const { return std::isfinite(distance); }
};

/// Where a point lies with respect to a solid.
struct Depth {
  double value = 0;  ///< below the surface; negative: outside of it
  BodyFoot foot;
};

/// Distance queries to one body. For one thread only.
class BodyProbe {
 public:
  explicit BodyProbe(const Body& inBody) : body_(inBody), tools_(inBody.faces.size()) {}

  const Body& Of() const { return body_; }

  /// @param inBound nothing beyond this distance is searched for.
  BodyFoot Nearest(const gp_XYZ& inPoint, double inBound = std::numeric_limits<double>::infinity());

  /// The depth of a point in a solid; for a sheet minus the distance from it.
  Depth DepthOf(const gp_XYZ& inPoint);

  /// The same, from the triangles alone and with their error.
  double MeshDepthOf(const gp_XYZ& inPoint, double inBound) const;

  FaceTool& Tool(std::uint32_t inFace);

 private:
  struct Candidate {
    std::uint32_t face, triangle;
    double distance;
    gp_XYZ point;
  };

  void CollectFaces(const gp_XYZ& inPoint, double inBound, std::vector<Candidate>& outFaces) const;
  gp_XY GuessAt(const Candidate& inCandidate) const;
  gp_XYZ NormalOf(std::uint32_t inTriangle) const;
  gp_XYZ NormalAt(const Candidate& inCandidate, const FaceFoot& inFoot);
  bool IsInside(const gp_XYZ& inPoint, const BodyFoot& inFoot) const;

  const Body& body_;
  std::vector<std::unique_ptr<FaceTool>> tools_;
  std::vector<Candidate> candidates_;
};

}  // namespace ZORDetection

#endif
