// What the command knows of the products of a model.
#ifndef ZOR_TOOLS_LYRA_MODEL_RECORDS_H
#define ZOR_TOOLS_LYRA_MODEL_RECORDS_H

#include <cstddef>
#include <optional>
#include <string>

#include "platform/product_structure/ZORIProduct.h"
#include "toolkit/records/InterferenceRecord.h"

namespace lyra {

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
