// Bodies: solids and sheets with their triangles, and the exact faces that these approximate.
#ifndef ZOR_TOOLKIT_DETECTION_KERNEL_BODY_H
#define ZOR_TOOLKIT_DETECTION_KERNEL_BODY_H

#include <TopoDS_Edge.hxx>
#include <TopoDS_Face.hxx>
#include <array>
#include <cstdint>
#include <gp_XY.hxx>
#include <string>
#include <vector>

#include "toolkit/detection/kernel/FindInterferences.h"
#include "toolkit/detection/kernel/TriangleTree.h"
#include "toolkit/detection/kernel/Triangles.h"

namespace ZORDetection {

/// One border of a face, cut into the chords that its triangles have there.
struct BorderEdge {
  TopoDS_Edge edge;
  std::vector<std::uint32_t> nodes;
  std::vector<double> parameters;  ///< on the edge's curve, one for each node
  Box box;                         ///< around the chords
  double deflection = 0;           ///< largest distance between curve and chords
  double outlineError = 0;  ///< within it the chords in the face's outline do not say which side
  double tolerance = 0;     ///< as the file has it
  bool isForward = true;    ///< the face lies on its left, seen against du x dv
  bool isSeam = false;      ///< the face lies on both sides
};

struct BodyFace {
  TopoDS_Face face;  ///< null: triangles are all there is
  std::vector<BorderEdge> edges;
  double deflection = 0;  ///< largest distance between surface and triangles, as measured
  double tolerance = 0;   ///< as the file has it
  double normalSign = 1;  ///< outwards = sign * (du x dv)
  bool isPlane = false;
  /// Chords of the border on the surface's parameters; empty when one of them is unknown.
  std::vector<std::array<gp_XY, 2>> outline;
  gp_XY outlineLow;  ///< least parameters in it
};

struct BodyTriangle {
  std::array<std::uint32_t, 3> nodes{};  ///< outwards by the right hand for a solid
  std::uint32_t face = 0;
};

/// A solid, or a surface that encloses nothing.
class Body {
 public:
  bool isSolid = false;
  bool isExact = false;  ///< its faces have surfaces
  std::vector<gp_XYZ> nodes;
  std::vector<gp_XY> parameters;  ///< of the nodes on their face's surface
  std::vector<BodyTriangle> triangles;
  std::vector<BodyFace> faces;
  /// For triangles without surface: how far a surface through their corners may be off.
  std::vector<double> deviations;
  std::vector<double> nodeDeviations;  ///< the largest of the triangles around each node

  bool isWatertight = false;
  double volume = 0;
  Box box;  ///< around the exact geometry
  TriangleTree tree;
  double maxDeflection = 0;

  Corners CornersOf(std::uint32_t inTriangle) const {
    const auto& [a, b, c] = triangles[inTriangle].nodes;
    return {nodes[a], nodes[b], nodes[c]};
  }

  double DeflectionOf(std::uint32_t inTriangle) const {
    return faces[triangles[inTriangle].face].deflection;
  }

  /// The deviation at a point of a triangle.
  double DeviationAt(std::uint32_t inTriangle, const gp_XYZ& inPoint) const;

  /// Turns normals outwards, measures and builds the tree. To be called once, when all is filled
  /// in.
  void Finish();

  /// Whether a point that is farther from the surface than the triangles lies inside the solid.
  /// Turned inside out or not, a finite solid's inside is the finite side.
  bool Encloses(const gp_XYZ& inPoint) const;

 private:
  int CrossingsAlong(const gp_XYZ& inPoint, const gp_XYZ& inDirection, bool& outIsClear) const;
};

struct PartGeometry {
  std::vector<Body> bodies;
  Box box;
  std::vector<Unjudged> problems;
  double pointPrecision = 0;
};

/// Makes triangles and measures them. Never throws for a bad shape: what fails is named in
/// `problems`.
PartGeometry GeometryOf(const Part& inPart, double inMeshSize);

/// Bodies of triangles alone: one for each connected closed surface with the cavities in it, and
/// one for all that is open.
std::vector<Body> BodiesOfTriangles(const std::vector<gp_XYZ>& inPoints,
                                    const std::vector<std::array<std::uint32_t, 3>>& inTriangles);

/// Numbers equal points equally.
std::vector<std::uint32_t> WeldPoints(const std::vector<gp_XYZ>& inPoints, double inTolerance);

}  // namespace ZORDetection

#endif
