#include "toolkit/review/StableIds.h"

#include <algorithm>
#include <tuple>
#include <utility>

#include "toolkit/review/Frames.h"
#include "toolkit/review/HashInput.h"

namespace ZORToolkit {
namespace {

class Identifier {
 public:
  explicit Identifier(const ReviewedResult& inResult) : result_(inResult) {}

  std::uint64_t OfPair(const ReviewRecord& inRecord) {
    AddPair(inRecord);
    return input_.Hash();
  }

  std::uint64_t OfInterference(const ReviewRecord& inRecord) {
    const std::size_t frame = AddPair(inRecord);
    const std::optional<Position> world = result_.PlaceOf(inRecord);
    if (!world) return input_.Hash();
    std::optional<Point3> place = PlaceInFrame(result_, inRecord.productElements[frame], *world);
    if (!place) place = PlaceInFrame(result_, inRecord.productElements[1 - frame], *world);
    if (!place) place = ToPoint(*world);
    if (ZORFoundation::IsFinite(*place))
      for (const double coordinate : {place->x, place->y, place->z})
        input_.Add(static_cast<std::uint64_t>(Cell(coordinate)));
    return input_.Hash();
  }

 private:
  /// Begins with the two products, in the order of what tells them apart.
  /// @return which of the interference's products comes first.
  std::size_t AddPair(const ReviewRecord& inRecord) {
    std::string_view keys[2];
    for (std::size_t i = 0; i < 2; ++i) {
      if (inRecord.products[i] < 0) continue;
      const ReviewProduct& product =
          result_.products[static_cast<std::size_t>(inRecord.products[i])];
      if (product.id.empty()) keys_[i] = product.Key();
      keys[i] = product.id.empty() ? keys_[i] : product.id;
    }
    const std::size_t first = keys[1] < keys[0] ? 1 : 0;
    input_.Clear();
    input_.AddText(keys[first]);
    input_.AddText(keys[1 - first]);
    return first;
  }

  const ReviewedResult& result_;
  HashInput input_;
  std::string keys_[2];  // of products without identifiers
};

}  // namespace

std::vector<std::string> StableIds(const ReviewedResult& inResult) {
  const std::vector<ReviewRecord>& records = inResult.interferences;
  std::vector<std::pair<std::uint64_t, std::size_t>> hashes;
  hashes.reserve(records.size());
  Identifier identifier(inResult);
  for (std::size_t i = 0; i < records.size(); ++i)
    hashes.emplace_back(identifier.OfInterference(records[i]), i);
  std::ranges::sort(hashes, [&](const auto& inA, const auto& inB) {
    if (inA.first != inB.first) return inA.first < inB.first;
    const auto order = [&](const auto& inHash) {
      const ReviewRecord& record = records[inHash.second];
      return std::tie(record.type, record.value.text, inHash.second);
    };
    return order(inA) < order(inB);
  });
  std::vector<std::string> ids(records.size());
  std::uint64_t number = 0;
  for (std::size_t i = 0; i < hashes.size(); ++i) {
    number = i > 0 && hashes[i - 1].first == hashes[i].first ? number + 1 : 0;
    HashInput numbered;
    if (number != 0) {
      numbered.Add(hashes[i].first);
      numbered.Add(number);
    }
    ids[hashes[i].second] = ZORFoundation::HexText(number == 0 ? hashes[i].first : numbered.Hash());
  }
  return ids;
}

std::string PairId(const ReviewedResult& inResult, const ReviewRecord& inRecord) {
  return ZORFoundation::HexText(Identifier(inResult).OfPair(inRecord));
}

}  // namespace ZORToolkit
