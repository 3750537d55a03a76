// Which products of two results are the same, and how they moved; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_REVIEW_PRODUCT_MATCH_H
#define ZOR_TOOLKIT_REVIEW_PRODUCT_MATCH_H

#include "toolkit/review/Match.h"

namespace ZORToolkit {

/// Two results that are compared, asked how what both have moved from the old to the new one, as
/// seen a metre away. Millimetres.
class Motions {
 public:
  Motions(const ReviewedResult& inOld, const ReviewedResult& inNew)
      : old_(inOld), new_(inNew), placementsOfOld_(inOld), placementsOfNew_(inNew) {}

  const ReviewedResult& Old() const { return old_; }
  const ReviewedResult& New() const { return new_; }
  std::optional<Placement> OldPlacementOf(ElementNumber inProduct) const {
    return placementsOfOld_.Of(inProduct);
  }
  std::optional<Placement> NewPlacementOf(ElementNumber inProduct) const {
    return placementsOfNew_.Of(inProduct);
  }

  /// How far a product moved; 0 when a placement is missing.
  /// @param inOld, inNew positions in ReviewedResult::products.
  double OfProduct(int inOld, int inNew) const;
  /// The same of the products of two interferences.
  double Of(const ReviewRecord& inOld, std::size_t inOldProduct, const ReviewRecord& inNew,
            std::size_t inNewProduct) const;
  /// How far the second product moved in the frame of the first; 0 when a placement is missing.
  /// @param inIsSwapped whether the old first product is the new second one.
  double Relative(const ReviewRecord& inOld, const ReviewRecord& inNew, bool inIsSwapped) const;

 private:
  /// The placements of some products last asked about, since most are asked about several times.
  class RecentPlacements {
   public:
    explicit RecentPlacements(const ReviewedResult& inResult);
    const std::optional<Placement>& Of(ElementNumber inProduct) const;

   private:
    struct Known {
      ElementNumber product = 0;
      std::optional<Placement> placement;
    };
    const ReviewedResult& result_;
    mutable std::vector<Known> known_;  // by a hash
  };

  double Of(ElementNumber inOld, ElementNumber inNew) const;

  const ReviewedResult& old_;
  const ReviewedResult& new_;
  RecentPlacements placementsOfOld_, placementsOfNew_;
};

/// Fills the products of a match.
void MatchProducts(const Motions& inMotions, double inTolerance, ResultMatch& ioMatch);
/// As the other, of the results of these motions.
ResultMatch MatchResults(const Motions& inMotions, const MatchOptions& inOptions);

std::string Millimetres(double inLength);  ///< for a person

}  // namespace ZORToolkit

#endif
