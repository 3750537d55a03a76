// Random pairs of simple solids, judged by their signed distance functions: exact, and without the CAD
// kernel (Inigo Quilez, "Distance functions"). ZOR_RANDOM_PAIRS sets how many, ZOR_RANDOM_SEED which.
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdlib>
#include <gp_Quaternion.hxx>
#include <limits>
#include <random>
#include <sstream>

#include "toolkit/detection/Shapes.h"

namespace ZORDetection {
namespace {

using Vector = gp_XYZ;
using Random = std::mt19937;

enum class Form { kBlock, kBall, kRod, kCone, kRing };

/// A solid in its own frame: a block between ±a, ±b, ±c; a ball of radius a; a rod of radius a and a
/// cone of radii a and c, both between ±b along z; a ring of radii a and b about z.
struct Solid {
  Form form = Form::kBall;
  double a = 1, b = 1, c = 1;

  TopoDS_Shape Shape() const {
    const gp_Ax2 below(gp_Pnt(0, 0, -b), gp::DZ());
    switch (form) {
      case Form::kBlock:
        return Shapes::Block(-a, -b, -c, 2 * a, 2 * b, 2 * c);
      case Form::kBall:
        return Shapes::Ball(0, 0, 0, a);
      case Form::kRod:
        return BRepPrimAPI_MakeCylinder(below, a, 2 * b).Shape();
      case Form::kCone:
        return BRepPrimAPI_MakeCone(below, a, c, 2 * b).Shape();
      case Form::kRing:
        break;
    }
    return BRepPrimAPI_MakeTorus(a, b).Shape();
  }

  /// Distance to the boundary, negative inside.
  double SignedDistance(const Vector& p) const {
    const double radius = std::hypot(p.X(), p.Y());
    const auto beyond = [](double x, double y, double z) {
      return Vector(std::max(x, 0.), std::max(y, 0.), std::max(z, 0.)).Modulus() +
             std::min(std::max({x, y, z}), 0.);
    };
    switch (form) {
      case Form::kBlock:
        return beyond(std::abs(p.X()) - a, std::abs(p.Y()) - b, std::abs(p.Z()) - c);
      case Form::kBall:
        return p.Modulus() - a;
      case Form::kRod:
        return beyond(radius - a, std::abs(p.Z()) - b, -std::numeric_limits<double>::infinity());
      case Form::kCone:
        return ConeDistance(radius, p.Z());
      case Form::kRing:
        break;
    }
    return std::hypot(radius - a, p.Z()) - b;
  }

  int FaceCount() const {
    switch (form) {
      case Form::kBlock:
        return 6;
      case Form::kRod:
      case Form::kCone:
        return 3;
      case Form::kBall:
      case Form::kRing:
        break;
    }
    return 1;
  }

  /// A point of the boundary for u and v in [0, 1], and for any u and v where a face closes on itself.
  Vector Boundary(int face, double u, double v) const {
    const double turn = 2 * M_PI * u, x = std::cos(turn), y = std::sin(turn);
    const double share = std::clamp(v, 0., 1.);
    switch (form) {
      case Form::kBlock: {
        const double size[3] = {a, b, c};
        const int axis = face / 2;
        double p[3];
        p[axis] = face % 2 == 0 ? size[axis] : -size[axis];
        p[(axis + 1) % 3] = (2 * std::clamp(u, 0., 1.) - 1) * size[(axis + 1) % 3];
        p[(axis + 2) % 3] = (2 * share - 1) * size[(axis + 2) % 3];
        return {p[0], p[1], p[2]};
      }
      case Form::kBall: {
        const double height = M_PI * (v - 0.5);
        return Vector(x * std::cos(height), y * std::cos(height), std::sin(height)) * a;
      }
      case Form::kRod:
      case Form::kCone: {
        const double top = form == Form::kRod ? a : c;
        if (face == 0) return {a * share * x, a * share * y, -b};
        if (face == 1) return {top * share * x, top * share * y, b};
        const double radius = a + (top - a) * share;
        return {radius * x, radius * y, b * (2 * share - 1)};
      }
      case Form::kRing:
        break;
    }
    const double radius = a + b * std::cos(2 * M_PI * v);
    return {radius * x, radius * y, b * std::sin(2 * M_PI * v)};
  }

 private:
  double ConeDistance(double radius, double z) const {
    const double end = z < 0 ? a : c;
    const double capX = radius - std::min(radius, end), capY = std::abs(z) - b;
    const double slantX = c - a, slantY = 2 * b;
    const double along = std::clamp(
        ((c - radius) * slantX + (b - z) * slantY) / (slantX * slantX + slantY * slantY), 0., 1.);
    const double sideX = radius - c + slantX * along, sideY = z - b + slantY * along;
    const bool isInside = sideX < 0 && capY < 0;
    return (isInside ? -1 : 1) *
           std::sqrt(std::min(capX * capX + capY * capY, sideX * sideX + sideY * sideY));
  }
};

struct Placed {
  Solid solid;
  gp_Trsf placement;

  double SignedDistance(const Vector& inPoint) const {
    Vector point = inPoint;
    placement.Inverted().Transforms(point);
    return solid.SignedDistance(point);
  }
};

/// The least signed distance of a boundary to another solid: a grid, then a search by steps that shrink.
class LeastDistance {
 public:
  LeastDistance(const Placed& inBoundary, const Placed& inOther)
      : solid_(inBoundary.solid),
        other_(inOther.solid),
        otherFromSolid_(inOther.placement.Inverted().Multiplied(inBoundary.placement)) {}

  double operator()() {
    std::vector<Start> starts;
    for (int face = 0; face < solid_.FaceCount(); ++face)
      for (int i = 0; i <= kGrid; ++i)
        for (int j = 0; j <= kGrid; ++j) {
          Start start{0, face, double(i) / kGrid, double(j) / kGrid};
          start.distance = At(face, start.u, start.v);
          starts.push_back(start);
        }
    const std::size_t kept = std::min<std::size_t>(kTried, starts.size());
    std::partial_sort(starts.begin(), starts.begin() + static_cast<std::ptrdiff_t>(kept),
                      starts.end(),
                      [](const Start& x, const Start& y) { return x.distance < y.distance; });
    double least = starts.front().distance;
    for (std::size_t i = 0; i < kept; ++i) least = std::min(least, Descend(starts[i]));
    return least;
  }

 private:
  static constexpr int kGrid = 24;
  static constexpr std::size_t kTried = 6;
  struct Start {
    double distance;
    int face;
    double u, v;
  };

  double At(int face, double u, double v) const {
    Vector point = solid_.Boundary(face, u, v);
    otherFromSolid_.Transforms(point);
    return other_.SignedDistance(point);
  }

  double Descend(Start start) {
    constexpr int kMaxRounds = 150;
    std::uniform_real_distribution<double> turn(0, 2 * M_PI);
    double step = 1.0 / kGrid;
    for (int round = 0; round < kMaxRounds && step > 1e-11; ++round) {
      bool isBetter = false;
      for (int i = 0; i < 8; ++i) {
        const double angle = i < 4 ? i * M_PI / 2 : turn(random_);
        const double u = start.u + step * std::cos(angle), v = start.v + step * std::sin(angle);
        const double distance = At(start.face, u, v);
        if (distance >= start.distance) continue;
        start = {distance, start.face, u, v};
        isBetter = true;
      }
      step *= isBetter ? 1.5 : 0.5;
    }
    return start.distance;
  }

  const Solid& solid_;
  const Solid& other_;
  gp_Trsf otherFromSolid_;
  Random random_{1};
};

/// The distance of two solids, or minus their depth.
double Gap(const Placed& inFirst, const Placed& inSecond) {
  return std::min(LeastDistance(inFirst, inSecond)(), LeastDistance(inSecond, inFirst)());
}

Solid RandomSolid(Random& ioRandom) {
  std::uniform_real_distribution<double> size(1, 10);
  Solid solid;
  solid.form = static_cast<Form>(std::uniform_int_distribution<int>(0, 4)(ioRandom));
  solid.a = size(ioRandom);
  solid.b = size(ioRandom);
  solid.c = size(ioRandom);
  if (solid.form == Form::kRing) solid.b = solid.a * size(ioRandom) / 12;
  return solid;
}

/// Any direction, or one along the axes, so that faces and edges lie on each other.
gp_Trsf RandomTurn(Random& ioRandom) {
  gp_Trsf turn;
  if (ioRandom() % 2 == 0) {
    std::normal_distribution<double> each;
    gp_Quaternion quaternion(each(ioRandom), each(ioRandom), each(ioRandom), each(ioRandom));
    quaternion.Normalize();
    turn.SetRotation(quaternion);
    return turn;
  }
  turn.SetRotation(gp_Ax1(gp_Pnt(), ioRandom() % 2 == 0 ? gp::DX() : gp::DY()),
                   static_cast<double>(ioRandom() % 4) * M_PI / 2);
  return turn;
}

Vector RandomDirection(Random& ioRandom) {
  if (ioRandom() % 2 == 0) {
    Vector axis;
    axis.SetCoord(static_cast<int>(ioRandom() % 3) + 1, 1);
    return axis;
  }
  std::normal_distribution<double> each;
  return Vector(each(ioRandom), each(ioRandom), each(ioRandom)).Normalized();
}

/// Moves the second along a line until it is so far from the first, or so deep in it: by false position
/// (the Illinois rule).
bool MoveTo(double inGap, const Vector& inDirection, const Placed& inFirst, Placed& ioSecond) {
  const gp_Trsf turn = ioSecond.placement;
  const auto missAt = [&](double inWay) {
    gp_Trsf shift;
    shift.SetTranslation(inDirection * inWay);
    ioSecond.placement = shift.Multiplied(turn);
    return Gap(inFirst, ioSecond) - inGap;
  };
  double near = 0, far = 60, nearMiss = missAt(near), farMiss = missAt(far);
  if (nearMiss > 0) return false;
  for (int i = 0; i < 60; ++i) {
    const double way = (near * farMiss - far * nearMiss) / (farMiss - nearMiss);
    const double miss = missAt(way);
    if (std::abs(miss) < 1e-9) break;
    const bool isFar = miss > 0;
    (isFar ? far : near) = way;
    (isFar ? nearMiss : farMiss) /= 2;
    (isFar ? farMiss : nearMiss) = miss;
  }
  return true;
}

std::string Written(const Placed& inPlaced) {
  std::ostringstream text;
  const Solid& solid = inPlaced.solid;
  text.precision(17);
  text << "form " << static_cast<int>(solid.form) << ' ' << solid.a << ' ' << solid.b << ' '
       << solid.c;
  for (int row = 1; row <= 3; ++row)
    for (int column = 1; column <= 4; ++column)
      text << (column == 1 ? "; " : " ") << inPlaced.placement.Value(row, column);
  return text.str();
}

Findings Find(const Placed& inFirst, const Placed& inSecond) {
  const TopoDS_Shape shapes[2] = {inFirst.solid.Shape(), inSecond.solid.Shape()};
  std::vector<Part> parts(2);
  std::vector<Product> products(2);
  for (std::uint32_t i = 0; i < 2; ++i) {
    parts[i].shape = &shapes[i];
    products[i].part = i;
    const gp_Trsf& placement = (i == 0 ? inFirst : inSecond).placement;
    for (int row = 0; row < 3; ++row)
      for (int column = 0; column < 4; ++column)
        products[i]
            .rootFromProduct[static_cast<std::size_t>(row)][static_cast<std::size_t>(column)] =
            placement.Value(row + 1, column + 1);
  }
  Options options;
  options.clearance = 2;
  return FindInterferences(parts, products, options);
}

/// Its points show that the value is not made up.
void ExpectPointsShowValue(const Placed& inFirst, const Placed& inSecond,
                           const Interference& inFound) {
  const auto distances = [&](const Point& p) {
    const Vector point(p[0], p[1], p[2]);
    return std::array<double, 2>{inFirst.SignedDistance(point), inSecond.SignedDistance(point)};
  };
  const auto deep = distances(inFound.points[0]), foot = distances(inFound.points[1]);
  if (inFound.kind == Kind::kClash) {
    const std::size_t own = std::abs(deep[0]) < std::abs(deep[1]) ? 0 : 1;
    EXPECT_NEAR(deep[own], 0, 1e-6);
    EXPECT_NEAR(deep[1 - own], inFound.value, 1e-6);
    EXPECT_NEAR(foot[1 - own], 0, 1e-6);
    return;
  }
  const bool isContact = inFound.kind == Kind::kContact;
  EXPECT_NEAR(deep[0], 0, isContact ? 0.01 : 1e-6);
  EXPECT_NEAR(foot[1], 0, isContact ? 0.01 : 1e-6);
  EXPECT_NEAR(deep[1], inFound.value, isContact ? 0.01 : 1e-6);
}

/// @param inGap an upper bound, as any search among points gives.
void ExpectGap(double inGap, const Placed& inFirst, const Placed& inSecond) {
  const Findings findings = Find(inFirst, inSecond);
  EXPECT_TRUE(findings.unjudged.empty());
  if (inGap > 2) {
    EXPECT_TRUE(findings.interferences.empty());
    return;
  }
  ASSERT_EQ(findings.interferences.size(), 1U);
  const Interference& found = findings.interferences.front();
  const Kind kind = inGap < -0.01 ? Kind::kClash : inGap > 1e-5 ? Kind::kClearance : Kind::kContact;
  EXPECT_EQ(static_cast<int>(found.kind), static_cast<int>(kind));
  EXPECT_LE(found.value,
            (kind == Kind::kContact ? 0 : inGap) + (kind == Kind::kClash ? 1e-3 : 1e-6));
  ExpectPointsShowValue(inFirst, inSecond, found);
}

unsigned long FromEnvironment(const char* inName, unsigned long inDefault) {
  const char* const text = std::getenv(inName);
  return text == nullptr ? inDefault : std::strtoul(text, nullptr, 10);
}

TEST(RandomPairs, AsTheirDistanceFunctionsSay) {
  constexpr double kGaps[] = {-2, -0.5, -0.1, -0.02, -0.005, 0, 0.000005, 0.001, 0.1, 1.9, 2.1};
  Random random(static_cast<Random::result_type>(FromEnvironment("ZOR_RANDOM_SEED", 1)));
  for (unsigned long left = FromEnvironment("ZOR_RANDOM_PAIRS", 40); left > 0;) {
    const Placed first{RandomSolid(random), RandomTurn(random)};
    Placed second{RandomSolid(random), RandomTurn(random)};
    const Vector direction = RandomDirection(random);
    const double gap = kGaps[random() % std::size(kGaps)];
    if (!MoveTo(gap, direction, first, second)) continue;
    --left;
    SCOPED_TRACE(Written(first) + "\n" + Written(second));
    ExpectGap(Gap(first, second), first, second);
  }
}

}  // namespace
}  // namespace ZORDetection
