#include "toolkit/detection/ProductTree.h"

#include <algorithm>
#include <memory>

#include "default_platform/OpenModel.h"
#include "platform/product_structure/ZORIAlias.h"
#include "toolkit/Error.h"
#include "toolkit/records/DocumentText.h"
#include "toolkit/records/Glob.h"

namespace ZORToolkit {
namespace {

constexpr const char* kSeparator = " --++-- ";  // between the aliases of a path

bool MatchesAny(const std::vector<std::string>& inPatterns, const Unit& inUnit) {
  return std::ranges::any_of(
      inUnit.names, [&](const std::string& name) { return MatchesAnyGlob(inPatterns, name); });
}

}  // namespace

ProductTree::ProductTree(const ZORIProduct_var& inRoot, const DetectionOptions& inOptions)
    : options_(inOptions) {
  const ZORIAlias_var alias = inRoot;
  if (!alias.IsNull()) rootAlias_ = Utf8(alias->GetAlias());
  Visit(inRoot, {}, {}, 0, std::nullopt);
}

void ProductTree::Visit(const ZORIProduct_var& inProduct, const std::string& inPath,
                        std::vector<std::string> inNames, int inLevel,
                        std::optional<std::size_t> inUnit) {
  ZORDefault::ProductInfo info;
  if (!ZORDefault::GetProductInfo(inProduct.GetInterface(), info)) return;
  std::string path;
  if (inLevel > 0) {
    if (!inPath.empty()) path.append(inPath).append(kSeparator);
    path += Utf8(info.alias);
  }
  const std::string partName = Utf8(info.partName);
  partNames_.emplace(static_cast<std::uint32_t>(info.part), partName);
  if (inLevel > 0) inNames.push_back(path);
  if (inLevel > 0 && !partName.empty()) inNames.push_back(partName);
  const std::unique_ptr<ZORListValZORBaseUnknown_var> children(
      inProduct->GetChildren("ZORIProduct"));
  const int count = children ? children->Size() : 0;
  const bool isLeaf = count == 0;
  if (!inUnit && (options_.level ? inLevel == *options_.level || isLeaf : isLeaf) && inLevel > 0) {
    inUnit = units_.size();
    // Filled one by one: GCC 12 frees the parts of such a value twice when one of them has no
    // memory.
    Unit unit;
    unit.product.path = path;
    unit.product.partName = partName;
    unit.names = inNames;
    info.rootFromProduct.GetCoefficients(unit.product.rootFromProduct.data());
    units_.push_back(std::move(unit));
  }
  if (isLeaf) {
    if (inUnit && !info.isAssembly)
      leaves_.push_back({*inUnit, static_cast<std::uint32_t>(info.part), info.rootFromProduct});
    return;
  }
  for (int i = 1; i <= count; ++i) {
    const ZORIProduct_var child = (*children)[i];
    Visit(child, path, inNames, inLevel + 1, inUnit);
  }
}

Selection::Selection(const std::string& inModel, const DetectionOptions& inOptions,
                     const std::vector<Unit>& inUnits) {
  if (inUnits.size() < 2) throw Error(inModel, "there are not two products to check");
  for (const Unit& unit : inUnits) {
    const bool isIn = (inOptions.only.empty() || MatchesAny(inOptions.only, unit)) &&
                      !MatchesAny(inOptions.ignore, unit);
    const bool isFirst = !inOptions.between || MatchesAny({inOptions.between->first}, unit);
    const bool isSecond = !inOptions.between || MatchesAny({inOptions.between->second}, unit);
    isFirst_.push_back(isIn && isFirst);
    isSecond_.push_back(isIn && isSecond);
  }
  for (const auto* side : {&isFirst_, &isSecond_})
    if (std::ranges::find(*side, true) == side->end())
      throw Error(inModel, "no product is selected");
}

}  // namespace ZORToolkit
