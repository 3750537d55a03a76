// Which products of two results are the same, and how they moved; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_REVIEW_PRODUCT_MATCH_H
#define ZOR_TOOLKIT_REVIEW_PRODUCT_MATCH_H

#include "toolkit/review/Match.h"

namespace ZORToolkit {

/// Fills the products of a match.
void MatchProducts(const ReviewedResult& inOld, const ReviewedResult& inNew, double inTolerance,
                   ResultMatch& ioMatch);

/// Two results that are compared, asked how what both have moved from the old to the new one, as
/// seen a metre away. Millimetres.
class Motions {
 public:
  Motions(const ReviewedResult& inOld, const ReviewedResult& inNew) : old_(inOld), new_(inNew) {}

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
  double Of(ElementNumber inOld, ElementNumber inNew) const;

  const ReviewedResult& old_;
  const ReviewedResult& new_;
};

std::string Millimetres(double inLength);  ///< for a person

}  // namespace ZORToolkit

#endif
