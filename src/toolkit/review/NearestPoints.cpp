#include "toolkit/review/NearestPoints.h"

#include <algorithm>
#include <bit>
#include <cmath>
#include <numeric>

namespace ZORToolkit {
namespace {

constexpr std::size_t kLeaf = 8;

double SquaredDistance(const AssignmentPoint& inA, const AssignmentPoint& inB,
                       std::size_t inCount) {
  double sum = 0;
  for (std::size_t i = 0; i < inCount; ++i)
    sum += (inA.at[i] - inB.at[i]) * (inA.at[i] - inB.at[i]);
  return sum;
}

}  // namespace

NearestPoints::NearestPoints(std::span<const AssignmentPoint> inPoints, double inMaxDistance,
                             std::size_t inMaxCount)
    : points_(inPoints),
      maxDistance_(inMaxDistance),
      farSquared_(1.000001 * inMaxDistance * inMaxDistance),
      maxCount_(inMaxCount),
      order_(inPoints.size()) {
  if (MakeGrid()) return;
  std::iota(order_.begin(), order_.end(), 0);
  Split(0, order_.size(), 0);
}

NearestPoints::Found NearestPoints::Of(const AssignmentPoint& inPoint) {
  nearest_.clear();
  if (cellEdge_ > 0)
    SearchGrid(inPoint);
  else
    Search(0, order_.size(), 0, inPoint);
  std::ranges::sort(nearest_);
  return nearest_;
}

/// Cells are twice the distance wide, so that what is near a point is in eight of them.
/// @return whether few points share a cell, and all are where cells can be counted.
bool NearestPoints::MakeGrid() {
  constexpr double kFarthestCell = 1e9;
  constexpr std::uint64_t kCrowd = 16;
  const double edge = 2.00001 * maxDistance_;
  if (points_.size() <= kLeaf || !(edge > 0) || !std::isfinite(edge)) return false;
  for (const AssignmentPoint& point : points_)
    for (std::size_t axis = 0; axis < 3; ++axis)
      if (!(std::abs(point.at[axis]) / edge < kFarthestCell)) return false;
  cellEdge_ = edge;
  cells_.reserve(points_.size());
  buckets_.assign(2 * std::bit_ceil(points_.size()) + 1, 0);
  for (const AssignmentPoint& point : points_) {
    cells_.push_back(CellOf(point, 0));
    ++buckets_[BucketOf(cells_.back())];
  }
  std::uint64_t sharing = 0;
  for (const std::uint64_t count : buckets_) sharing += count * count;
  if (sharing > kCrowd * points_.size()) {
    cellEdge_ = 0;
    return false;
  }
  std::exclusive_scan(buckets_.begin(), buckets_.end(), buckets_.begin(), 0u);
  // Each bucket is filled from its end, which leaves where it begins.
  for (std::size_t i = 0; i + 1 < buckets_.size(); ++i) buckets_[i] = buckets_[i + 1];
  for (std::size_t i = points_.size(); i-- > 0;)
    order_[--buckets_[BucketOf(cells_[i])]] = static_cast<int>(i);
  return true;
}

/// @return the cell of a point that is moved along all axes.
NearestPoints::Cell NearestPoints::CellOf(const AssignmentPoint& inPoint, double inShift) const {
  Cell cell;
  for (std::size_t axis = 0; axis < 3; ++axis) {
    const double number = std::floor((inPoint.at[axis] + inShift) / cellEdge_);
    cell[axis] = static_cast<std::int32_t>(std::fmin(std::fmax(number, -2e9), 2e9));
  }
  return cell;
}

std::size_t NearestPoints::BucketOf(const Cell& inCell) const {
  std::uint64_t hash = 0;
  for (const std::int32_t number : inCell)
    hash = (hash ^ static_cast<std::uint32_t>(number)) * 0x9E3779B97F4A7C15u;
  return (hash >> 32) & (buckets_.size() - 2);
}

void NearestPoints::SearchGrid(const AssignmentPoint& inPoint) {
  const double reach = 1.000001 * maxDistance_;
  const Cell low = CellOf(inPoint, -reach), high = CellOf(inPoint, reach);
  for (std::int32_t x = low[0]; x <= high[0]; ++x)
    for (std::int32_t y = low[1]; y <= high[1]; ++y)
      for (std::int32_t z = low[2]; z <= high[2]; ++z) {
        const Cell cell{x, y, z};
        const std::size_t bucket = BucketOf(cell);
        for (std::uint32_t i = buckets_[bucket]; i < buckets_[bucket + 1]; ++i)
          if (cells_[static_cast<std::size_t>(order_[i])] == cell) Offer(order_[i], inPoint);
      }
}

void NearestPoints::Split(std::size_t inBegin, std::size_t inEnd, std::size_t inAxis) {
  if (inEnd - inBegin <= kLeaf) return;
  const std::size_t middle = (inBegin + inEnd) / 2;
  const auto at = [&](std::size_t inPosition) {
    return order_.begin() + static_cast<std::ptrdiff_t>(inPosition);
  };
  std::nth_element(at(inBegin), at(middle), at(inEnd), [&](int inA, int inB) {
    return std::pair(Coordinate(inA, inAxis), inA) < std::pair(Coordinate(inB, inAxis), inB);
  });
  Split(inBegin, middle, (inAxis + 1) % 4);
  Split(middle + 1, inEnd, (inAxis + 1) % 4);
}

void NearestPoints::Search(std::size_t inBegin, std::size_t inEnd, std::size_t inAxis,
                           const AssignmentPoint& inPoint) {
  if (inEnd - inBegin <= kLeaf) {
    for (std::size_t i = inBegin; i < inEnd; ++i) Offer(order_[i], inPoint);
    return;
  }
  const std::size_t middle = (inBegin + inEnd) / 2;
  const double ahead = inPoint.at[inAxis] - Coordinate(order_[middle], inAxis);
  const std::size_t next = (inAxis + 1) % 4;
  const auto lower = [&] { Search(inBegin, middle, next, inPoint); };
  const auto upper = [&] { Search(middle + 1, inEnd, next, inPoint); };
  Offer(order_[middle], inPoint);
  ahead < 0 ? lower() : upper();
  const bool isFull = nearest_.size() == maxCount_;
  if (isFull && ahead * ahead > nearest_.front().first) return;
  if (inAxis < 3 && std::abs(ahead) > maxDistance_) return;
  ahead < 0 ? upper() : lower();
}

void NearestPoints::Offer(int inCandidate, const AssignmentPoint& inPoint) {
  const AssignmentPoint& candidate = points_[static_cast<std::size_t>(inCandidate)];
  const double squared = SquaredDistance(candidate, inPoint, 3);
  if (squared > farSquared_ || std::sqrt(squared) > maxDistance_) return;
  const std::pair found(SquaredDistance(candidate, inPoint, 4), inCandidate);
  if (nearest_.size() < maxCount_) {
    nearest_.push_back(found);
    if (nearest_.size() == maxCount_) std::make_heap(nearest_.begin(), nearest_.end());
  } else if (found < nearest_.front()) {
    std::pop_heap(nearest_.begin(), nearest_.end());
    nearest_.back() = found;
    std::push_heap(nearest_.begin(), nearest_.end());
  }
}

}  // namespace ZORToolkit
