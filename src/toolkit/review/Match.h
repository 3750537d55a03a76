// Which products and interferences of two results are the same.
#ifndef ZOR_TOOLKIT_REVIEW_MATCH_H
#define ZOR_TOOLKIT_REVIEW_MATCH_H

#include <deque>
#include <string>
#include <string_view>
#include <vector>

#include "toolkit/review/StableIds.h"

namespace ZORToolkit {

struct MatchOptions {
  double tolerance = 0.001;  ///< below it two placements are the same; millimetres
  double samePlace = 10;     ///< farther apart is another interference of the pair; millimetres
};

/// What one result is in the other, by positions in ReviewedResult.
struct ResultMatch {
  static constexpr std::uint32_t kReasonBits = 0x7FFF'FFFF;  ///< of Partner::reason
  struct Partner {
    int position = -1;  ///< in the other result, -1 for none
    /// Its placement, or the placements and points of an interference, are written alike.
    std::uint32_t isUnmoved : 1 = 0;
    std::uint32_t reason : 31 = 0;  ///< why this one, or why none: its place in reasons
  };
  std::vector<Partner> productsOfOld, productsOfNew;
  std::vector<Partner> interferencesOfOld, interferencesOfNew;
  std::deque<std::string> reasons{""};  ///< live as long as the match

  ResultMatch() = default;
  ResultMatch(ResultMatch&&) = default;
  ResultMatch& operator=(ResultMatch&&) = default;
  ResultMatch(const ResultMatch&) = delete;
  ResultMatch& operator=(const ResultMatch&) = delete;

  std::string_view Reason(const Partner& inPartner) const { return reasons[inPartner.reason]; }
  /// @return its place.
  std::uint32_t Keep(std::string inReason) {
    reasons.push_back(std::move(inReason));
    return (static_cast<std::uint32_t>(reasons.size()) - 1) & kReasonBits;
  }
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

}  // namespace ZORToolkit

#endif
