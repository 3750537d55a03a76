// Pairs whose interference is known.
#ifndef ZOR_TESTS_TOOLKIT_DETECTION_HANDMADEPAIRS_H
#define ZOR_TESTS_TOOLKIT_DETECTION_HANDMADEPAIRS_H

#include <cmath>

#include "toolkit/detection/Shapes.h"

namespace ZORDetection::Shapes {

enum class Expected { kNone, kClash, kContact, kClearance };

struct PairOfShapes {
  const char* name;
  TopoDS_Shape first, second;
  Expected kind;
  double value = 0;
  bool isDuplicate = false;
  double clearance = 0;
};

inline TopoDS_Shape HoleBlock(double radius) {
  return Minus(Block(-10, -10, 0, 20, 20, 10), Rod(gp_Pnt(0, 0, -1), gp::DZ(), radius, 12));
}

inline TopoDS_Shape Pin(double radius, double x = 0) {
  return Rod(gp_Pnt(x, 0, 0), gp::DZ(), radius, 10);
}

inline TopoDS_Shape ConeSolid() { return BRepPrimAPI_MakeCone(2, 5, 10).Shape(); }

/// Without what lies beyond a plane beside its axis: borders that are nearly straight, but not in the
/// cone's parameters.
inline TopoDS_Shape ConeCutLengthwise() {
  return Minus(BRepPrimAPI_MakeCone(5, 0.5, 10).Shape(), Block(0.4, -10, -1, 20, 20, 20));
}

/// A ball of radius 1 at a distance from that cone, beside its cut.
inline TopoDS_Shape BallBesideCone(double distance) {
  const double r = 5 - 0.45 * 5, x = 0.3, y = std::sqrt(r * r - x * x);
  const gp_XYZ normal = gp_XYZ(x / r, y / r, 0.45) / std::sqrt(1 + 0.45 * 0.45);
  const gp_XYZ centre = gp_XYZ(x, y, 5) + normal * (1 + distance);
  return Ball(centre.X(), centre.Y(), centre.Z(), 1);
}

inline const gp_Pnt kOrigin(0, 0, 0);
inline constexpr auto kNone = Expected::kNone;
inline constexpr auto kClash = Expected::kClash;
inline constexpr auto kContact = Expected::kContact;
inline constexpr auto kClearance = Expected::kClearance;

inline std::vector<PairOfShapes> Pairs() {
  const TopoDS_Shape plate = Block(0, 0, 0, 200, 200, 10);
  const TopoDS_Shape floor = Block(-50, -50, -10, 100, 100, 10);
  const TopoDS_Shape wall = Block(0, 0, 0, 100, 10, 30);
  const TopoDS_Shape slanted = Turned(Cube(0, 0, 0), kOrigin, gp::DZ(), M_PI / 4);
  const double corner = 10 * std::sqrt(0.5);
  return {
      {"FacesTouch", Cube(0, 0, 0), Cube(10, 0, 0), kContact},
      {"PartsOfFacesTouch", Cube(0, 0, 0), Cube(10, 3, 3, 4), kContact},
      {"EdgesTouch", Cube(0, 0, 0), Cube(10, 10, 0), kContact},
      {"CrossingEdgesTouch", Cube(0, 0, 0),
       Turned(Cube(10, 10, 5), gp_Pnt(10, 10, 5), gp::DX(), 0.4), kContact},
      {"CornersTouch", Cube(0, 0, 0), Cube(10, 10, 10), kContact},
      {"FacesApart", Cube(0, 0, 0), Cube(10.25, 0, 0), kClearance, 0.25, false, 1},
      {"EdgesApart", Cube(0, 0, 0), Cube(10.3, 10.4, 0), kClearance, 0.5, false, 1},
      {"CornersApart", Cube(0, 0, 0), Cube(10.2, 10.3, 10.6), kClearance, 0.7, false, 1},
      {"ApartByAllOfTheClearance", Cube(0, 0, 0), Cube(10.3, 0, 0), kClearance, 0.3, false, 0.3},
      {"FartherApartThanTheClearance", Cube(0, 0, 0), Cube(11.5, 0, 0), kNone, 0, false, 1},
      {"ApartByTheContactGap", Cube(0, 0, 0), Cube(10 + 5e-6, 0, 0), kContact},
      {"ApartByMoreThanTheContactGap", Cube(0, 0, 0), Cube(10 + 5e-5, 0, 0), kNone},
      {"WallsInLineOverlapByHalf", wall, Shifted(wall, 99.5, 0, 0), kClash, -0.5},
      {"WallsInLineOverlapByTheTolerance", wall, Shifted(wall, 99.99, 0, 0), kContact},
      {"WallsInLineOverlapByMoreThanTheTolerance", wall, Shifted(wall, 99.98, 0, 0), kClash, -0.02},
      {"WallsInLineOverlapByLess", wall, Shifted(wall, 99.9995, 0, 0), kContact},
      {"SameBlock", Cube(0, 0, 0), Cube(0, 0, 0), kClash, 0, true},
      {"SameCylinder", Pin(3), Pin(3), kClash, 0, true},
      {"SameCylinderTurned", Pin(3), Turned(Pin(3), kOrigin, gp::DZ(), 0.3), kClash, 0, true},
      {"SameBlockShiftedALittle", Cube(0, 0, 0), Cube(1e-4, 0, 0), kClash, -1e-4, true},
      {"SameBallShiftedALittle", Ball(0, 0, 0, 5), Ball(1e-4, 0, 0, 5), kClash, -1e-4, true},
      {"Inside", Cube(0, 0, 0, 20), Cube(8, 8, 8, 4), kClash, -8},
      {"InsideWithOneFaceShared", Cube(0, 0, 0, 20), Cube(8, 8, 0, 4), kClash, -4},
      {"BallInside", Cube(0, 0, 0, 20), Ball(10, 10, 10, 3), kClash, -7},
      {"BallInACavity", Minus(Cube(-10, -10, -10, 20), Ball(0, 0, 0, 5)), Ball(0, 0, 0, 4),
       kClearance, 1, false, 2},
      {"BallInACavityUnseen", Minus(Cube(-10, -10, -10, 20), Ball(0, 0, 0, 5)), Ball(0, 0, 0, 4),
       kNone},
      {"BallFillsItsCavity", Minus(Cube(-10, -10, -10, 20), Ball(0, 0, 0, 5)), Ball(0, 0, 0, 5),
       kContact},
      {"PinInItsHole", HoleBlock(3), Pin(3), kContact},
      {"PinInItsHoleTurned", HoleBlock(3), Turned(Pin(3), kOrigin, gp::DZ(), 0.3), kContact},
      {"PinInItsHoleAsSplines", AsNurbs(HoleBlock(3)), Turned(Pin(3), kOrigin, gp::DZ(), 0.3),
       kContact},
      {"PressFit", HoleBlock(3), Pin(3.02), kClash, -0.02},
      {"PressFitAsSplines", AsNurbs(HoleBlock(3)), AsNurbs(Pin(3.02)), kClash, -0.02},
      {"RunningFit", HoleBlock(3), Pin(2.98), kClearance, 0.02, false, 1},
      {"RunningFitLeaning", HoleBlock(3), Pin(2.98, 0.02), kContact, 0, false, 1},
      {"PinIntoTheWallOfItsHole", HoleBlock(3), Pin(2.98, 0.07), kClash, -0.05},
      {"BallOnPlane", floor, Ball(1.3, 2.1, 5, 5), kContact},
      {"BallIntoPlane", floor, Ball(1.3, 2.1, 4.9, 5), kClash, -0.1},
      {"BallALittleIntoPlane", floor, Ball(1.3, 2.1, 4.98, 5), kClash, -0.02},
      {"BallLessIntoPlaneThanTheTolerance", floor, Ball(1.3, 2.1, 4.992, 5), kContact},
      {"BallAbovePlane", floor, Ball(1.3, 2.1, 5.1, 5), kClearance, 0.1, false, 1},
      {"CylinderOnPlane", floor, Rod(gp_Pnt(-8, 1, 5), gp::DX(), 5, 20), kContact},
      {"CylinderIntoPlane", floor, Rod(gp_Pnt(-8, 1, 4.9), gp::DX(), 5, 20), kClash, -0.1},
      {"CylinderAbovePlane", floor, Rod(gp_Pnt(-8, 1, 5.1), gp::DX(), 5, 20), kClearance, 0.1,
       false, 1},
      {"SpheresTangent", Ball(0, 0, 0, 5), Ball(5.4, 7.2, 0, 4), kContact},
      {"SpheresApart", Ball(0, 0, 0, 5), Ball(6, 8, 0, 4), kClearance, 1, false, 2},
      {"CrossingRodsTangent", Rod(gp_Pnt(-10, 0, 0), gp::DX(), 2, 20),
       Rod(gp_Pnt(0.3, -10, 5), gp::DY(), 3, 20), kContact},
      {"CrossingRodsApart", Rod(gp_Pnt(-10, 0, 0), gp::DX(), 2, 20),
       Rod(gp_Pnt(0.3, -10, 5.05), gp::DY(), 3, 20), kClearance, 0.05, false, 1},
      {"CrossingRodsIntoEachOther", Rod(gp_Pnt(-10, 0, 0), gp::DX(), 2, 20),
       Rod(gp_Pnt(0.3, -10, 4.9), gp::DY(), 3, 20), kClash, -0.1},
      {"ConeInItsCone", Minus(Block(-10, -10, 0, 20, 20, 10), ConeSolid()), ConeSolid(), kContact},
      {"BallBesideACutCone", ConeCutLengthwise(), BallBesideCone(0.1), kClearance, 0.1, false, 1},
      {"BallIntoACutCone", ConeCutLengthwise(), BallBesideCone(-0.05), kClash, -0.05},
      {"ThinRodThroughLargePlate", plate, Rod(gp_Pnt(37.3, 61.7, -20), gp::DZ(), 0.5, 50), kClash,
       -5},
      {"SlantedRodThroughLargePlate", plate,
       Rod(gp_Pnt(137.3, 61.7, -20), gp_Dir(0.3, 0.2, 1), 0.5, 60), kClash, -5},
      {"CrossedPlates", Block(0, 0, 0, 100, 100, 2), Block(49, -10, -50, 2, 120, 100), kClash, -1},
      {"CornerNick", Cube(0, 0, 0), Cube(9.8, 9.8, 9.8), kClash, -0.2},
      {"EdgeNick", Cube(0, 0, 0), Cube(9.9, 9.7, 2), kClash, -0.1},
      {"RingOnRod", BRepPrimAPI_MakeTorus(10, 2).Shape(), Rod(gp_Pnt(0, 0, -10), gp::DZ(), 8, 20),
       kContact},
      {"RingIntoRod", BRepPrimAPI_MakeTorus(10, 2).Shape(),
       Rod(gp_Pnt(0, 0, -10), gp::DZ(), 8.05, 20), kClash, -0.05},
      {"TurnedBoxTouches", slanted, Block(corner, -5, 0, 10, 10 + 10, 10), kContact},
      {"TurnedBoxEnters", slanted, Block(corner - 0.3, -5, 0, 10, 20, 10), kClash, -0.3},
      {"TurnedBoxApart", slanted, Block(corner + 0.3, -5, 0, 10, 20, 10), kClearance, 0.3, false,
       1},
      {"TiltedRodsRimIntoPlane", floor,
       Turned(Rod(gp_Pnt(0, 0, 0), gp::DZ(), 4, 20), gp_Pnt(0, 0, 0), gp::DX(), 0.1), kClash,
       -4 * std::sin(0.1)},
      {"RodThroughSheet", OpenBox(-20, -20, 0, 40, 40, 5),
       Rod(gp_Pnt(3, 4, -10), gp::DZ(), 1.5, 20), kClash, -1.5},
      {"OpenBoxEntered", OpenBox(-20, -20, 0, 40, 40, 15), Rod(gp_Pnt(3, 4, 5), gp::DZ(), 1.5, 30),
       kNone},
      {"OpenBoxTouched", OpenBox(-20, -20, 0, 40, 40, 15), Rod(gp_Pnt(3, 4, 0), gp::DZ(), 1.5, 30),
       kContact},
      {"OpenBoxesCross", OpenBox(-20, -20, 0, 40, 40, 15), OpenBox(-3, -5, 4, 40, 7, 5), kContact},
      {"InsideOutOverlaps", Cube(0, 0, 0).Reversed(), Cube(9.5, 2, 2, 5), kClash, -0.5},
      {"InsideOutTouches", Cube(0, 0, 0).Reversed(), Cube(10, 2, 2, 5), kContact},
      {"InsideOutApart", Cube(0, 0, 0).Reversed(), Cube(10.5, 2, 2, 5), kClearance, 0.5, false, 1},
      {"SeveralSolidsOneOverlaps", Together({Cube(0, 0, 0), Cube(30, 0, 0)}), Cube(39.5, 2, 2, 5),
       kClash, -0.5},
      {"SeveralSolidsTouch", Together({Cube(0, 0, 0), Cube(30, 0, 0)}), Block(10, 0, 0, 20, 10, 10),
       kContact},
      {"OverlappingSolidsInOnePart", Together({Cube(0, 0, 0), Cube(5, 0, 0)}),
       Block(6, 3, -5, 2, 2, 10), kClash, -4},
      {"FarFromTheOrigin", Cube(1e6, 1e6, -1e6), Cube(1e6 + 10, 1e6, -1e6), kContact},
      {"FarFromTheOriginOverlap", Cube(1e6, 1e6, -1e6), Cube(1e6 + 9.9, 1e6 + 1, -1e6 + 1, 5),
       kClash, -0.1},
      {"PinInItsHoleFarFromTheOrigin", Shifted(HoleBlock(3), 1e6, -1e6, 1e6),
       Shifted(Pin(3), 1e6, -1e6, 1e6), kContact},
  };
}

}  // namespace ZORDetection::Shapes

#endif
