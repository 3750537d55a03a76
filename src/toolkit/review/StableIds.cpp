#include "toolkit/review/StableIds.h"

#include <algorithm>
#include <bit>
#include <numeric>
#include <tuple>
#include <unordered_set>
#include <utility>

#include "toolkit/review/Frames.h"

namespace ZORToolkit {
namespace {

/// Gives those interferences that agree in all that is hashed a number each.
class Numbering {
 public:
  /// @param inPositions of the interferences.
  Numbering(const ReviewedResult& inResult, std::span<const int> inPositions,
            std::vector<std::uint64_t>& ioIds)
      : result_(inResult), positions_(inPositions), ids_(ioIds) {}

  void Run() {
    FindRepeated();
    std::ranges::sort(repeated_, [&](std::size_t inA, std::size_t inB) {
      return ids_[inA] != ids_[inB] ? ids_[inA] < ids_[inB] : IsBefore(inA, inB);
    });
    std::uint64_t hash = 0, number = 0;
    for (const std::size_t one : repeated_) {
      number = number != 0 && ids_[one] == hash ? number + 1 : 1;
      hash = ids_[one];
      if (number == 1) continue;
      HashInput numbered;
      numbered.Add(hash);
      numbered.Add(number - 1);
      ids_[one] = numbered.Hash();
    }
  }

 private:
  /// By open addressing, at half of its size at most.
  void FindRepeated() {
    std::vector<std::uint32_t> slots(std::bit_ceil(2 * ids_.size() + 1));
    std::vector<char> isRepeated(ids_.size(), 0);
    const std::size_t mask = slots.size() - 1;
    for (std::size_t i = 0; i < ids_.size(); ++i) {
      std::size_t slot = ids_[i] & mask;
      while (slots[slot] != 0 && ids_[slots[slot] - 1] != ids_[i]) slot = (slot + 1) & mask;
      if (slots[slot] == 0)
        slots[slot] = static_cast<std::uint32_t>(i) + 1;
      else
        isRepeated[slots[slot] - 1] = isRepeated[i] = 1;
    }
    for (std::size_t i = 0; i < ids_.size(); ++i)
      if (isRepeated[i]) repeated_.push_back(i);
  }

  bool IsBefore(std::size_t inA, std::size_t inB) const {
    const auto order = [&](std::size_t inOne) {
      const ReviewRecord& record =
          result_.interferences[static_cast<std::size_t>(positions_[inOne])];
      return std::tie(record.type, record.value.text, record.index);
    };
    return order(inA) < order(inB);
  }

  const ReviewedResult& result_;
  std::span<const int> positions_;
  std::vector<std::uint64_t>& ids_;
  std::vector<std::size_t> repeated_;
};

/// The two products in any order; -1 of a missing one is 0.
std::uint64_t PairOf(const ReviewRecord& inRecord) {
  const auto [low, high] = std::minmax(inRecord.products[0], inRecord.products[1]);
  return static_cast<std::uint64_t>(low + 1) << 32 | static_cast<std::uint64_t>(high + 1);
}

}  // namespace

std::uint64_t IdentityHasher::OfPair(const ReviewRecord& inRecord) {
  AddPair(inRecord);
  return input_.Hash();
}

std::uint64_t IdentityHasher::OfInterference(const ReviewRecord& inRecord,
                                             const std::optional<Position>& inWorld) {
  const std::size_t frame = AddPair(inRecord);
  if (!inWorld) return input_.Hash();
  std::optional<Point3> place =
      PlaceInFrame(result_.PlacementOf(inRecord.productElements[frame]), *inWorld);
  if (!place)
    place = PlaceInFrame(result_.PlacementOf(inRecord.productElements[1 - frame]), *inWorld);
  if (!place) place = ToPoint(*inWorld);
  if (ZORFoundation::IsFinite(*place))
    for (const double coordinate : {place->x, place->y, place->z})
      input_.Add(static_cast<std::uint64_t>(Cell(coordinate)));
  return input_.Hash();
}

/// Begins with the two products, in the order of what tells them apart.
/// @return which of the interference's products comes first.
std::size_t IdentityHasher::AddPair(const ReviewRecord& inRecord) {
  std::string_view keys[2];
  for (std::size_t i = 0; i < 2; ++i) {
    if (inRecord.products[i] < 0) continue;
    const ReviewProduct& product = result_.products[static_cast<std::size_t>(inRecord.products[i])];
    if (product.id.empty()) keys_[i] = product.Key();
    keys[i] = product.id.empty() ? keys_[i] : product.id;
  }
  const std::size_t first = keys[1] < keys[0] ? 1 : 0;
  input_.Clear();
  input_.AddText(keys[first]);
  input_.AddText(keys[1 - first]);
  return first;
}

std::vector<std::uint64_t> StableIdNumbers(const ReviewedResult& inResult) {
  std::vector<int> all(inResult.interferences.size());
  std::iota(all.begin(), all.end(), 0);
  std::vector<std::uint64_t> ids = inResult.identities;
  if (ids.empty()) {
    ids.reserve(all.size());
    IdentityHasher hasher(inResult);
    for (const ReviewRecord& record : inResult.interferences)
      ids.push_back(hasher.OfInterference(record, inResult.PlaceOf(record)));
  }
  Numbering(inResult, all, ids).Run();
  return ids;
}

std::vector<std::uint64_t> StableIdNumbers(const ReviewedResult& inResult,
                                           std::span<const int> inPositions) {
  // Others of the same pairs may share their hashes.
  std::unordered_set<std::uint64_t> pairs;
  const auto record = [&](int inPosition) -> const ReviewRecord& {
    return inResult.interferences[static_cast<std::size_t>(inPosition)];
  };
  for (const int position : inPositions) pairs.insert(PairOf(record(position)));
  std::vector<int> positions;
  std::vector<std::uint64_t> ids;
  IdentityHasher hasher(inResult);
  for (const ReviewRecord& one : inResult.interferences) {
    if (!pairs.contains(PairOf(one))) continue;
    positions.push_back(one.index - 1);
    ids.push_back(hasher.OfInterference(one, inResult.PlaceOf(one)));
  }
  Numbering(inResult, positions, ids).Run();
  std::vector<std::uint64_t> wanted;
  wanted.reserve(inPositions.size());
  for (const int position : inPositions) {
    const auto found = std::ranges::lower_bound(positions, position);
    wanted.push_back(ids[static_cast<std::size_t>(found - positions.begin())]);
  }
  return wanted;
}

std::vector<std::string> StableIds(const ReviewedResult& inResult) {
  std::vector<std::string> ids;
  ids.reserve(inResult.interferences.size());
  for (const std::uint64_t number : StableIdNumbers(inResult))
    ids.push_back(ZORFoundation::HexText(number));
  return ids;
}

std::string PairId(const ReviewedResult& inResult, const ReviewRecord& inRecord) {
  return ZORFoundation::HexText(IdentityHasher(inResult).OfPair(inRecord));
}

}  // namespace ZORToolkit
