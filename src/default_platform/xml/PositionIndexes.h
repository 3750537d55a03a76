// Finding children by position.
#ifndef ZOR_DEFAULT_PLATFORM_XML_POSITIONINDEXES_H
#define ZOR_DEFAULT_PLATFORM_XML_POSITIONINDEXES_H

#include <array>
#include <cstdint>
#include <vector>

/// The children of a few parents as arrays. A host that walks by position asks for the length and
/// one item in turn, at several levels at once, so several indexes are kept. Which one makes room is
/// chosen by what it would cost to build again (GreedyDual of N. Young, "The k-server dual and loose
/// competitiveness for paging", 1994): a long list in an outer loop outlives the many short ones of
/// the inner loops.
class PositionIndexes {
 public:
  using Children = std::vector<std::uint32_t>;

  /// @return the index of a parent, or null.
  const Children* Find(std::uint32_t inParent);
  const Children& Keep(std::uint32_t inParent, Children inChildren);
  /// Forgets a parent whose children changed.
  void Drop(std::uint32_t inParent);
  /// Follows a child added as the last one.
  void Append(std::uint32_t inParent, std::uint32_t inChild);

 private:
  struct Index {
    std::uint32_t parent = 0;
    std::uint64_t worth = 0;
    Children children;
  };
  Index* Of(std::uint32_t inParent);

  std::array<Index, 8> indexes_;
  std::uint64_t age_ = 0;
  bool any_ = false;
};

#endif
