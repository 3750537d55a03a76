// Walking through the products of a model.
#ifndef ZOR_TOOLS_LYRA_PRODUCT_WALK_H
#define ZOR_TOOLS_LYRA_PRODUCT_WALK_H

#include <cstddef>
#include <functional>
#include <limits>
#include <memory>
#include <vector>

#include "platform/product_structure/ZORIProduct.h"

namespace lyra {

/// A product on the way from the root to the one that is visited.
struct ProductLevel {
  ZORIProduct_var product;
  std::unique_ptr<ZORListValZORBaseUnknown_var> children;  // null without any
  int entered = 0;                                         // of its children
  bool isLast = true;                                      // of its father's children

  int ChildCount() const { return children ? children->Size() : 0; }
};

/// From the root, which is the first, to the product that is visited, the last.
using ProductLevels = std::vector<ProductLevel>;
using ProductVisit = std::function<void(const ProductLevels& inLevels)>;

inline constexpr std::size_t kAllLevels = std::numeric_limits<std::size_t>::max();

/// Visits a product before its children and leaves it after them, from the root on. A deep tree
/// needs no deep stack.
/// @param inDepth how many levels below the root are visited.
/// @param inLeave may be empty.
void WalkProducts(const ZORIProduct_var& inRoot, std::size_t inDepth, const ProductVisit& inEnter,
                  const ProductVisit& inLeave = {});

}  // namespace lyra

#endif
