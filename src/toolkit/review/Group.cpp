#include "toolkit/review/Group.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <numeric>
#include <tuple>

#include "toolkit/review/HashInput.h"
#include "toolkit/review/PlaceClusters.h"
#include "toolkit/review/StableIds.h"

namespace ZORToolkit {
namespace {

std::string_view PartOf(const ReviewProduct& inProduct) {
  return inProduct.part.empty() ? LastName(inProduct.Name()) : inProduct.part;
}

std::string_view AssemblyOf(const ReviewProduct& inProduct) {
  std::string_view path = inProduct.id;
  std::size_t at = LastSeparator(path);
  if (at == std::string_view::npos) {
    path = inProduct.Name();
    at = LastSeparator(path);
  }
  return at == std::string_view::npos ? "(top)" : path.substr(0, at);
}

/// Numbers different texts in the order in which they come; by open addressing.
class TextNumbers {
 public:
  int NumberOf(std::string_view inText) {
    if (2 * (texts_.size() + 1) > slots_.size()) Grow();
    const std::uint64_t hash = ZORFoundation::Hash64Of(inText);
    const std::size_t mask = slots_.size() - 1;
    std::size_t slot = hash & mask;
    for (; slots_[slot].number >= 0; slot = (slot + 1) & mask)
      if (slots_[slot].hash == hash &&
          texts_[static_cast<std::size_t>(slots_[slot].number)] == inText)
        return slots_[slot].number;
    slots_[slot] = {hash, static_cast<int>(texts_.size())};
    texts_.push_back(inText);
    return slots_[slot].number;
  }

  const std::vector<std::string_view>& Texts() const { return texts_; }

 private:
  struct Slot {
    std::uint64_t hash = 0;
    int number = -1;
  };

  void Grow() {
    std::vector<Slot> slots(4 * slots_.size());
    const std::size_t mask = slots.size() - 1;
    for (const Slot& one : slots_) {
      if (one.number < 0) continue;
      std::size_t slot = one.hash & mask;
      while (slots[slot].number >= 0) slot = (slot + 1) & mask;
      slots[slot] = one;
    }
    slots_.swap(slots);
  }

  std::vector<std::string_view> texts_;
  std::vector<Slot> slots_ = std::vector<Slot>(64);
};

/// What products are grouped by, numbered in the order of the texts; 0 is the empty text, which is
/// also that of a missing product.
class ProductLabels {
 public:
  ProductLabels(const std::vector<ReviewProduct>& inProducts, GroupBy inBy) : texts_{""} {
    if (inBy == GroupBy::kPlace) return;
    numbers_.reserve(inProducts.size());
    TextNumbers numbers;
    numbers.NumberOf("");
    for (const ReviewProduct& product : inProducts)
      numbers_.push_back(numbers.NumberOf(TextOf(product, inBy)));
    texts_ = numbers.Texts();
    Sort();
  }

  int NumberOf(int inProduct) const {
    return inProduct < 0 ? 0 : numbers_[static_cast<std::size_t>(inProduct)];
  }
  std::string_view Text(std::uint32_t inNumber) const { return texts_[inNumber]; }

 private:
  static std::string_view TextOf(const ReviewProduct& inProduct, GroupBy inBy) {
    if (inBy == GroupBy::kParts) return PartOf(inProduct);
    return inBy == GroupBy::kAssemblies ? AssemblyOf(inProduct) : inProduct.Name();
  }

  void Sort() {
    std::vector<int> order(texts_.size()), rank(texts_.size());
    std::iota(order.begin(), order.end(), 0);
    const auto text = [&](int inNumber) { return texts_[static_cast<std::size_t>(inNumber)]; };
    std::ranges::sort(order, {}, text);
    std::vector<std::string_view> sorted;
    sorted.reserve(order.size());
    for (const int number : order) {
      rank[static_cast<std::size_t>(number)] = static_cast<int>(sorted.size());
      sorted.push_back(text(number));
    }
    for (int& number : numbers_) number = rank[static_cast<std::size_t>(number)];
    texts_.swap(sorted);
  }

  std::vector<std::string_view> texts_;
  std::vector<int> numbers_;  // of each product
};

class Grouper {
 public:
  Grouper(const ReviewedResult& inResult, const GroupOptions& inOptions)
      : result_(inResult), options_(inOptions) {
    values_.reserve(result_.interferences.size());
    for (const ReviewRecord& record : result_.interferences)
      values_.push_back(record.value.Value());
    labels_.reserve(options_.by.size());
    for (const GroupBy by : options_.by) {
      if (by == GroupBy::kPlace) ReadPlaces();
      if (by == GroupBy::kProduct) CountProducts();
      labels_.emplace_back(result_.products, by);
    }
  }

  std::vector<InterferenceGroup> Run() {
    std::vector<int> all(result_.interferences.size());
    std::iota(all.begin(), all.end(), 0);
    return Split(all, 0, "");
  }

 private:
  /// Members with one key, in a list of them that is sorted by keys.
  struct Bucket {
    std::size_t begin, end;
    double worst;
    int first;
  };
  struct Keyed {
    std::uint64_t key;
    int member;
    bool operator<(const Keyed& inOther) const {
      return std::tie(key, member) < std::tie(inOther.key, inOther.member);
    }
  };
  static constexpr std::uint64_t kNoPlace = ~std::uint64_t{0};

  void ReadPlaces() {
    if (!places_.empty()) return;
    places_ = result_.places;
    if (places_.empty())
      for (const ReviewRecord& record : result_.interferences)
        places_.push_back(result_.PlaceOf(record));
    ids_ = StableIdNumbers(result_);
  }

  void CountProducts() {
    counts_.assign(result_.products.size(), 0);
    for (const ReviewRecord& record : result_.interferences)
      for (const int product : record.products)
        if (product >= 0) ++counts_[static_cast<std::size_t>(product)];
  }

  /// Members come in their order; of many by counting, eleven bits of the keys at a time.
  void Sort(std::vector<Keyed>& ioKeyed) {
    constexpr std::size_t kMany = 512;
    constexpr int kBits = 11;
    constexpr std::uint64_t kMask = (std::uint64_t{1} << kBits) - 1;
    if (ioKeyed.size() < kMany) return std::sort(ioKeyed.begin(), ioKeyed.end());
    std::uint64_t differing = 0;
    for (const Keyed& one : ioKeyed) differing |= one.key ^ ioKeyed.front().key;
    for (int shift = 0; shift < 64; shift += kBits) {
      if (((differing >> shift) & kMask) == 0) continue;
      std::array<std::uint32_t, kMask + 1> ends{};
      for (const Keyed& one : ioKeyed) ++ends[(one.key >> shift) & kMask];
      std::exclusive_scan(ends.begin(), ends.end(), ends.begin(), 0u);
      sorted_.resize(ioKeyed.size());
      for (const Keyed& one : ioKeyed) sorted_[ends[(one.key >> shift) & kMask]++] = one;
      ioKeyed.swap(sorted_);
    }
  }

  std::vector<InterferenceGroup> Split(const std::vector<int>& inMembers, std::size_t inLevel,
                                       std::string_view inParentId) {
    std::vector<InterferenceGroup> groups;
    if (inLevel == options_.by.size()) return groups;
    if (inMembers.size() == 1) {  // most groups of most results
      Make({KeyOf(inMembers.front(), inLevel), inMembers.front()}, inMembers, inLevel, inParentId,
           groups.emplace_back());
      return groups;
    }
    std::vector<Keyed> keyed = options_.by[inLevel] == GroupBy::kPlace
                                   ? KeyedByPlace(inMembers)
                                   : KeyedByLabel(inMembers, inLevel);
    Sort(keyed);
    const std::vector<Bucket> buckets = BucketsOf(keyed);
    groups.reserve(buckets.size());
    for (const Bucket& bucket : buckets) {
      std::vector<int> members;
      members.reserve(bucket.end - bucket.begin);
      for (std::size_t i = bucket.begin; i < bucket.end; ++i) members.push_back(keyed[i].member);
      Make(keyed[bucket.begin], std::move(members), inLevel, inParentId, groups.emplace_back());
    }
    return groups;
  }

  /// @param inFirst the first of its members.
  void Make(const Keyed& inFirst, std::vector<int> inMembers, std::size_t inLevel,
            std::string_view inParentId, InterferenceGroup& outGroup) {
    outGroup.by = options_.by[inLevel];
    outGroup.members = std::move(inMembers);
    outGroup.label = LabelOf(inFirst, inLevel);
    Describe(outGroup, inParentId);
    if (inLevel + 1 < options_.by.size())
      outGroup.groups = Split(outGroup.members, inLevel + 1, outGroup.Id());
  }

  /// The largest first; of equal size the worst, then that whose first member comes first.
  std::vector<Bucket> BucketsOf(const std::vector<Keyed>& inKeyed) const {
    std::vector<Bucket> buckets;
    for (std::size_t begin = 0, end = 0; begin < inKeyed.size(); begin = end) {
      double worst = HUGE_VAL;
      for (; end < inKeyed.size() && inKeyed[end].key == inKeyed[begin].key; ++end)
        worst = std::min(worst, ValueOf(inKeyed[end].member).value_or(HUGE_VAL));
      buckets.push_back({begin, end, worst, inKeyed[begin].member});
    }
    const auto order = [](const Bucket& inBucket) {
      const auto size = static_cast<std::ptrdiff_t>(inBucket.end - inBucket.begin);
      return std::tuple(-size, inBucket.worst, inBucket.first);
    };
    std::ranges::sort(
        buckets, [&](const Bucket& inA, const Bucket& inB) { return order(inA) < order(inB); });
    return buckets;
  }

  const ReviewRecord& Record(int inPosition) const {
    return result_.interferences[static_cast<std::size_t>(inPosition)];
  }
  const std::optional<double>& ValueOf(int inPosition) const {
    return values_[static_cast<std::size_t>(inPosition)];
  }
  const std::optional<Position>& PlaceOf(int inPosition) const {
    return places_[static_cast<std::size_t>(inPosition)];
  }

  std::vector<Keyed> KeyedByLabel(const std::vector<int>& inMembers, std::size_t inLevel) const {
    std::vector<Keyed> keyed;
    keyed.reserve(inMembers.size());
    for (const int member : inMembers) keyed.push_back({LabelKeyOf(member, inLevel), member});
    return keyed;
  }

  /// The numbers of both labels, the lesser first; by product that of the one that has more
  /// interferences alone.
  std::uint64_t LabelKeyOf(int inMember, std::size_t inLevel) const {
    const ProductLabels& labels = labels_[inLevel];
    const std::array<int, 2>& products = Record(inMember).products;
    std::uint64_t numbers[2] = {0, 0};
    for (std::size_t i = 0; i < 2; ++i)
      numbers[i] = static_cast<std::uint64_t>(labels.NumberOf(products[i]));
    if (options_.by[inLevel] != GroupBy::kProduct)
      return std::min(numbers[0], numbers[1]) << 32 | std::max(numbers[0], numbers[1]);
    const auto order = [&](std::size_t inProduct) {
      const int product = products[inProduct];
      const int count = product < 0 ? -1 : counts_[static_cast<std::size_t>(product)];
      return std::pair(-count, numbers[inProduct]);
    };
    return order(0) < order(1) ? numbers[0] : numbers[1];
  }

  /// Of a member that is alone.
  std::uint64_t KeyOf(int inMember, std::size_t inLevel) const {
    if (options_.by[inLevel] != GroupBy::kPlace) return LabelKeyOf(inMember, inLevel);
    return PlaceOf(inMember) ? 0 : kNoPlace;
  }

  std::vector<Keyed> KeyedByPlace(const std::vector<int>& inMembers) const {
    std::vector<Keyed> keyed;
    keyed.reserve(inMembers.size());
    std::vector<Point3> points;
    for (const int member : inMembers) {
      keyed.push_back({PlaceOf(member) ? points.size() : kNoPlace, member});
      if (PlaceOf(member)) points.push_back(ToPoint(*PlaceOf(member)));
    }
    const std::vector<int> clusters = ClusterPlaces(points, options_.distance);
    for (Keyed& one : keyed)
      if (one.key != kNoPlace) one.key = static_cast<std::uint64_t>(clusters[one.key]);
    return keyed;
  }

  /// @param inFirst the first member of the group.
  std::string LabelOf(const Keyed& inFirst, std::size_t inLevel) const {
    const GroupBy by = options_.by[inLevel];
    const auto text = [&](std::uint64_t inNumber) {
      return labels_[inLevel].Text(static_cast<std::uint32_t>(inNumber));
    };
    if (by == GroupBy::kProduct) return std::string(text(inFirst.key));
    if (by != GroupBy::kPlace) {
      const std::string_view low = text(inFirst.key >> 32), high = text(inFirst.key);
      std::string label;
      label.reserve(low.size() + high.size() + 3);
      return label.append(low).append(" x ").append(high);
    }
    if (inFirst.key == kNoPlace) return "no place";
    std::string label;
    label.reserve(48);
    label.append("place ").append(std::to_string(inFirst.key + 1)).append(", near");
    for (const double coordinate : *PlaceOf(inFirst.member))
      label.append(1, ' ').append(RoundedText(coordinate));
    return label;
  }

  static std::string RoundedText(double inNumber) {
    constexpr double kPlain = 100'000;  // below it a number needs no exponent
    const double rounded = std::round(inNumber) + 0.0;
    if (!(std::abs(rounded) < kPlain)) return Number(rounded).text;
    char digits[8];
    const auto end = std::to_chars(digits, std::end(digits), static_cast<int>(rounded));
    return {digits, end.ptr};
  }

  void Describe(InterferenceGroup& ioGroup, std::string_view inParentId) {
    for (const int member : ioGroup.members) {
      const std::optional<double>& value = ValueOf(member);
      if (ioGroup.representative < 0 || (value && (!ioGroup.worst || *value < *ioGroup.worst)))
        ioGroup.representative = member;
      if (value) ioGroup.worst = std::min(*value, ioGroup.worst.value_or(*value));
    }
    // What is grouped by place has no other name than its interferences.
    input_.Clear();
    input_.AddText(inParentId);
    input_.AddText(Name(ioGroup.by));
    input_.AddText(ioGroup.by == GroupBy::kPlace ? LeastId(ioGroup.members) : ioGroup.label);
    ioGroup.number = input_.Hash();
  }

  std::string LeastId(const std::vector<int>& inMembers) const {
    const auto id = [&](int inMember) { return ids_[static_cast<std::size_t>(inMember)]; };
    return ZORFoundation::HexText(id(*std::ranges::min_element(inMembers, {}, id)));
  }

  const ReviewedResult& result_;
  const GroupOptions& options_;
  std::vector<std::uint64_t> ids_;  // of the interferences, where they are grouped by place
  HashInput input_;
  std::vector<Keyed> sorted_;
  std::vector<ProductLabels> labels_;  // of each level; none of places
  std::vector<std::optional<double>> values_;
  std::vector<std::optional<Position>> places_;
  std::vector<int> counts_;  // of the interferences of each product
};

}  // namespace

const char* Name(GroupBy inBy) {
  constexpr const char* kNames[] = {"parts", "assemblies", "place", "product"};
  return kNames[static_cast<std::size_t>(inBy)];
}

std::string InterferenceGroup::Id() const { return ZORFoundation::HexText(number); }

std::vector<InterferenceGroup> GroupInterferences(const ReviewedResult& inResult,
                                                  const GroupOptions& inOptions) {
  return Grouper(inResult, inOptions).Run();
}

const InterferenceGroup* FindGroup(const std::vector<InterferenceGroup>& inGroups,
                                   const std::string& inId) {
  for (const InterferenceGroup& group : inGroups) {
    if (group.Id() == inId) return &group;
    if (const InterferenceGroup* const inner = FindGroup(group.groups, inId)) return inner;
  }
  return nullptr;
}

}  // namespace ZORToolkit
