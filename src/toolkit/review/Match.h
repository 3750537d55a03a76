// Which products and interferences of two results are the same.
#ifndef ZOR_TOOLKIT_REVIEW_MATCH_H
#define ZOR_TOOLKIT_REVIEW_MATCH_H

#include <string>
#include <vector>

#include "toolkit/review/ReviewRecords.h"

namespace ZORToolkit {

/// A stable identifier for each interference, in their order: 16 hexadecimal digits made of its two
/// products, whose order does not count, and of the cubic millimetre of its place in the frame of
/// one of them; of several that agree in all that, of a number too. It does not depend on what else
/// the result has, on languages, or on where an assembly stands. No two of a result are equal.
ZOR_TOOLKIT_EXPORT std::vector<std::string> StableIds(const ReviewedResult& inResult);

/// A stable identifier of the two products alone, likewise.
ZOR_TOOLKIT_EXPORT std::string PairId(const ReviewedResult& inResult, const ReviewRecord& inRecord);

struct MatchOptions {
  double tolerance = 0.001;  ///< below it two placements are the same; millimetres
  double samePlace = 10;     ///< farther apart is another interference of the pair; millimetres
};

/// What one result is in the other, by positions in ReviewedResult.
struct ResultMatch {
  struct Partner {
    int position = -1;   ///< in the other result, -1 for none
    std::string reason;  ///< why this one, or why none
  };
  std::vector<Partner> productsOfOld, productsOfNew;
  std::vector<Partner> interferencesOfOld, interferencesOfNew;
};

/// Products are the same by identifier; of those left over by alias and part, then by the last name
/// of their path and part, with the nearest placement, then by part at the same placement.
/// Interferences are the same when their products are, in any order, and they lie at the same place
/// in the frame of one of them: of several of a pair by the best assignment as a whole, to which
/// value and type count too. Where the products moved against each other, twice as far is the same
/// place too. Deterministic; n log n but for pairs with very many at one place.
ZOR_TOOLKIT_EXPORT ResultMatch MatchResults(const ReviewedResult& inOld,
                                            const ReviewedResult& inNew,
                                            const MatchOptions& inOptions = {});

/// How far the second product moved in the frame of the first from one placement of both to
/// another, as seen a metre away; 0 when a placement is missing. Millimetres.
ZOR_TOOLKIT_EXPORT double RelativeMotion(const ReviewRecord& inOld, const ReviewRecord& inNew,
                                         bool inIsSwapped);
/// How far a product moved, likewise.
ZOR_TOOLKIT_EXPORT double Motion(const std::optional<Placement>& inOld,
                                 const std::optional<Placement>& inNew);

}  // namespace ZORToolkit

#endif
