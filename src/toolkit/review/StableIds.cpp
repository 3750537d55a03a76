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

  /// @param inWorld its place.
  std::uint64_t OfInterference(const ReviewRecord& inRecord,
                               const std::optional<Position>& inWorld) {
    const std::size_t frame = AddPair(inRecord);
    if (!inWorld) return input_.Hash();
    std::optional<Point3> place = PlaceInFrame(result_, inRecord.productElements[frame], *inWorld);
    if (!place) place = PlaceInFrame(result_, inRecord.productElements[1 - frame], *inWorld);
    if (!place) place = ToPoint(*inWorld);
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

std::vector<std::optional<Position>> PlacesOf(const ReviewedResult& inResult) {
  std::vector<std::optional<Position>> places;
  places.reserve(inResult.interferences.size());
  for (const ReviewRecord& record : inResult.interferences)
    places.push_back(inResult.PlaceOf(record));
  return places;
}

std::vector<std::uint64_t> StableIdNumbers(const ReviewedResult& inResult,
                                           const std::vector<std::optional<Position>>& inPlaces) {
  const std::vector<ReviewRecord>& records = inResult.interferences;
  struct Hashed {
    std::uint64_t hash;
    std::size_t position;
  };
  std::vector<Hashed> hashes;
  hashes.reserve(records.size());
  std::vector<std::uint64_t> ids;
  ids.reserve(records.size());
  Identifier identifier(inResult);
  for (std::size_t i = 0; i < records.size(); ++i) {
    ids.push_back(identifier.OfInterference(records[i], inPlaces[i]));
    hashes.push_back({ids.back(), i});
  }
  std::ranges::sort(hashes, [&](const Hashed& inA, const Hashed& inB) {
    if (inA.hash != inB.hash) return inA.hash < inB.hash;
    const auto order = [&](const Hashed& inHashed) {
      const ReviewRecord& record = records[inHashed.position];
      return std::tie(record.type, record.value.text, inHashed.position);
    };
    return order(inA) < order(inB);
  });
  std::uint64_t number = 0;
  for (std::size_t i = 1; i < hashes.size(); ++i) {
    number = hashes[i - 1].hash == hashes[i].hash ? number + 1 : 0;
    if (number == 0) continue;
    HashInput numbered;
    numbered.Add(hashes[i].hash);
    numbered.Add(number);
    ids[hashes[i].position] = numbered.Hash();
  }
  return ids;
}

std::vector<std::string> StableIds(const ReviewedResult& inResult) {
  std::vector<std::string> ids;
  ids.reserve(inResult.interferences.size());
  for (const std::uint64_t number : StableIdNumbers(inResult, PlacesOf(inResult)))
    ids.push_back(ZORFoundation::HexText(number));
  return ids;
}

std::string PairId(const ReviewedResult& inResult, const ReviewRecord& inRecord) {
  return ZORFoundation::HexText(Identifier(inResult).OfPair(inRecord));
}

}  // namespace ZORToolkit
