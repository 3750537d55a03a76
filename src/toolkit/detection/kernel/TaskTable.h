// Which pairs of products have one verdict.
#ifndef ZOR_TOOLKIT_DETECTION_KERNEL_TASK_TABLE_H
#define ZOR_TOOLKIT_DETECTION_KERNEL_TASK_TABLE_H

#include <array>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <gp_Trsf.hxx>
#include <unordered_map>
#include <vector>

namespace ZORDetection {

/// Two parts in a relative placement, judged once for all pairs of products that have it.
struct Task {
  std::uint32_t firstPart = 0, secondPart = 0;
  gp_Trsf firstFromSecond;
};

/// A pair of products and its task.
struct PairOfProducts {
  std::uint32_t first = 0, second = 0;
  std::size_t task = 0;
  bool isSwapped = false;  ///< the task's first part is the second product's
};

/// Finds the task of a relative placement. Placements that differ by rounding alone have one task,
/// also where the border between two cells of the hash lies between them.
class TaskTable {
 public:
  std::size_t TaskFor(std::uint32_t inFirst, std::uint32_t inSecond, const gp_Trsf& inMotion,
                      double inSize) {
    Key key{};
    std::array<double, 12> scaled{};
    std::size_t at = 0;
    for (int row = 1; row <= 3; ++row)
      for (int column = 1; column <= 4; ++column)
        scaled[at++] = inMotion.Value(row, column) / (column == 4 ? kCell : kCell / inSize);
    std::vector<std::size_t> unsure;
    for (std::size_t i = 0; i < scaled.size(); ++i) {
      key.cells[i] = std::llround(scaled[i]);
      if (std::abs(std::abs(scaled[i] - static_cast<double>(key.cells[i])) - 0.5) < kBorder)
        unsure.push_back(i);
    }
    key.first = inFirst;
    key.second = inSecond;
    const std::size_t variants = unsure.size() > 4 ? 1 : std::size_t{1} << unsure.size();
    for (std::size_t variant = 0; variant < variants; ++variant) {
      Key other = key;
      for (std::size_t i = 0; i < unsure.size(); ++i)
        if ((variant >> i & 1U) != 0)
          other.cells[unsure[i]] +=
              scaled[unsure[i]] > static_cast<double>(key.cells[unsure[i]]) ? 1 : -1;
      if (const auto known = places_.find(other); known != places_.end()) return known->second;
    }
    places_.emplace(key, tasks_.size());
    tasks_.push_back({inFirst, inSecond, inMotion});
    return tasks_.size() - 1;
  }

  const std::vector<Task>& Tasks() const { return tasks_; }

 private:
  static constexpr double kCell = 1e-6;    // millimetres
  static constexpr double kBorder = 1e-3;  // of a cell

  struct Key {
    std::uint32_t first, second;
    std::array<std::int64_t, 12> cells;
    bool operator==(const Key&) const = default;
  };
  struct KeyHash {
    std::size_t operator()(const Key& inKey) const {
      std::uint64_t hash = inKey.first * 0x9E3779B97F4A7C15ULL + inKey.second;
      for (const std::int64_t cell : inKey.cells) {
        hash = (hash ^ static_cast<std::uint64_t>(cell)) * 0xBF58476D1CE4E5B9ULL;
        hash ^= hash >> 29U;
      }
      return hash;
    }
  };

  std::unordered_map<Key, std::size_t, KeyHash> places_;
  std::vector<Task> tasks_;
};

}  // namespace ZORDetection

#endif
