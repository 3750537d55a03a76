// What names an interference in every result that has it.
#ifndef ZOR_TOOLKIT_REVIEW_STABLE_IDS_H
#define ZOR_TOOLKIT_REVIEW_STABLE_IDS_H

#include <span>
#include <string>
#include <vector>

#include "toolkit/review/HashInput.h"
#include "toolkit/review/ReviewRecords.h"

namespace ZORToolkit {

/// A stable identifier for each interference, in their order: 16 hexadecimal digits made of its two
/// products, whose order does not count, and of the cubic millimetre of its place in the frame of
/// one of them; of several that agree in all that, of a number too. It does not depend on what else
/// the result has, on languages, or on where an assembly stands. No two of a result are equal.
ZOR_TOOLKIT_EXPORT std::vector<std::string> StableIds(const ReviewedResult& inResult);

/// Hashes what the identifiers of interferences are made of, but for the number.
class IdentityHasher {
 public:
  /// @param inResult its products are looked at when they are asked for.
  explicit IdentityHasher(const ReviewedResult& inResult) : result_(inResult) {}

  std::uint64_t OfPair(const ReviewRecord& inRecord);
  /// @param inWorld its place.
  std::uint64_t OfInterference(const ReviewRecord& inRecord,
                               const std::optional<Position>& inWorld);

 private:
  std::size_t AddPair(const ReviewRecord& inRecord);

  const ReviewedResult& result_;
  HashInput input_;
  std::string keys_[2];  // of products without identifiers
};

/// The identifiers of all interferences as numbers, which are in the order of their digits.
std::vector<std::uint64_t> StableIdNumbers(const ReviewedResult& inResult);
/// The identifiers of some interferences, by their positions.
std::vector<std::uint64_t> StableIdNumbers(const ReviewedResult& inResult,
                                           std::span<const int> inPositions);

/// A stable identifier of the two products alone, likewise.
ZOR_TOOLKIT_EXPORT std::string PairId(const ReviewedResult& inResult, const ReviewRecord& inRecord);

}  // namespace ZORToolkit

#endif
