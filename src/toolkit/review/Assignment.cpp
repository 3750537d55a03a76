#include "toolkit/review/Assignment.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <queue>
#include <tuple>

#include "toolkit/review/NearestPoints.h"

namespace ZORToolkit {
namespace {

constexpr std::size_t kMaxCandidates = 64;
constexpr double kSameCost = 1e-9;
constexpr double kInfinite = std::numeric_limits<double>::infinity();

typedef std::span<const AssignmentPoint> Points;

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

  /// Free points, those that stand at one spot together.
  struct Spots {
    std::vector<int> points;
    std::vector<std::size_t> begins{0};  // of each spot's points, and the end of the last

    std::size_t Count() const { return begins.size() - 1; }
    std::span<const int> At(std::size_t inSpot) const {
      return std::span(points).subspan(begins[inSpot], begins[inSpot + 1] - begins[inSpot]);
    }
  };
  static Spots SpotsOf(Points inPoints, const std::vector<int>& inOrder,
                       const std::vector<int>& inTaken) {
    Spots spots;
    const auto at = [&](int inPoint) -> const std::array<double, 4>& {
      return inPoints[static_cast<std::size_t>(inPoint)].at;
    };
    for (const int point : inOrder) {
      if (inTaken[static_cast<std::size_t>(point)] >= 0) continue;
      if (!spots.points.empty() && at(spots.points.back()) != at(point))
        spots.begins.push_back(spots.points.size());
      spots.points.push_back(point);
    }
    if (!spots.points.empty()) spots.begins.push_back(spots.points.size());
    return spots;
  }

  void FindEdges() {
    edgesOfRow_.resize(rows_.size());
    const Spots spots = SpotsOf(columns_, columnOrder_, rowOfColumn_);
    std::vector<AssignmentPoint> places;
    places.reserve(spots.Count());
    for (std::size_t i = 0; i < spots.Count(); ++i)
      places.push_back(columns_[static_cast<std::size_t>(spots.At(i)[0])]);
    NearestPoints nearest(places, costs_.maxDistance, kMaxCandidates);
    const Spots rowSpots = SpotsOf(rows_, rowOrder_, result_.columnOfRow);
    for (std::size_t i = 0; i < rowSpots.Count(); ++i) {
      const std::span<const int> rows = rowSpots.At(i);
      const NearestPoints::Found found = nearest.Of(rows_[static_cast<std::size_t>(rows[0])]);
      for (std::size_t rank = 0; rank < rows.size(); ++rank) {
        freeRows_.push_back(rows[rank]);
        AddEdges(rows[rank], rank, found, spots);
      }
    }
    std::ranges::sort(freeRows_);
  }

  /// Of columns at one spot each row begins with another, so that they are enough for all rows.
  void AddEdges(int inRow, std::size_t inRank, NearestPoints::Found inFound, const Spots& inSpots) {
    const AssignmentPoint& row = rows_[static_cast<std::size_t>(inRow)];
    const std::size_t begin = edges_.size();
    for (const auto& [squared, spot] : inFound) {
      const std::span<const int> columns = inSpots.At(static_cast<std::size_t>(spot));
      for (std::size_t i = 0; i < columns.size() && edges_.size() < begin + kMaxCandidates; ++i) {
        const int column = columns[(inRank + i) % columns.size()];
        const bool isOther = row.kind != columns_[static_cast<std::size_t>(column)].kind;
        edges_.push_back({column, std::sqrt(squared) + (isOther ? costs_.otherKind : 0)});
      }
    }
    edgesOfRow_[static_cast<std::size_t>(inRow)] = {begin, edges_.size()};
  }

  std::span<const Edge> EdgesOf(int inRow) const {
    const auto& [begin, end] = edgesOfRow_[static_cast<std::size_t>(inRow)];
    return std::span(edges_).subspan(begin, end - begin);
  }

  double CostOf(int inRow, int inColumn) const {
    return std::ranges::find(EdgesOf(inRow), inColumn, &Edge::column)->cost;
  }

  /// Offers the columns of a row that is reached at a distance.
  void Scan(int inRow, double inDistance) {
    for (const Edge& edge : EdgesOf(inRow)) {
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
      for (const Edge& edge : EdgesOf(row))
        if (edge.column != column && std::abs(edge.cost - cost) <= kSameCost)
          result_.isAmbiguous[static_cast<std::size_t>(row)] = 1;
    }
  }

  Points rows_, columns_;
  AssignmentCosts costs_;
  std::vector<int> rowOrder_, columnOrder_;  // see Sorted
  Assignment result_;
  std::vector<int> rowOfColumn_, freeRows_;
  std::vector<Edge> edges_;
  std::vector<std::pair<std::size_t, std::size_t>> edgesOfRow_;  // where they begin and end
  std::vector<double> price_, distance_;                         // of each column
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
