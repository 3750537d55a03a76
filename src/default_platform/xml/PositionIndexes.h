// Finding children by position.
#ifndef ZOR_DEFAULT_PLATFORM_XML_POSITIONINDEXES_H
#define ZOR_DEFAULT_PLATFORM_XML_POSITIONINDEXES_H

#include <algorithm>
#include <array>
#include <cstdint>
#include <utility>
#include <vector>

/// The children of a few parents as arrays. A host that walks by position asks for the length and
/// one item in turn, at several levels at once, so several indexes are kept. Which one makes room
/// is chosen by what it would cost to build again (GreedyDual of N. Young, "The k-server dual and
/// loose competitiveness for paging", 1994): a long list in an outer loop outlives the many short
/// ones of the inner loops.
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
};

inline PositionIndexes::Index* PositionIndexes::Of(std::uint32_t inParent) {
  for (Index& index : indexes_)
    if (index.parent == inParent) return &index;
  return nullptr;
}

inline const PositionIndexes::Children* PositionIndexes::Find(std::uint32_t inParent) {
  Index* const index = Of(inParent);
  if (index == nullptr) return nullptr;
  index->worth = age_ + index->children.size();
  return &index->children;
}

inline const PositionIndexes::Children& PositionIndexes::Keep(std::uint32_t inParent,
                                                              Children inChildren) {
  Index& cheapest =
      *std::min_element(indexes_.begin(), indexes_.end(),
                        [](const Index& inA, const Index& inB) { return inA.worth < inB.worth; });
  age_ = std::max(age_, cheapest.worth);
  cheapest.parent = inParent;
  cheapest.children = std::move(inChildren);
  cheapest.worth = age_ + cheapest.children.size();
  return cheapest.children;
}

inline void PositionIndexes::Drop(std::uint32_t inParent) {
  Index* const index = Of(inParent);
  if (index != nullptr) *index = Index();
}

inline void PositionIndexes::Append(std::uint32_t inParent, std::uint32_t inChild) {
  Index* const index = Of(inParent);
  if (index != nullptr) index->children.push_back(inChild);
}

#endif
