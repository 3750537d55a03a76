// A hierarchy of boxes over triangles.
#ifndef ZOR_TOOLKIT_DETECTION_KERNEL_TRIANGLETREE_H
#define ZOR_TOOLKIT_DETECTION_KERNEL_TRIANGLETREE_H

#include <cstdint>
#include <span>
#include <vector>

#include "toolkit/detection/kernel/Box.h"

namespace ZORDetection {

/// Built by median splits along the longest axis.
class TriangleTree {
 public:
  struct Node {
    Box box;
    std::uint32_t first = 0;  ///< of a leaf, its place in Order(); else the second child
    std::uint32_t count = 0;  ///< items of a leaf; 0: not a leaf, the first child follows
    bool IsLeaf() const { return count != 0; }
  };

  /// @param inBoxes one for each item, triangles or whatever else has a box.
  void Build(std::span<const Box> inBoxes) {
    order_.resize(inBoxes.size());
    for (std::size_t i = 0; i < order_.size(); ++i) order_[i] = static_cast<std::uint32_t>(i);
    nodes_.clear();
    if (!inBoxes.empty()) Split(inBoxes, 0, order_.size());
  }

  bool IsEmpty() const { return nodes_.empty(); }
  const std::vector<Node>& Nodes() const { return nodes_; }
  std::span<const std::uint32_t> Items(const Node& inLeaf) const {
    return {order_.data() + inLeaf.first, inLeaf.count};
  }

 private:
  static constexpr std::size_t kMaxLeaf = 3;

  void Split(std::span<const Box> inBoxes, std::size_t inFirst, std::size_t inEnd) {
    const std::size_t self = nodes_.size();
    nodes_.emplace_back();
    Box all, centres;
    for (std::size_t i = inFirst; i < inEnd; ++i) {
      all.Add(inBoxes[order_[i]]);
      centres.Add(inBoxes[order_[i]].Centre());
    }
    nodes_[self].box = all;
    if (inEnd - inFirst <= kMaxLeaf) {
      nodes_[self].first = static_cast<std::uint32_t>(inFirst);
      nodes_[self].count = static_cast<std::uint32_t>(inEnd - inFirst);
      return;
    }
    const gp_XYZ size = centres.HalfSize();
    const int axis = size.X() >= size.Y() && size.X() >= size.Z() ? 1
                     : size.Y() >= size.Z()                       ? 2
                                                                  : 3;
    const std::size_t middle = (inFirst + inEnd) / 2;
    const auto at = [this](std::size_t i) {
      return order_.begin() + static_cast<std::ptrdiff_t>(i);
    };
    std::nth_element(at(inFirst), at(middle), at(inEnd), [&](std::uint32_t a, std::uint32_t b) {
      const double x = inBoxes[a].Centre().Coord(axis), y = inBoxes[b].Centre().Coord(axis);
      return x != y ? x < y : a < b;
    });
    Split(inBoxes, inFirst, middle);
    nodes_[self].first = static_cast<std::uint32_t>(nodes_.size());
    Split(inBoxes, middle, inEnd);
  }

  std::vector<Node> nodes_;
  std::vector<std::uint32_t> order_;
};

}  // namespace ZORDetection

#endif
