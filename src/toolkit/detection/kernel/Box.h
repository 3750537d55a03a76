// Axis-aligned boxes, and points in other frames.
#ifndef ZOR_TOOLKIT_DETECTION_KERNEL_BOX_H
#define ZOR_TOOLKIT_DETECTION_KERNEL_BOX_H

#include <algorithm>
#include <cmath>
#include <gp_Mat.hxx>
#include <gp_Trsf.hxx>
#include <gp_XYZ.hxx>
#include <limits>

namespace ZORDetection {

inline gp_XYZ Moved(const gp_Trsf& inMotion, gp_XYZ inPoint) {
  inMotion.Transforms(inPoint);
  return inPoint;
}

inline gp_XYZ Turned(const gp_Trsf& inMotion, const gp_XYZ& inDirection) {
  return inMotion.HVectorialPart() * inDirection;
}

/// Null stays null.
inline gp_XYZ UnitOf(const gp_XYZ& inVector) {
  const double size = inVector.Modulus();
  return size > 0 ? inVector / size : gp_XYZ(0, 0, 0);
}

struct Box {
  gp_XYZ low{kInfinity, kInfinity, kInfinity};
  gp_XYZ high{-kInfinity, -kInfinity, -kInfinity};

  bool IsEmpty() const { return low.X() > high.X(); }
  gp_XYZ Centre() const { return (low + high) * 0.5; }
  gp_XYZ HalfSize() const { return (high - low) * 0.5; }
  double Diagonal() const { return IsEmpty() ? 0 : (high - low).Modulus(); }

  void Add(const gp_XYZ& inPoint) {
    for (int i = 1; i <= 3; ++i) {
      low.SetCoord(i, std::min(low.Coord(i), inPoint.Coord(i)));
      high.SetCoord(i, std::max(high.Coord(i), inPoint.Coord(i)));
    }
  }

  void Add(const Box& inBox) {
    if (inBox.IsEmpty()) return;
    Add(inBox.low);
    Add(inBox.high);
  }

  Box Grown(double inBy) const {
    const gp_XYZ by(inBy, inBy, inBy);
    return {low - by, high + by};
  }

  double SquareDistance(const gp_XYZ& inPoint) const {
    double sum = 0;
    for (int i = 1; i <= 3; ++i) {
      const double x = inPoint.Coord(i);
      const double gap = std::max({low.Coord(i) - x, 0.0, x - high.Coord(i)});
      sum += gap * gap;
    }
    return sum;
  }

  double SquareDistance(const Box& inBox) const {
    double sum = 0;
    for (int i = 1; i <= 3; ++i) {
      const double gap =
          std::max({low.Coord(i) - inBox.high.Coord(i), 0.0, inBox.low.Coord(i) - high.Coord(i)});
      sum += gap * gap;
    }
    return sum;
  }

  /// The box around this one after a rigid motion.
  Box Moved(const gp_Trsf& inMotion) const {
    if (IsEmpty()) return {};
    gp_XYZ centre = Centre();
    inMotion.Transforms(centre);
    const gp_XYZ half = HalfSize();
    gp_XYZ reach;
    for (int row = 1; row <= 3; ++row) {
      double sum = 0;
      for (int column = 1; column <= 3; ++column)
        sum += std::abs(inMotion.Value(row, column)) * half.Coord(column);
      reach.SetCoord(row, sum);
    }
    return {centre - reach, centre + reach};
  }

 private:
  static constexpr double kInfinity = std::numeric_limits<double>::infinity();
};

}  // namespace ZORDetection

#endif
