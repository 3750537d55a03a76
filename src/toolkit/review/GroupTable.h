// All groups of a result in a few arrays; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_REVIEW_GROUP_TABLE_H
#define ZOR_TOOLKIT_REVIEW_GROUP_TABLE_H

#include <cmath>
#include <mutex>

#include "toolkit/review/ProductLabels.h"

namespace ZORToolkit {

/// Of each level the groups of all that the level before has, one behind the other, so that each
/// takes the same stretch of the level's members as what it is inside of.
class GroupTable {
 public:
  static constexpr std::uint64_t kNoPlace = ~std::uint64_t{0};

  struct Group {
    /// The numbers of both labels, the lesser in the upper half; or that of the one label; or which
    /// place among those of the group around it, from 0.
    std::uint64_t key = 0;
    double worst = std::nan("");
    std::uint32_t begin = 0;  // of its members; they end where the next group's begin
    std::uint32_t inner = 0;  // likewise of the groups inside it, on the next level
    int representative = -1;
  };
  struct Level {
    Level(const ReviewedResult& inResult, GroupBy inBy)
        : by(inBy), labels(inResult.products, inBy) {}
    std::size_t Count() const { return groups.size() - 1; }

    GroupBy by;
    ProductLabels labels;
    std::vector<Group> groups;  // and one that ends the last
    std::vector<int> members;
    mutable std::vector<std::uint64_t> numbers;  // once they were asked for
  };

  explicit GroupTable(const ReviewedResult& inResult) : result_(inResult) {}
  std::vector<Level>& Levels() { return levels_; }
  const std::vector<Level>& Levels() const { return levels_; }
  const Group& At(std::size_t inLevel, std::size_t inPosition) const {
    return levels_[inLevel].groups[inPosition];
  }
  std::span<const int> MembersOf(std::size_t inLevel, std::size_t inPosition) const {
    const Level& level = levels_[inLevel];
    const std::uint32_t begin = level.groups[inPosition].begin;
    return std::span(level.members).subspan(begin, level.groups[inPosition + 1].begin - begin);
  }
  std::string LabelOf(std::size_t inLevel, std::size_t inPosition) const {
    std::string label;
    AddLabel(inLevel, inPosition, label);
    return label;
  }
  const std::vector<std::uint64_t>& NumbersOf(std::size_t inLevel) const;

 private:
  void AddLabel(std::size_t inLevel, std::size_t inPosition, std::string& ioText) const;
  void AddPlace(const Group& inGroup, int inFirst, std::string& ioText) const;
  void NumberAll() const;
  std::optional<Position> PlaceOf(int inMember) const;

  const ReviewedResult& result_;
  std::vector<Level> levels_;
  mutable std::once_flag areNumbered_;
};

}  // namespace ZORToolkit

#endif
