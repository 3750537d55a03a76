// Which part of a work that several machines share is whose.
#ifndef ZOR_TOOLKIT_SHARDING_SHARD_H
#define ZOR_TOOLKIT_SHARDING_SHARD_H

#include <algorithm>
#include <charconv>
#include <cstddef>
#include <cstdint>
#include <numeric>
#include <optional>
#include <string_view>
#include <vector>

namespace ZORToolkit {

/// Share number of count; the first is 1.
struct Shard {
  std::uint32_t number = 1, count = 1;
};

inline constexpr std::uint32_t kMaxShards = 1'000'000;

/// From "K/N", 1 <= K <= N <= kMaxShards. @return nothing for any other text.
inline std::optional<Shard> ShardFrom(std::string_view inText) {
  const char* const end = inText.data() + inText.size();
  Shard shard{0, 0};
  const auto number = std::from_chars(inText.data(), end, shard.number);
  if (number.ec != std::errc() || number.ptr == end || *number.ptr != '/') return std::nullopt;
  const auto count = std::from_chars(number.ptr + 1, end, shard.count);
  const bool isRead = count.ec == std::errc() && count.ptr == end;
  if (!isRead || shard.number < 1 || shard.number > shard.count || shard.count > kMaxShards)
    return std::nullopt;
  return shard;
}

/// The share, from 0, of each item: consecutive items belong together, since they often show the
/// same parts, and an item is in the share in which the middle of its cost falls. No share is
/// larger or smaller than the mean by more than the cost of one item. Every machine cuts alike.
/// @param inCosts expected, in any unit.
/// @param inCount at least 1.
inline std::vector<std::uint32_t> SharesOf(const std::vector<std::uint64_t>& inCosts,
                                           std::uint32_t inCount) {
  double all = 0, before = 0;  // exact below 2^53, and the same on every machine above
  for (const std::uint64_t cost : inCosts) all += static_cast<double>(cost);
  std::vector<std::uint32_t> shares;
  shares.reserve(inCosts.size());
  for (const std::uint64_t cost : inCosts) {
    const auto own = static_cast<double>(cost);
    const double place = all > 0 ? (before + own / 2) / all * inCount : 0;
    shares.push_back(std::min(static_cast<std::uint32_t>(place), inCount - 1));
    before += own;
  }
  return shares;
}

/// Items to try before all are done: the cheapest, the dearest, and some evenly between them by
/// cost.
inline std::vector<std::size_t> ItemsToTry(const std::vector<std::uint64_t>& inCosts,
                                           std::size_t inCount) {
  std::vector<std::size_t> items(inCosts.size());
  std::iota(items.begin(), items.end(), std::size_t{0});
  if (items.size() <= inCount || inCount < 2) return items;
  std::ranges::stable_sort(items, {}, [&](std::size_t inItem) { return inCosts[inItem]; });
  std::vector<std::size_t> chosen;
  for (std::size_t i = 0; i < inCount; ++i)
    chosen.push_back(items[i * (items.size() - 1) / (inCount - 1)]);
  return chosen;
}

}  // namespace ZORToolkit

#endif
