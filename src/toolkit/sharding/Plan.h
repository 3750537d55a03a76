// How long shares of a work are expected to take, from a sample of the work itself. All times are
// processor time.
#ifndef ZOR_TOOLKIT_SHARDING_PLAN_H
#define ZOR_TOOLKIT_SHARDING_PLAN_H

#include <cstddef>
#include <cstdint>
#include <vector>

#include "ZORToolkitExport.h"

namespace ZORToolkit {

/// What there is to do, and how long some of it took here.
struct WorkSample {
  struct Timed {
    std::size_t item = 0;
    double seconds = 0;
  };
  std::vector<std::uint64_t> costs;  ///< expected, of all items
  std::vector<Timed> timed;
  double openSeconds = 0;  ///< until the first item can be done, the model in the cache
};

/// One share of a plan.
struct PlannedShare {
  std::size_t items = 0;
  double seconds = 0;  ///< on one core, with the opening
};

/// The shares of a work and how long they are expected to take.
struct Plan {
  std::vector<PlannedShare> shares;
  std::size_t items = 0, timed = 0;
  double openSeconds = 0, workSeconds = 0;  ///< all the work on one core, without the opening
};

/// Expects an item to take a constant and a part in proportion to its cost, by least squares.
/// @param inShares 0: as many as it takes for ten minutes each.
ZOR_TOOLKIT_EXPORT Plan PlanOf(const WorkSample& inSample, std::uint32_t inShares);

}  // namespace ZORToolkit

#endif
