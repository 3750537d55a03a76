// CAD models and their products.
#ifndef ZOR_TOOLS_LYRA_COMMANDS_MODEL_H
#define ZOR_TOOLS_LYRA_COMMANDS_MODEL_H

#include <cstddef>
#include <functional>
#include <limits>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "default_platform/OpenModel.h"
#include "platform/product_structure/ZORIProduct.h"
#include "toolkit/records/InterferenceRecord.h"

namespace lyra {

class Arguments;

/// How a model is read, for the verbs that open one.
struct ModelReading {
  std::optional<long long> seconds, megabytes;  ///< nothing: the settings, else by its size
  bool isStrict = false;

  void Declare(Arguments& ioArguments);
  /// Raises UsageError for a limit that is none.
  void Check() const;
  /// With the limits of the settings where none is given.
  ZORDefault::ModelOptions Options() const;

 private:
  long long Seconds() const;
  long long Megabytes() const;
};

/// Opens a model. What was repaired or left out is reported on standard error, progress too when that is
/// a terminal. Raises InputError with the reason for what cannot be opened, and for "-": a model is
/// always a file.
ZORDefault::OpenedModel OpenModelFile(const std::string& inPath, const ModelReading& inReading);

/// A product on the way from the root to the one that is visited.
struct ProductLevel {
  ZORIProduct_var product;
  std::unique_ptr<ZORListValZORBaseUnknown_var> children;  // null without any
  int entered = 0;                                         // of its children
  bool isLast = true;                                      // of its parent's children

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

/// Texts are UTF-8 as the model has them.
struct ModelProductRecord {
  std::optional<std::string> path;  ///< below the root; only where it was asked for
  std::string alias, part;
  ZORToolkit::Placement placement;    ///< in the root's space
  std::size_t triangles;              ///< of the product alone
  std::optional<std::string> colour;  ///< "#rrggbb"
};

ModelProductRecord ReadModelProduct(const ZORIProduct_var& inProduct);

/// A place such as "12.5, 0, -3", in millimetres.
std::string PositionShown(const ZORToolkit::Placement& inPlacement);
/// How a placement turns, such as "90° about 0, 0, 1"; empty when it does not; "mirrored" or
/// "scaled" when it does more.
std::string TurnShown(const ZORToolkit::Placement& inPlacement);

}  // namespace lyra

#endif
