// The products of an opened model, and which of them are checked against which.
#ifndef ZOR_TOOLKIT_DETECTION_PRODUCT_TREE_H
#define ZOR_TOOLKIT_DETECTION_PRODUCT_TREE_H

#include <cstddef>
#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "platform/mathematics/ZORMathTransformation.h"
#include "platform/product_structure/ZORIProduct.h"
#include "toolkit/detection/Detect.h"

namespace ZORToolkit {

/// A product without products below it.
struct Leaf {
  std::size_t unit = 0;  ///< the unit that it counts as
  std::uint32_t part = 0;
  ZORMathTransformation rootFromProduct;
};

/// What is checked as one: a leaf, or all leaves below a product of the level that was asked for.
struct Unit {
  DetectedProduct product;
  std::vector<std::string> names;  ///< paths and part names that patterns are matched against
};

class ProductTree {
 public:
  ProductTree(const ZORIProduct_var& inRoot, const DetectionOptions& inOptions);

  const std::string& RootAlias() const { return rootAlias_; }
  const std::vector<Leaf>& Leaves() const { return leaves_; }
  const std::vector<Unit>& Units() const { return units_; }
  /// By the numbers of the parts; a name may be empty.
  const std::map<std::uint32_t, std::string>& PartNames() const { return partNames_; }

 private:
  void Visit(const ZORIProduct_var& inProduct, const std::string& inPath,
             std::vector<std::string> inNames, int inLevel, std::optional<std::size_t> inUnit);

  const DetectionOptions& options_;
  std::string rootAlias_;
  std::vector<Leaf> leaves_;
  std::vector<Unit> units_;
  std::map<std::uint32_t, std::string> partNames_;
};

/// Which units are checked, and which of them against which.
class Selection {
 public:
  /// Raises Error, by the model's name, where there is nothing to check.
  Selection(const std::string& inModel, const DetectionOptions& inOptions,
            const std::vector<Unit>& inUnits);

  bool IsSelected(std::size_t inUnit) const { return isFirst_[inUnit] || isSecond_[inUnit]; }
  bool IsFirst(std::size_t inUnit) const { return isFirst_[inUnit]; }
  bool IsSecond(std::size_t inUnit) const { return isSecond_[inUnit]; }

 private:
  std::vector<bool> isFirst_, isSecond_;
};

}  // namespace ZORToolkit

#endif
