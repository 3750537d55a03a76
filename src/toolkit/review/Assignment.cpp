#include "toolkit/review/Assignment.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <numeric>
#include <queue>
#include <tuple>

namespace ZORToolkit {
namespace {

constexpr std::size_t kMaxCandidates = 64;
constexpr double kSameCost = 1e-9;
constexpr double kInfinite = std::numeric_limits<double>::infinity();

typedef std::span<const AssignmentPoint> Points;

double SquaredDistance(const AssignmentPoint& inA, const AssignmentPoint& inB,
                       std::size_t inCount) {
  double sum = 0;
  for (std::size_t i = 0; i < inCount; ++i)
    sum += (inA.at[i] - inB.at[i]) * (inA.at[i] - inB.at[i]);
  return sum;
}

/// A balanced k-d tree over the order of its points (J. L. Bentley, 1975), asked for the nearest.
class NearestPoints {
 public:
  /// @param inMaxDistance of the first three coordinates.
  NearestPoints(Points inPoints, double inMaxDistance)
      : points_(inPoints),
        maxDistance_(inMaxDistance),
        farSquared_(1.000001 * inMaxDistance * inMaxDistance),
        order_(inPoints.size()) {
    std::iota(order_.begin(), order_.end(), 0);
    Split(0, order_.size(), 0);
  }

  /// The nearest, at most kMaxCandidates, as pairs of squared distance and point.
  std::vector<std::pair<double, int>> Of(const AssignmentPoint& inPoint) {
    nearest_.clear();
    Search(0, order_.size(), 0, inPoint);
    return nearest_;
  }

 private:
  static constexpr std::size_t kLeaf = 8;

  void Split(std::size_t inBegin, std::size_t inEnd, std::size_t inAxis) {
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

  void Search(std::size_t inBegin, std::size_t inEnd, std::size_t inAxis,
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
    const bool isFull = nearest_.size() == kMaxCandidates;
    if (isFull && ahead * ahead > nearest_.front().first) return;
    if (inAxis < 3 && std::abs(ahead) > maxDistance_) return;
    ahead < 0 ? upper() : lower();
  }

  void Offer(int inCandidate, const AssignmentPoint& inPoint) {
    const AssignmentPoint& candidate = points_[static_cast<std::size_t>(inCandidate)];
    const double squared = SquaredDistance(candidate, inPoint, 3);
    if (squared > farSquared_ || std::sqrt(squared) > maxDistance_) return;
    const std::pair found(SquaredDistance(candidate, inPoint, 4), inCandidate);
    if (nearest_.size() == kMaxCandidates) {
      if (!(found < nearest_.front())) return;
      std::pop_heap(nearest_.begin(), nearest_.end());
      nearest_.pop_back();
    }
    nearest_.push_back(found);
    std::push_heap(nearest_.begin(), nearest_.end());
  }

  double Coordinate(int inPoint, std::size_t inAxis) const {
    return points_[static_cast<std::size_t>(inPoint)].at[inAxis];
  }

  Points points_;
  double maxDistance_;
  double farSquared_;  // surely beyond it
  std::vector<int> order_;
  std::vector<std::pair<double, int>> nearest_;  // a heap, the farthest first
};

/// Places of the points by what they are, equal ones by their order.
std::vector<int> Sorted(Points inPoints) {
  std::vector<std::pair<double, int>> keyed;  // by the first coordinate, which mostly decides
  keyed.reserve(inPoints.size());
  for (const AssignmentPoint& point : inPoints)
    keyed.emplace_back(point.at[0], static_cast<int>(keyed.size()));
  std::ranges::sort(keyed, [&](const auto& inA, const auto& inB) {
    if (inA.first != inB.first) return inA.first < inB.first;
    const AssignmentPoint& a = inPoints[static_cast<std::size_t>(inA.second)];
    const AssignmentPoint& b = inPoints[static_cast<std::size_t>(inB.second)];
    return std::tie(a.at, a.kind, inA.second) < std::tie(b.at, b.kind, inB.second);
  });
  std::vector<int> order;
  order.reserve(keyed.size());
  for (const auto& [first, point] : keyed) order.push_back(point);
  return order;
}

struct Edge {
  int column;
  double cost;
};

class Solver {
 public:
  Solver(Points inRows, Points inColumns, const AssignmentCosts& inCosts)
      : rows_(inRows),
        columns_(inColumns),
        costs_(inCosts),
        rowOrder_(Sorted(inRows)),
        columnOrder_(Sorted(inColumns)) {
    result_.columnOfRow.assign(inRows.size(), -1);
    result_.isAmbiguous.assign(inRows.size(), 0);
    rowOfColumn_.assign(inColumns.size(), -1);
  }

  Assignment Solve() {
    AssignEqualPoints();
    FindEdges();
    price_.assign(columns_.size(), 0);
    distance_.assign(columns_.size(), kInfinite);
    pathRow_.assign(columns_.size(), -1);
    isDone_.assign(columns_.size(), 0);
    for (const int row : freeRows_) Augment(row);
    MarkAmbiguous();
    return std::move(result_);
  }

 private:
  // Costs are a metric, so that some best assignment holds all pairs that cost nothing.
  void AssignEqualPoints() {
    const std::vector<int>&rows = rowOrder_, &columns = columnOrder_;
    const auto key = [](const AssignmentPoint& inPoint) {
      return std::tie(inPoint.at, inPoint.kind);
    };
    for (std::size_t r = 0, c = 0; r < rows.size() && c < columns.size();) {
      const AssignmentPoint& row = rows_[static_cast<std::size_t>(rows[r])];
      const AssignmentPoint& column = columns_[static_cast<std::size_t>(columns[c])];
      if (key(row) < key(column)) {
        ++r;
      } else if (key(column) < key(row)) {
        ++c;
      } else {
        std::size_t rowEnd = r, columnEnd = c;
        while (rowEnd < rows.size() &&
               key(rows_[static_cast<std::size_t>(rows[rowEnd])]) == key(row))
          ++rowEnd;
        while (columnEnd < columns.size() &&
               key(columns_[static_cast<std::size_t>(columns[columnEnd])]) == key(row))
          ++columnEnd;
        const bool isAmbiguous = rowEnd - r > 1 || columnEnd - c > 1;
        for (; r < rowEnd && c < columnEnd; ++r, ++c) Assign(rows[r], columns[c], isAmbiguous);
        r = rowEnd;
        c = columnEnd;
      }
    }
  }

  void Assign(int inRow, int inColumn, bool inIsAmbiguous) {
    result_.columnOfRow[static_cast<std::size_t>(inRow)] = inColumn;
    result_.isAmbiguous[static_cast<std::size_t>(inRow)] = inIsAmbiguous ? 1 : 0;
    rowOfColumn_[static_cast<std::size_t>(inColumn)] = inRow;
  }

  /// Free points that stand at one spot.
  typedef std::vector<std::vector<int>> Spots;
  static Spots SpotsOf(Points inPoints, const std::vector<int>& inOrder,
                       const std::vector<int>& inTaken) {
    Spots spots;
    for (const int point : inOrder) {
      const auto p = static_cast<std::size_t>(point);
      if (inTaken[p] >= 0) continue;
      if (spots.empty() || inPoints[static_cast<std::size_t>(spots.back()[0])].at != inPoints[p].at)
        spots.emplace_back();
      spots.back().push_back(point);
    }
    return spots;
  }

  void FindEdges() {
    edges_.resize(rows_.size());
    const Spots spots = SpotsOf(columns_, columnOrder_, rowOfColumn_);
    std::vector<AssignmentPoint> places;
    for (const std::vector<int>& spot : spots)
      places.push_back(columns_[static_cast<std::size_t>(spot[0])]);
    NearestPoints nearest(places, costs_.maxDistance);
    for (const std::vector<int>& rows : SpotsOf(rows_, rowOrder_, result_.columnOfRow)) {
      std::vector<std::pair<double, int>> found =
          nearest.Of(rows_[static_cast<std::size_t>(rows[0])]);
      std::ranges::sort(found);
      for (std::size_t rank = 0; rank < rows.size(); ++rank) {
        freeRows_.push_back(rows[rank]);
        AddEdges(rows[rank], rank, found, spots);
      }
    }
    std::ranges::sort(freeRows_);
  }

  /// Of columns at one spot each row begins with another, so that they are enough for all rows.
  void AddEdges(int inRow, std::size_t inRank, const std::vector<std::pair<double, int>>& inFound,
                const Spots& inSpots) {
    const AssignmentPoint& row = rows_[static_cast<std::size_t>(inRow)];
    std::vector<Edge>& edges = edges_[static_cast<std::size_t>(inRow)];
    for (const auto& [squared, spot] : inFound) {
      const std::vector<int>& columns = inSpots[static_cast<std::size_t>(spot)];
      for (std::size_t i = 0; i < columns.size() && edges.size() < kMaxCandidates; ++i) {
        const int column = columns[(inRank + i) % columns.size()];
        const bool isOther = row.kind != columns_[static_cast<std::size_t>(column)].kind;
        edges.push_back({column, std::sqrt(squared) + (isOther ? costs_.otherKind : 0)});
      }
    }
  }

  double CostOf(int inRow, int inColumn) const {
    const std::vector<Edge>& edges = edges_[static_cast<std::size_t>(inRow)];
    return std::ranges::find(edges, inColumn, &Edge::column)->cost;
  }

  /// Offers the columns of a row that is reached at a distance.
  void Scan(int inRow, double inDistance) {
    for (const Edge& edge : edges_[static_cast<std::size_t>(inRow)]) {
      const auto column = static_cast<std::size_t>(edge.column);
      const double distance = inDistance + edge.cost - price_[column];
      if (isDone_[column] || !(distance < distance_[column])) continue;
      if (distance_[column] == kInfinite) touched_.push_back(edge.column);
      distance_[column] = distance;
      pathRow_[column] = inRow;
      heap_.push({distance, edge.column});
    }
    // Any row on the way may stay alone instead.
    if (inDistance + costs_.unassigned < aloneDistance_) {
      aloneDistance_ = inDistance + costs_.unassigned;
      aloneRow_ = inRow;
    }
  }

  void Augment(int inRow) {
    heap_ = {};
    touched_.clear();
    aloneDistance_ = kInfinite;
    aloneRow_ = -1;
    Scan(inRow, 0);
    int freeColumn = -1;
    double end = aloneDistance_;
    while (!heap_.empty()) {
      const auto [distance, column] = heap_.top();
      heap_.pop();
      const auto c = static_cast<std::size_t>(column);
      if (isDone_[c] || distance > distance_[c]) continue;
      if (distance >= aloneDistance_) break;
      const int row = rowOfColumn_[c];
      if (row < 0) {
        freeColumn = column;
        end = distance;
        break;
      }
      isDone_[c] = 1;
      Scan(row, distance - (CostOf(row, column) - price_[c]));
    }
    if (freeColumn < 0) end = aloneDistance_;
    for (const int column : touched_) {
      const auto c = static_cast<std::size_t>(column);
      if (isDone_[c]) price_[c] += distance_[c] - end;
    }
    Flip(inRow, freeColumn);
    for (const int column : touched_) {
      distance_[static_cast<std::size_t>(column)] = kInfinite;
      isDone_[static_cast<std::size_t>(column)] = 0;
    }
  }

  /// Takes the path to a free column, or to the row that stays alone.
  void Flip(int inStart, int inFreeColumn) {
    int column = inFreeColumn;
    if (column < 0) {
      if (aloneRow_ == inStart) return;
      column = result_.columnOfRow[static_cast<std::size_t>(aloneRow_)];
      result_.columnOfRow[static_cast<std::size_t>(aloneRow_)] = -1;
    }
    for (;;) {
      const int row = pathRow_[static_cast<std::size_t>(column)];
      rowOfColumn_[static_cast<std::size_t>(column)] = row;
      std::swap(result_.columnOfRow[static_cast<std::size_t>(row)], column);
      if (row == inStart) return;
    }
  }

  void MarkAmbiguous() {
    for (const int row : freeRows_) {
      const int column = result_.columnOfRow[static_cast<std::size_t>(row)];
      if (column < 0) continue;
      const double cost = CostOf(row, column);
      for (const Edge& edge : edges_[static_cast<std::size_t>(row)])
        if (edge.column != column && std::abs(edge.cost - cost) <= kSameCost)
          result_.isAmbiguous[static_cast<std::size_t>(row)] = 1;
    }
  }

  Points rows_, columns_;
  AssignmentCosts costs_;
  std::vector<int> rowOrder_, columnOrder_;  // see Sorted
  Assignment result_;
  std::vector<int> rowOfColumn_, freeRows_;
  std::vector<std::vector<Edge>> edges_;  // of each row
  std::vector<double> price_, distance_;  // of each column
  std::vector<int> pathRow_, touched_;
  std::vector<char> isDone_;
  std::priority_queue<std::pair<double, int>, std::vector<std::pair<double, int>>, std::greater<>>
      heap_;
  double aloneDistance_ = kInfinite;
  int aloneRow_ = -1;
};

}  // namespace

Assignment BestAssignment(std::span<const AssignmentPoint> inRows,
                          std::span<const AssignmentPoint> inColumns,
                          const AssignmentCosts& inCosts) {
  return Solver(inRows, inColumns, inCosts).Solve();
}

}  // namespace ZORToolkit
