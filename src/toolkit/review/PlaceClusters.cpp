#include "toolkit/review/PlaceClusters.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <numeric>
#include <tuple>

namespace ZORToolkit {
namespace {

/// Joins what belongs together (B. A. Galler, M. J. Fischer, "An improved equivalence algorithm",
/// 1964), with path halving.
class DisjointSets {
 public:
  explicit DisjointSets(std::size_t inCount) : parents_(inCount) {
    std::iota(parents_.begin(), parents_.end(), std::size_t{0});
  }
  std::size_t Find(std::size_t inItem) {
    while (parents_[inItem] != inItem) {
      parents_[inItem] = parents_[parents_[inItem]];
      inItem = parents_[inItem];
    }
    return inItem;
  }
  void Join(std::size_t inA, std::size_t inB) {
    inA = Find(inA);
    inB = Find(inB);
    parents_[std::max(inA, inB)] = std::min(inA, inB);
  }

 private:
  std::vector<std::size_t> parents_;
};

/// Points of one cell are always within the distance; cells are joined when a point of one is near
/// a point of the other.
class Clusters {
 public:
  Clusters(const std::vector<Point3>& inPoints, double inDistance)
      : points_(inPoints), distance_(inDistance), sets_(inPoints.size()) {
    FillCells();
    for (std::int64_t x = 0; x <= 2; ++x)
      for (std::int64_t y = -2; y <= 2; ++y)
        // Half of the neighbours: the others meet a cell from their side.
        if (std::tuple(x, y) >= std::tuple(0, 0)) JoinRows(x, y);
  }

  std::size_t ClusterOf(std::size_t inPoint) { return sets_.Find(inPoint); }

 private:
  typedef std::array<std::int64_t, 3> Spot;
  struct Cell {
    Spot spot;
    std::vector<std::size_t> points;  // different ones
    Point3 low, high;
  };

  void FillCells() {
    const double edge = std::max(distance_, 1e-6) / std::sqrt(3.0);
    const auto number = [&](double inCoordinate) {
      return static_cast<std::int64_t>(std::floor(std::clamp(inCoordinate / edge, -4e18, 4e18)));
    };
    const auto coordinates = [&](std::size_t inPoint) {
      const Point3& point = points_[inPoint];
      return std::tuple(point.x, point.y, point.z);
    };
    std::vector<std::pair<Spot, std::size_t>> order;
    order.reserve(points_.size());
    for (std::size_t i = 0; i < points_.size(); ++i)
      order.emplace_back(Spot{number(points_[i].x), number(points_[i].y), number(points_[i].z)}, i);
    std::ranges::sort(order, [&](const auto& inA, const auto& inB) {
      if (inA.first != inB.first) return inA.first < inB.first;
      return coordinates(inA.second) < coordinates(inB.second);
    });
    for (const auto& [spot, point] : order) {
      const Point3& at = points_[point];
      if (cells_.empty() || cells_.back().spot != spot) {
        cells_.push_back({spot, {point}, at, at});
        continue;
      }
      Cell& cell = cells_.back();
      sets_.Join(cell.points.back(), point);
      if (coordinates(cell.points.back()) == coordinates(point)) continue;
      cell.points.push_back(point);
      cell.low = {std::min(cell.low.x, at.x), std::min(cell.low.y, at.y),
                  std::min(cell.low.z, at.z)};
      cell.high = {std::max(cell.high.x, at.x), std::max(cell.high.y, at.y),
                   std::max(cell.high.z, at.z)};
    }
  }

  /// Joins each cell with those that are so far in x and y, and up to two away in z: in both, cells
  /// come in the same order.
  void JoinRows(std::int64_t inX, std::int64_t inY) {
    const bool isOwnRow = inX == 0 && inY == 0;
    std::size_t begin = 0;
    for (const Cell& cell : cells_) {
      const auto& [x, y, z] = cell.spot;
      const Spot first{x + inX, y + inY, z + (isOwnRow ? 1 : -2)}, last{x + inX, y + inY, z + 2};
      while (begin < cells_.size() && cells_[begin].spot < first) ++begin;
      for (std::size_t i = begin; i < cells_.size() && cells_[i].spot <= last; ++i)
        JoinIfNear(cell, cells_[i]);
    }
  }

  void JoinIfNear(const Cell& inA, const Cell& inB) {
    if (sets_.Find(inA.points.front()) == sets_.Find(inB.points.front())) return;
    const std::vector<std::size_t> others = NearTo(inA, inB);
    for (const std::size_t a : NearTo(inB, inA))
      for (const std::size_t b : others) {
        if (ZORFoundation::Length(points_[a] - points_[b]) > distance_) continue;
        sets_.Join(a, b);
        return;
      }
  }

  /// The points of inOf that the box of inBox leaves a chance.
  std::vector<std::size_t> NearTo(const Cell& inBox, const Cell& inOf) const {
    std::vector<std::size_t> near;
    const auto clamped = [](double inAt, double inLow, double inHigh) {
      return std::min(std::max(inAt, inLow), inHigh);
    };
    for (const std::size_t point : inOf.points) {
      const Point3& at = points_[point];
      const Point3 nearest{clamped(at.x, inBox.low.x, inBox.high.x),
                           clamped(at.y, inBox.low.y, inBox.high.y),
                           clamped(at.z, inBox.low.z, inBox.high.z)};
      if (!(ZORFoundation::Length(at - nearest) > distance_)) near.push_back(point);
    }
    return near;
  }

  const std::vector<Point3>& points_;
  double distance_;
  DisjointSets sets_;
  std::vector<Cell> cells_;  // in the order of their spots
};

}  // namespace

std::vector<int> ClusterPlaces(const std::vector<Point3>& inPoints, double inDistance) {
  std::vector<int> numbers(inPoints.size(), 0);
  if (inPoints.size() < 2) return numbers;
  Clusters clusters(inPoints, inDistance);
  int count = 0;
  // The representative of a set is its first point.
  for (std::size_t i = 0; i < inPoints.size(); ++i) {
    const std::size_t first = clusters.ClusterOf(i);
    numbers[i] = first == i ? count++ : numbers[first];
  }
  return numbers;
}

}  // namespace ZORToolkit
