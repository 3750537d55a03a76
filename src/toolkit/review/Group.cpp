#include "toolkit/review/Group.h"

#include <algorithm>
#include <array>
#include <bit>
#include <numeric>
#include <tuple>

#include "toolkit/review/GroupTable.h"
#include "toolkit/review/PlaceClusters.h"

namespace ZORToolkit {
namespace {

class Grouper {
 public:
  Grouper(const ReviewedResult& inResult, const GroupOptions& inOptions)
      : result_(inResult),
        options_(inOptions),
        table_(std::make_shared<GroupTable>(inResult)),
        levels_(table_->Levels()) {
    const std::size_t count = result_.interferences.size();
    values_.reserve(count);
    for (const ReviewRecord& record : result_.interferences)
      values_.push_back(record.value.Value().value_or(std::nan("")));
    levels_.reserve(options_.by.size());
    for (const GroupBy by : options_.by) {
      if (by == GroupBy::kPlace) ReadPlaces();
      if (by == GroupBy::kProduct) CountProducts();
      levels_.emplace_back(result_, by);
      levels_.back().groups.reserve(count + 1);
      levels_.back().members.reserve(count);
    }
  }

  InterferenceGroups Run() {
    std::vector<int> all(result_.interferences.size());
    std::iota(all.begin(), all.end(), 0);
    for (std::size_t level = 0; level < levels_.size(); ++level) {
      level_ = &levels_[level];
      FindKeys();
      if (level == 0) {
        if (!all.empty()) Split(all);
      } else {
        SplitAll(level - 1);
      }
      level_->groups.emplace_back().begin = static_cast<std::uint32_t>(all.size());
    }
    return InterferenceGroups(table_);
  }

 private:
  typedef GroupTable::Group Group;
  /// Members with one key, in a list of them that is sorted by keys.
  struct Bucket {
    std::uint64_t worst;  // in the order of the values; none is the last
    std::uint32_t begin, end;
    int first;
    bool operator<(const Bucket& inOther) const {
      const std::uint32_t size = end - begin, otherSize = inOther.end - inOther.begin;
      if (size != otherSize) return size > otherSize;
      return worst != inOther.worst ? worst < inOther.worst : first < inOther.first;
    }
  };
  struct Keyed {
    std::uint64_t key;
    int member;
    bool operator<(const Keyed& inOther) const {
      return std::tie(key, member) < std::tie(inOther.key, inOther.member);
    }
  };

  void SplitAll(std::size_t inLevel) {
    GroupTable::Level& outer = levels_[inLevel];
    for (std::size_t i = 0; i < outer.groups.size(); ++i) {
      outer.groups[i].inner = static_cast<std::uint32_t>(level_->groups.size());
      if (i < outer.Count()) Split(table_->MembersOf(inLevel, i));
    }
  }

  void ReadPlaces() {
    if (!places_.empty() || !result_.places.empty()) return;
    places_.reserve(result_.interferences.size());
    for (const ReviewRecord& record : result_.interferences)
      places_.push_back(result_.PlaceOf(record));
  }

  void CountProducts() {
    counts_.assign(result_.products.size(), 0);
    for (const ReviewRecord& record : result_.interferences)
      for (const int product : record.products)
        if (product >= 0) ++counts_[static_cast<std::size_t>(product)];
  }

  /// Members come in their order; of many by counting, eleven bits of the keys at a time.
  void SortKeyed() {
    constexpr std::size_t kMany = 512;
    constexpr int kBits = 11;
    constexpr std::uint64_t kMask = (std::uint64_t{1} << kBits) - 1;
    if (keyed_.size() < kMany) return std::sort(keyed_.begin(), keyed_.end());
    std::uint64_t differing = 0;
    for (const Keyed& one : keyed_) differing |= one.key ^ keyed_.front().key;
    for (int shift = 0; shift < 64; shift += kBits) {
      if (((differing >> shift) & kMask) == 0) continue;
      std::array<std::uint32_t, kMask + 1> ends{};
      for (const Keyed& one : keyed_) ++ends[(one.key >> shift) & kMask];
      std::exclusive_scan(ends.begin(), ends.end(), ends.begin(), 0u);
      sorted_.resize(keyed_.size());
      for (const Keyed& one : keyed_) sorted_[ends[(one.key >> shift) & kMask]++] = one;
      keyed_.swap(sorted_);
    }
  }

  void Split(std::span<const int> inMembers) {
    keyed_.clear();
    if (inMembers.size() == 1) {  // most groups of most results
      keyed_.push_back({KeyOf(inMembers.front()), inMembers.front()});
      return Make(0, 1);
    }
    if (level_->by == GroupBy::kPlace)
      KeyByPlace(inMembers);
    else
      for (const int member : inMembers) keyed_.push_back({KeyOf(member), member});
    SortKeyed();
    FindBuckets();
    for (const Bucket& bucket : buckets_) Make(bucket.begin, bucket.end);
  }

  /// The largest first; of equal size the worst, then that whose first member comes first.
  void FindBuckets() {
    buckets_.clear();
    const auto count = static_cast<std::uint32_t>(keyed_.size());
    for (std::uint32_t begin = 0, end = 0; begin < count; begin = end) {
      double worst = HUGE_VAL;
      for (; end < count && keyed_[end].key == keyed_[begin].key; ++end)
        worst = std::fmin(worst, ValueOf(keyed_[end].member));
      buckets_.push_back({InOrder(worst), begin, end, keyed_[begin].member});
    }
    std::sort(buckets_.begin(), buckets_.end());
  }

  /// A number as bits that compare as it does.
  static std::uint64_t InOrder(double inNumber) {
    const auto bits = std::bit_cast<std::uint64_t>(inNumber + 0.0);  // one zero
    constexpr std::uint64_t kSign = std::uint64_t{1} << 63;
    return (bits & kSign) != 0 ? ~bits : bits | kSign;
  }

  /// A group of keyed_.
  void Make(std::uint32_t inBegin, std::uint32_t inEnd) {
    Group& group = level_->groups.emplace_back();
    group.key = keyed_[inBegin].key;
    group.begin = static_cast<std::uint32_t>(level_->members.size());
    for (std::uint32_t i = inBegin; i < inEnd; ++i) {
      const int member = keyed_[i].member;
      const double value = ValueOf(member);
      const bool isWorse = value < group.worst || (std::isnan(group.worst) && !std::isnan(value));
      if (group.representative < 0 || isWorse) group.representative = member;
      if (isWorse) group.worst = value;
      level_->members.push_back(member);
    }
  }

  double ValueOf(int inPosition) const { return values_[static_cast<std::size_t>(inPosition)]; }
  const std::optional<Position>& PlaceOf(int inPosition) const {
    return (places_.empty() ? result_.places : places_)[static_cast<std::size_t>(inPosition)];
  }

  /// Of all interferences in their order, since groups have them from all over the result.
  void FindKeys() {
    keys_.clear();
    if (level_->by == GroupBy::kPlace) return;
    keys_.reserve(result_.interferences.size());
    for (const ReviewRecord& record : result_.interferences)
      keys_.push_back(LabelKeyOf(record.products));
  }

  /// See GroupTable::Group; by product that of the one that has more interferences.
  std::uint64_t LabelKeyOf(const std::array<int, 2>& inProducts) const {
    const ProductLabels& labels = level_->labels;
    const std::uint64_t numbers[2] = {labels.NumberOf(inProducts[0]),
                                      labels.NumberOf(inProducts[1])};
    if (level_->by != GroupBy::kProduct)
      return std::min(numbers[0], numbers[1]) << 32 | std::max(numbers[0], numbers[1]);
    const auto order = [&](std::size_t inProduct) {
      const int product = inProducts[inProduct];
      const int count = product < 0 ? -1 : counts_[static_cast<std::size_t>(product)];
      return std::pair(-count, numbers[inProduct]);
    };
    return order(0) < order(1) ? numbers[0] : numbers[1];
  }

  /// By place that of a member that is alone.
  std::uint64_t KeyOf(int inMember) const {
    if (level_->by != GroupBy::kPlace) return keys_[static_cast<std::size_t>(inMember)];
    return PlaceOf(inMember) ? 0 : GroupTable::kNoPlace;
  }

  void KeyByPlace(std::span<const int> inMembers) {
    std::vector<Point3> points;
    for (const int member : inMembers) {
      keyed_.push_back({PlaceOf(member) ? points.size() : GroupTable::kNoPlace, member});
      if (PlaceOf(member)) points.push_back(ToPoint(*PlaceOf(member)));
    }
    const std::vector<int> clusters = ClusterPlaces(points, options_.distance);
    for (Keyed& one : keyed_)
      if (one.key != GroupTable::kNoPlace) one.key = static_cast<std::uint64_t>(clusters[one.key]);
  }

  const ReviewedResult& result_;
  const GroupOptions& options_;
  std::shared_ptr<GroupTable> table_;
  std::vector<GroupTable::Level>& levels_;
  GroupTable::Level* level_ = nullptr;  // that is being made
  std::vector<std::uint64_t> keys_;     // of all interferences, by labels
  std::vector<Keyed> keyed_, sorted_;
  std::vector<Bucket> buckets_;
  std::vector<double> values_;                   // NaN for none
  std::vector<std::optional<Position>> places_;  // where the result's were not read
  std::vector<int> counts_;                      // of the interferences of each product
};

}  // namespace

InterferenceGroups GroupInterferences(const ReviewedResult& inResult,
                                      const GroupOptions& inOptions) {
  return Grouper(inResult, inOptions).Run();
}

}  // namespace ZORToolkit
