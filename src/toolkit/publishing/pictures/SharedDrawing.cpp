#include "toolkit/publishing/pictures/SharedDrawing.h"

#include <memory>
#include <vector>

#include "default_platform/OpenModel.h"

namespace ZORToolkit {
namespace {

/// Casting the rays of one interference's pictures and encoding them costs about as much as so many
/// triangles.
constexpr std::uint64_t kCostOfPictures = 20'000;

/// Of a product and all below it.
std::uint64_t TrianglesOf(const ZORIProduct_var& inProduct) {
  std::uint64_t triangles = 0;
  std::vector<ZORIProduct_var> open = {inProduct};
  while (!open.empty()) {
    const ZORIProduct_var product = open.back();
    open.pop_back();
    ZORDefault::ProductInfo info;
    if (!ZORDefault::GetProductInfo(product.GetInterface(), info)) continue;
    triangles += info.triangles;
    const std::unique_ptr<ZORListValZORBaseUnknown_var> children(
        product->GetChildren("ZORIProduct"));
    for (int i = 1; children && i <= children->Size(); ++i) open.emplace_back((*children)[i]);
  }
  return triangles;
}

}  // namespace

std::uint64_t DrawingCosts::Of(const ResolvedInterference& inResolved) {
  std::uint64_t cost = kCostOfPictures;
  for (const ResolvedProduct& product : inResolved.products) {
    if (product.shown.product.IsNull()) continue;
    const auto [place, isNew] = trianglesOfPath_.try_emplace(product.path, 0);
    if (isNew) place->second = TrianglesOf(product.shown.product);
    cost += place->second;
  }
  return cost;
}

std::uint64_t DrawingCosts::OfAll(const ZORIProduct_var& inRoot) {
  return kCostOfPictures + TrianglesOf(inRoot);
}

}  // namespace ZORToolkit
