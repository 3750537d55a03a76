// The verdict on two bodies.
#ifndef ZOR_TOOLKIT_DETECTION_KERNEL_BODYPAIR_H
#define ZOR_TOOLKIT_DETECTION_KERNEL_BODYPAIR_H

#include <gp_Trsf.hxx>
#include <optional>
#include <vector>

#include "toolkit/detection/kernel/BodyProbe.h"

namespace ZORDetection {

inline constexpr double kInfinity = std::numeric_limits<double>::infinity();
inline constexpr double kRounding = 1e-7;  // of what was computed, millimetres

/// Evenly spread members of a list, all of a short one.
template <typename Item>
std::vector<Item> Thinned(const std::vector<Item>& inItems, std::size_t inMax) {
  if (inItems.size() <= inMax) return inItems;
  std::vector<Item> thinned;
  for (std::size_t i = 0; i < inMax; ++i) thinned.push_back(inItems[i * inItems.size() / inMax]);
  return thinned;
}

/// What was found between two bodies, in the frame of the first one's part.
struct Verdict {
  Kind kind = Kind::kContact;
  double depth = 0;     ///< of a clash
  double distance = 0;  ///< of anything else
  std::array<gp_XYZ, 2> points;
  double curveLength = 0;
  std::vector<gp_XYZ> curve;
  bool isDuplicate = false;
  bool isSheetInSolid = false;
  bool hasMeshPrecision = false;
  double precision = 0;
};

/// Two triangles whose faces may touch or hold the least distance.
struct NearTriangles {
  std::array<std::uint32_t, 2> triangles;
  double distance;                ///< between the triangles
  double lower;                   ///< between their faces it is at least this; may be negative
  std::array<gp_XYZ, 2> closest;  ///< in the common frame
};

/// A point of one body's boundary, and where it lies with respect to the other body.
struct Sample {
  std::size_t side = 0;  ///< whose boundary: 0 or 1
  gp_XYZ point;          ///< in the common frame
  std::uint32_t face = 0, triangle = 0;
  gp_XY parameters;  ///< on the face's surface
  gp_XYZ normal;     ///< of the side's boundary, common frame
  bool isOnEdge = false;
  Depth depth;  ///< its foot is in the other body's frame
};

/// Judges two bodies. The common frame is the first one's.
class BodyPair {
 public:
  BodyPair(BodyProbe& ioFirst, BodyProbe& ioSecond, const gp_Trsf& inFirstFromSecond,
           double inPointPrecision, const Options& inOptions);

  /// None when they are farther apart than any limit.
  std::optional<Verdict> Judge();

 private:
  struct Side {
    BodyProbe& probe;
    gp_Trsf commonFromThis, thisFromCommon;
    const Body& body() const { return probe.Of(); }
  };

  /// A place on the border of a face.
  struct BorderPlace {
    std::size_t side = 0;
    std::uint32_t face = 0;
    int edge = 0;
    double parameter = 0;
  };
  struct DeepPlace {
    gp_XYZ point;  ///< in the common frame
    double depth = 0;
  };

  // Search for near triangles.
  void CollectNear();
  void MeetLeaves(const TriangleTree::Node& inFirst, const TriangleTree::Node& inSecond);
  double CutOff() const { return std::min(reach_, std::max(upper_, options_.contactGap)); }

  // Where the bodies may touch.
  std::optional<Verdict> JudgeTouching();
  void SampleNear();
  void SampleTriangle(std::size_t inSide, std::uint32_t inTriangle);
  void SampleCrossing(const NearTriangles& inNear);
  void AddSample(std::size_t inSide, std::uint32_t inTriangle,
                 const std::array<double, 3>& inWeights, bool inIsNode);
  std::optional<gp_XYZ> BoundaryPoint(std::size_t inSide, std::uint32_t inTriangle,
                                      const std::array<double, 3>& inWeights, bool inIsNode,
                                      gp_XY& outParameters);
  void ClimbFromBestOfFaces();
  bool StepToTangency(const Sample& inStart, Sample& outSample);
  Sample Climb(Sample inStart, double inStep, int inMaxTries);
  Sample SampleAt(std::size_t inSide, const gp_XYZ& inCommonPoint);
  double AllowedDepth(const Sample& inSample) const;
  bool IsClash(const Sample& inSample) const;
  bool SharesInside();

  // Depth.
  void FindDeepest(std::size_t inSide);
  void CollectDeep(std::size_t inSide, std::vector<gp_XYZ>& outStarts);
  Verdict ClashVerdict();

  // Distance.
  bool IsContained(std::size_t inSide) const;
  void FindDistance();
  void Alternate(gp_XYZ inFirst);
  void Leap(gp_XYZ& ioFirst, const gp_XYZ& inStep);
  bool Polish(gp_XYZ& ioFirst);
  void KeepDistance(const gp_XYZ& inFirst, const gp_XYZ& inSecond);
  std::optional<Verdict> DistanceVerdict();

  // Along borders, in BodyEdges.cpp.
  DeepPlace DeepestAlong(const BorderPlace& inPlace, double inStep, double inWanted);
  std::optional<BorderPlace> BorderAt(std::size_t inSide, std::uint32_t inTriangle,
                                      const gp_XYZ& inCommonPoint) const;
  void ClimbAlongEdges();
  void DeepenAlongEdge(Sample& ioSample);
  void ApproachAlongEdges();

  // Curves, in InterferenceCurve.cpp.
  void AddCrossingCurve(Verdict& ioVerdict);
  void AddPatch(Verdict& ioVerdict);
  bool MoveOntoBoth(const NearTriangles& inNear, gp_XYZ& ioPoint);
  bool IsOnBoth(const gp_XYZ& inPoint, double inGap);
  void AddBorderOnOther(std::size_t inSide, Verdict& ioVerdict);
  bool IsBorderOnOther(std::size_t inSide, const gp_XYZ& inLocal);
  void AddChordOnOther(std::size_t inSide, const BRepAdaptor_Curve& inCurve,
                       const std::array<double, 2>& inEnds, std::size_t inPieces,
                       Verdict& ioVerdict);

  bool IsDuplicate() const;
  void AddPrecision(Verdict& ioVerdict) const;
  Corners CommonCorners(std::size_t inSide, std::uint32_t inTriangle) const;

  std::array<Side, 2> sides_;
  const Options& options_;
  double gap_, reach_, upper_;
  std::vector<NearTriangles> near_;
  std::vector<Sample> samples_;
  Sample best_;
  bool hasBest_ = false;
  double distance_;
  std::array<gp_XYZ, 2> closest_;
};

}  // namespace ZORDetection

#endif
