// What products are grouped by; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_REVIEW_PRODUCT_LABELS_H
#define ZOR_TOOLKIT_REVIEW_PRODUCT_LABELS_H

#include "toolkit/review/Group.h"

namespace ZORToolkit {

/// The texts by which products are grouped, numbered in their order; 0 is the empty text, which is
/// also that of a missing product.
class ProductLabels {
 public:
  /// @param inBy by place there are none.
  ProductLabels(const std::vector<ReviewProduct>& inProducts, GroupBy inBy);

  std::uint32_t NumberOf(int inProduct) const {
    return inProduct < 0 ? 0 : numbers_[static_cast<std::size_t>(inProduct)];
  }
  std::string_view Text(std::uint64_t inNumber) const {
    return texts_[static_cast<std::size_t>(inNumber)];
  }

 private:
  void Sort();

  std::vector<std::string_view> texts_;
  std::vector<std::uint32_t> numbers_;  // of each product
};

}  // namespace ZORToolkit

#endif
