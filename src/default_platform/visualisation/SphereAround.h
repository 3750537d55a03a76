// The sphere around meshes and spheres.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_SPHEREAROUND_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_SPHEREAROUND_H

#include <array>
#include <vector>

#include "default_platform/visualisation/PartMesh.h"

namespace ZORDefault {

/// Collects what is to lie in a sphere. What is not finite or is empty is passed over.
class SphereAround {
 public:
  void AddSphere(const ZOR3DBoundingSphere& inSphere);
  void AddMesh(const PartMesh& inMesh, const ZORMathTransformation& inRootFromPart);
  /// A sphere that surely holds all, close to the smallest one; empty around nothing.
  ZOR3DBoundingSphere Get() const;

 private:
  typedef std::array<ZORMathVector, 8> Corners;
  /// What lies both in a sphere and in the hull of the corners, when it has any.
  struct Piece {
    ZOR3DBoundingSphere sphere;
    bool hasCorners = false;
    Corners corners;
  };
  /// The place of a piece that is surely far enough away to hold the whole piece.
  static ZORMathVector Farthest(const Piece& inPiece, const ZORMathVector& inFrom);
  ZORMathVector MiddleOfBox() const;

  std::vector<Piece> pieces_;
};

}  // namespace ZORDefault

#endif
