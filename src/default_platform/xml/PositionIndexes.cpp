#include "default_platform/xml/PositionIndexes.h"

#include <algorithm>
#include <utility>

PositionIndexes::Index* PositionIndexes::Of(std::uint32_t inParent) {
  if (!any_) return nullptr;
  for (Index& index : indexes_)
    if (index.parent == inParent) return &index;
  return nullptr;
}

const PositionIndexes::Children* PositionIndexes::Find(std::uint32_t inParent) {
  Index* const index = Of(inParent);
  if (index == nullptr) return nullptr;
  index->worth = age_ + index->children.size();
  return &index->children;
}

const PositionIndexes::Children& PositionIndexes::Keep(std::uint32_t inParent,
                                                       Children inChildren) {
  Index& cheapest =
      *std::min_element(indexes_.begin(), indexes_.end(),
                        [](const Index& inA, const Index& inB) { return inA.worth < inB.worth; });
  age_ = std::max(age_, cheapest.worth);
  cheapest.parent = inParent;
  cheapest.children = std::move(inChildren);
  cheapest.worth = age_ + cheapest.children.size();
  any_ = true;
  return cheapest.children;
}

void PositionIndexes::Drop(std::uint32_t inParent) {
  Index* const index = Of(inParent);
  if (index != nullptr) *index = Index();
}

void PositionIndexes::Append(std::uint32_t inParent, std::uint32_t inChild) {
  Index* const index = Of(inParent);
  if (index != nullptr) index->children.push_back(inChild);
}
