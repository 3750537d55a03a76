// The bounding sphere of meshes and spheres.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_BOUNDINGSPHERE_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_BOUNDINGSPHERE_H

#include <array>
#include <vector>

#include "default_platform/PartMesh.h"

namespace ZORDefault {

/// Encloses meshes and spheres. Empty and non-finite ones are ignored.
class BoundingSphere {
 public:
  void AddSphere(const ZOR3DBoundingSphere& inSphere);
  void AddMesh(const PartMesh& inMesh, const ZORMathTransformation& inRootFromPart);
  /// A conservative sphere, close to the smallest one; empty when nothing was added.
  ZOR3DBoundingSphere Get() const;

 private:
  typedef std::array<ZORMathVector, 8> Corners;
  /// The intersection of a sphere and, where there is one, an oriented box.
  struct Piece {
    ZOR3DBoundingSphere sphere;
    bool hasCorners = false;
    Corners corners;
  };
  /// A point at least as far away as any point of the piece.
  static ZORMathVector FarthestPoint(const Piece& inPiece, const ZORMathVector& inFrom);
  ZORMathVector BoxCentre() const;

  std::vector<Piece> pieces_;
};

}  // namespace ZORDefault

#endif
