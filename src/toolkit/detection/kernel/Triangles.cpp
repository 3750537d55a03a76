#include "toolkit/detection/kernel/Triangles.h"

#include <algorithm>
#include <cmath>
#include <limits>

namespace ZORDetection {
namespace {

gp_XYZ NormalOf(const Corners& inTriangle) {
  return (inTriangle[1] - inTriangle[0]) ^ (inTriangle[2] - inTriangle[0]);
}

/// Ericson, Real-Time Collision Detection, 5.1.9.
void ClosestOfSegments(const gp_XYZ& inP, const gp_XYZ& inPEnd, const gp_XYZ& inQ,
                       const gp_XYZ& inQEnd, gp_XYZ& outP, gp_XYZ& outQ) {
  const gp_XYZ d1 = inPEnd - inP, d2 = inQEnd - inQ, r = inP - inQ;
  const double a = d1 * d1, e = d2 * d2, f = d2 * r, c = d1 * r, b = d1 * d2;
  double s = 0, t = 0;
  if (a <= 0 && e <= 0) {
    outP = inP;
    outQ = inQ;
    return;
  }
  if (a <= 0) {
    t = std::clamp(f / e, 0.0, 1.0);
  } else if (e <= 0) {
    s = std::clamp(-c / a, 0.0, 1.0);
  } else {
    const double denominator = a * e - b * b;
    if (denominator > 0) s = std::clamp((b * f - c * e) / denominator, 0.0, 1.0);
    t = (b * s + f) / e;
    if (t < 0) {
      t = 0;
      s = std::clamp(-c / a, 0.0, 1.0);
    } else if (t > 1) {
      t = 1;
      s = std::clamp((b - c) / a, 0.0, 1.0);
    }
  }
  outP = inP + d1 * s;
  outQ = inQ + d2 * t;
}

void Keep(const gp_XYZ& inFirst, const gp_XYZ& inSecond, ClosestPoints& ioBest) {
  const double square = (inFirst - inSecond).SquareModulus();
  if (square < ioBest.squareDistance) ioBest = {square, inFirst, inSecond};
}

/// Square distance between the second triangle and the first one's plane.
double SquarePlaneGap(const Corners& inFirst, const Corners& inSecond) {
  const gp_XYZ normal = NormalOf(inFirst);
  const double square = normal.SquareModulus();
  if (square <= 0) return 0;
  double low = std::numeric_limits<double>::infinity(), high = -low;
  for (const gp_XYZ& corner : inSecond) {
    const double height = (corner - inFirst[0]) * normal;
    low = std::min(low, height);
    high = std::max(high, height);
  }
  const double gap = std::max({low, -high, 0.0});
  return gap * gap / square;
}

/// Where the edges of one triangle pass through the other.
void AddPiercings(const Corners& inEdges, const Corners& inTriangle,
                  std::array<gp_XYZ, 6>& ioPoints, std::size_t& ioCount) {
  const gp_XYZ normal = NormalOf(inTriangle);
  std::array<double, 3> heights{};
  for (std::size_t i = 0; i < 3; ++i) heights[i] = (inEdges[i] - inTriangle[0]) * normal;
  for (std::size_t i = 0; i < 3; ++i) {
    const std::size_t next = (i + 1) % 3;
    const double from = heights[i], to = heights[next];
    if ((from >= 0) == (to >= 0)) continue;
    const gp_XYZ point = inEdges[i] + (inEdges[next] - inEdges[i]) * (from / (from - to));
    bool isInside = true;
    for (std::size_t k = 0; k < 3; ++k) {
      const gp_XYZ edge = inTriangle[(k + 1) % 3] - inTriangle[k];
      isInside = isInside && (edge ^ (point - inTriangle[k])) * normal >= 0;
    }
    if (isInside) ioPoints[ioCount++] = point;
  }
}

}  // namespace

gp_XYZ ClosestOnSegment(const gp_XYZ& inPoint, const gp_XYZ& inStart, const gp_XYZ& inEnd) {
  const gp_XYZ along = inEnd - inStart;
  const double square = along * along;
  if (square <= 0) return inStart;
  return inStart + along * std::clamp((inPoint - inStart) * along / square, 0.0, 1.0);
}

/// Ericson, Real-Time Collision Detection, 5.1.5.
gp_XYZ ClosestOnTriangle(const gp_XYZ& inPoint, const Corners& inTriangle) {
  const auto& [a, b, c] = inTriangle;
  const gp_XYZ ab = b - a, ac = c - a, ap = inPoint - a;
  const double d1 = ab * ap, d2 = ac * ap;
  if (d1 <= 0 && d2 <= 0) return a;
  const gp_XYZ bp = inPoint - b;
  const double d3 = ab * bp, d4 = ac * bp;
  if (d3 >= 0 && d4 <= d3) return b;
  const double vc = d1 * d4 - d3 * d2;
  if (vc <= 0 && d1 >= 0 && d3 <= 0) return a + ab * (d1 == d3 ? 0 : d1 / (d1 - d3));
  const gp_XYZ cp = inPoint - c;
  const double d5 = ab * cp, d6 = ac * cp;
  if (d6 >= 0 && d5 <= d6) return c;
  const double vb = d5 * d2 - d1 * d6;
  if (vb <= 0 && d2 >= 0 && d6 <= 0) return a + ac * (d2 == d6 ? 0 : d2 / (d2 - d6));
  const double va = d3 * d6 - d5 * d4;
  if (va <= 0 && d4 - d3 >= 0 && d5 - d6 >= 0) {
    const double sum = (d4 - d3) + (d5 - d6);
    return b + (c - b) * (sum == 0 ? 0 : (d4 - d3) / sum);
  }
  const double sum = va + vb + vc;
  if (!(sum > 0)) return ClosestOnSegment(inPoint, a, b);
  return a + ab * (vb / sum) + ac * (vc / sum);
}

std::array<double, 3> BarycentricOf(const gp_XYZ& inPoint, const Corners& inTriangle) {
  const gp_XYZ normal = NormalOf(inTriangle);
  const double square = normal.SquareModulus();
  if (square <= 0) return {1, 0, 0};
  const auto weight = [&](std::size_t i) {
    const gp_XYZ& from = inTriangle[(i + 1) % 3];
    return ((inTriangle[(i + 2) % 3] - from) ^ (inPoint - from)) * normal / square;
  };
  return {weight(0), weight(1), weight(2)};
}

std::optional<std::array<gp_XYZ, 2>> CrossingOf(const Corners& inFirst, const Corners& inSecond) {
  std::array<gp_XYZ, 6> points;
  std::size_t count = 0;
  AddPiercings(inFirst, inSecond, points, count);
  AddPiercings(inSecond, inFirst, points, count);
  if (count == 0) return std::nullopt;
  std::array<gp_XYZ, 2> ends{points[0], points[0]};
  double longest = -1;
  for (std::size_t i = 0; i < count; ++i)
    for (std::size_t j = i; j < count; ++j) {
      const double square = (points[i] - points[j]).SquareModulus();
      if (square > longest) {
        longest = square;
        ends = {points[i], points[j]};
      }
    }
  return ends;
}

ClosestPoints ClosestOfTriangles(const Corners& inFirst, const Corners& inSecond, double inCutOff) {
  ClosestPoints best{std::numeric_limits<double>::infinity(), inFirst[0], inSecond[0]};
  if (SquarePlaneGap(inFirst, inSecond) > inCutOff ||
      SquarePlaneGap(inSecond, inFirst) > inCutOff) {
    best.squareDistance = (inFirst[0] - inSecond[0]).SquareModulus();
    return best;
  }
  for (std::size_t i = 0; i < 3; ++i) {
    Keep(inFirst[i], ClosestOnTriangle(inFirst[i], inSecond), best);
    Keep(ClosestOnTriangle(inSecond[i], inFirst), inSecond[i], best);
    for (std::size_t j = 0; j < 3; ++j) {
      gp_XYZ p, q;
      ClosestOfSegments(inFirst[i], inFirst[(i + 1) % 3], inSecond[j], inSecond[(j + 1) % 3], p, q);
      Keep(p, q, best);
    }
  }
  if (best.squareDistance > 0)
    if (const auto crossing = CrossingOf(inFirst, inSecond)) {
      const gp_XYZ middle = ((*crossing)[0] + (*crossing)[1]) * 0.5;
      best = {0, middle, middle};
    }
  return best;
}

}  // namespace ZORDetection
