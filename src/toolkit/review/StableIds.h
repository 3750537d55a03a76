// What names an interference in every result that has it.
#ifndef ZOR_TOOLKIT_REVIEW_STABLE_IDS_H
#define ZOR_TOOLKIT_REVIEW_STABLE_IDS_H

#include <string>
#include <vector>

#include "toolkit/review/ReviewRecords.h"

namespace ZORToolkit {

/// A stable identifier for each interference, in their order: 16 hexadecimal digits made of its two
/// products, whose order does not count, and of the cubic millimetre of its place in the frame of
/// one of them; of several that agree in all that, of a number too. It does not depend on what else
/// the result has, on languages, or on where an assembly stands. No two of a result are equal.
ZOR_TOOLKIT_EXPORT std::vector<std::string> StableIds(const ReviewedResult& inResult);

/// The place of each interference.
std::vector<std::optional<Position>> PlacesOf(const ReviewedResult& inResult);

/// The identifiers as numbers, which are in the order of their digits.
/// @param inPlaces those of PlacesOf.
std::vector<std::uint64_t> StableIdNumbers(const ReviewedResult& inResult,
                                           const std::vector<std::optional<Position>>& inPlaces);

/// A stable identifier of the two products alone, likewise.
ZOR_TOOLKIT_EXPORT std::string PairId(const ReviewedResult& inResult, const ReviewRecord& inRecord);

}  // namespace ZORToolkit

#endif
