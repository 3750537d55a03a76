#include "lyra/ProductWalk.h"

#include <utility>

namespace lyra {
namespace {

ProductLevel LevelOf(const ZORIProduct_var& inProduct, bool inIsLast) {
  ProductLevel level;
  level.product = inProduct;
  level.children.reset(inProduct->GetChildren("ZORIProduct"));
  level.isLast = inIsLast;
  return level;
}

}  // namespace

void WalkProducts(const ZORIProduct_var& inRoot, std::size_t inDepth, const ProductVisit& inEnter,
                  const ProductVisit& inLeave) {
  ProductLevels levels;
  levels.push_back(LevelOf(inRoot, true));
  inEnter(levels);
  while (!levels.empty()) {
    ProductLevel& level = levels.back();
    const bool descends = levels.size() <= inDepth && level.entered < level.ChildCount();
    if (descends) {
      const ZORIProduct_var child = (*level.children)[++level.entered];
      levels.push_back(LevelOf(child, level.entered == level.ChildCount()));
      inEnter(levels);
    } else {
      if (inLeave) inLeave(levels);
      levels.pop_back();
    }
  }
}

}  // namespace lyra
