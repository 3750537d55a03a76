#include "toolkit/sharding/Plan.h"

#include <algorithm>
#include <cmath>

#include "toolkit/sharding/Shard.h"

namespace ZORToolkit {
namespace {

constexpr double kSecondsOfShare = 600;
constexpr double kMaxProposed = 1000;

struct Line {
  double constant = 0, slope = 0;
};

Line FitOf(const WorkSample& inSample) {
  const auto count = static_cast<double>(inSample.timed.size());
  if (inSample.timed.empty()) return {};
  double x = 0, y = 0, xx = 0, xy = 0;
  for (const WorkSample::Timed& timed : inSample.timed) {
    const auto cost = static_cast<double>(inSample.costs[timed.item]);
    x += cost;
    y += timed.seconds;
    xx += cost * cost;
    xy += cost * timed.seconds;
  }
  const double spread = xx - x * x / count;
  const double slope = spread > 1e-9 * xx ? (xy - x * y / count) / spread : 0;
  if (slope <= 0) return {y / count, 0};
  const double constant = (y - slope * x) / count;
  return constant < 0 ? Line{0, xy / xx} : Line{constant, slope};
}

}  // namespace

Plan PlanOf(const WorkSample& inSample, std::uint32_t inShares) {
  const Line line = FitOf(inSample);
  const auto secondsOf = [&](std::uint64_t inCost) {
    return line.constant + line.slope * static_cast<double>(inCost);
  };
  Plan plan;
  plan.items = inSample.costs.size();
  plan.timed = inSample.timed.size();
  plan.openSeconds = inSample.openSeconds;
  for (const std::uint64_t cost : inSample.costs) plan.workSeconds += secondsOf(cost);
  const double proposed =
      std::clamp(std::ceil(plan.workSeconds / kSecondsOfShare), 1.0, kMaxProposed);
  const std::uint32_t count = inShares > 0 ? inShares : static_cast<std::uint32_t>(proposed);
  plan.shares.resize(count, {0, inSample.openSeconds});
  const std::vector<std::uint32_t> shares = SharesOf(inSample.costs, count);
  for (std::size_t i = 0; i < shares.size(); ++i) {
    ++plan.shares[shares[i]].items;
    plan.shares[shares[i]].seconds += secondsOf(inSample.costs[i]);
  }
  return plan;
}

}  // namespace ZORToolkit
