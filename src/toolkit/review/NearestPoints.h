// The nearest of many points; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_REVIEW_NEAREST_POINTS_H
#define ZOR_TOOLKIT_REVIEW_NEAREST_POINTS_H

#include <cstdint>
#include <utility>

#include "toolkit/review/Assignment.h"

namespace ZORToolkit {

/// Points that are asked which of them are near another one: by a grid where few are within the
/// distance that is asked for, so that all are found in linear time, else by a balanced k-d tree
/// over their order (J. L. Bentley, 1975).
class NearestPoints {
 public:
  typedef std::span<const std::pair<double, int>> Found;

  /// @param inPoints live as long as this.
  /// @param inMaxDistance of the first three coordinates.
  NearestPoints(std::span<const AssignmentPoint> inPoints, double inMaxDistance,
                std::size_t inMaxCount);

  /// The nearest by all four coordinates, as pairs of squared distance and point, the nearest first;
  /// of those at one distance the first. Valid until the next call.
  Found Of(const AssignmentPoint& inPoint);

 private:
  typedef std::array<std::int32_t, 3> Cell;

  bool MakeGrid();
  Cell CellOf(const AssignmentPoint& inPoint, double inShift) const;
  std::size_t BucketOf(const Cell& inCell) const;
  void SearchGrid(const AssignmentPoint& inPoint);
  void Split(std::size_t inBegin, std::size_t inEnd, std::size_t inAxis);
  void Search(std::size_t inBegin, std::size_t inEnd, std::size_t inAxis,
              const AssignmentPoint& inPoint);
  void Offer(int inCandidate, const AssignmentPoint& inPoint);
  double Coordinate(int inPoint, std::size_t inAxis) const {
    return points_[static_cast<std::size_t>(inPoint)].at[inAxis];
  }

  std::span<const AssignmentPoint> points_;
  double maxDistance_, farSquared_;  // what is surely beyond it
  std::size_t maxCount_;
  std::vector<int> order_;              // of the grid's buckets, or of the tree
  double cellEdge_ = 0;                 // 0 without a grid
  std::vector<Cell> cells_;             // of each point
  std::vector<std::uint32_t> buckets_;  // where each begins in order_, and the end of the last
  std::vector<std::pair<double, int>> nearest_;  // a heap once it is full, the farthest first
};

}  // namespace ZORToolkit

#endif
