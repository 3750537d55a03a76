// Interferences that belong together.
#ifndef ZOR_TOOLKIT_REVIEW_GROUP_H
#define ZOR_TOOLKIT_REVIEW_GROUP_H

#include <algorithm>
#include <cstddef>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "toolkit/review/ReviewRecords.h"

namespace ZORToolkit {

/// kParts: the same two parts, in any order. kAssemblies: the same two assemblies that directly hold
/// the products. kPlace: reached from one another by steps of at most a distance. kProduct: that of
/// the two products that has more interferences in the result.
enum class GroupBy { kParts, kAssemblies, kPlace, kProduct };
/// @return "parts", "assemblies", "place" or "product".
ZOR_TOOLKIT_EXPORT const char* Name(GroupBy inBy);

struct GroupOptions {
  /// The first makes the groups, each further one those inside them.
  std::vector<GroupBy> by{GroupBy::kParts, GroupBy::kAssemblies, GroupBy::kPlace};
  double distance = 50;  ///< of kPlace; millimetres
};

class GroupTable;
class GroupList;

/// One group; lives as long as the groups that it was taken from. Label and identifier are made when
/// they are asked for.
class ZOR_TOOLKIT_EXPORT InterferenceGroup {
 public:
  InterferenceGroup(const GroupTable& inTable, std::size_t inLevel, std::size_t inPosition)
      : table_(&inTable), level_(inLevel), position_(inPosition) {}

  GroupBy By() const;
  std::string Label() const;  ///< for a person
  /// Positions in ReviewedResult::interferences, ascending.
  std::span<const int> Members() const;
  int Representative() const;  ///< the member of the worst value; of several the first
  /// The least value of its members: the deepest penetration.
  std::optional<double> Worst() const;
  GroupList Groups() const;  ///< those inside it
  /// The same as long as what it is grouped by is.
  std::uint64_t Number() const;
  std::string Id() const;  ///< the number as 16 hexadecimal digits

 private:
  const GroupTable* table_;
  std::size_t level_, position_;
};

/// The groups of a result, or those inside one of them.
class ZOR_TOOLKIT_EXPORT GroupList {
 public:
  class Iterator {
   public:
    typedef InterferenceGroup value_type;
    typedef std::ptrdiff_t difference_type;
    Iterator(const GroupList& inList, std::size_t inAt) : list_(&inList), at_(inAt) {}
    InterferenceGroup operator*() const { return (*list_)[at_]; }
    Iterator& operator++() {
      ++at_;
      return *this;
    }
    bool operator==(const Iterator& inOther) const { return at_ == inOther.at_; }

   private:
    const GroupList* list_;
    std::size_t at_;
  };
  typedef Iterator const_iterator;

  GroupList(const GroupTable& inTable, std::size_t inLevel, std::size_t inBegin, std::size_t inEnd)
      : table_(&inTable), level_(inLevel), begin_(inBegin), end_(inEnd) {}

  std::size_t size() const { return end_ - begin_; }
  bool empty() const { return begin_ == end_; }
  InterferenceGroup operator[](std::size_t inPosition) const {
    return {*table_, level_, begin_ + inPosition};
  }
  Iterator begin() const { return {*this, 0}; }
  Iterator end() const { return {*this, size()}; }

 private:
  const GroupTable* table_;
  std::size_t level_, begin_, end_;
};

/// All groups of a result, whose copies share them. The result must live as long as they do.
class ZOR_TOOLKIT_EXPORT InterferenceGroups : public GroupList {
 public:
  explicit InterferenceGroups(std::shared_ptr<const GroupTable> inTable);

  /// The group of an identifier, at any depth.
  std::optional<InterferenceGroup> Find(std::string_view inId) const;

 private:
  std::shared_ptr<const GroupTable> table_;
};

/// Every interference is in exactly one group of each level. The largest group comes first; of equal
/// size the worst, then the one whose first member comes first. Deterministic, n log n.
ZOR_TOOLKIT_EXPORT InterferenceGroups GroupInterferences(const ReviewedResult& inResult,
                                                         const GroupOptions& inOptions = {});

/// What of a result is to be read for these groups, their identifiers included.
inline ReviewReading ReadingForGroups(const GroupOptions& inOptions) {
  const bool hasPlaces = std::ranges::count(inOptions.by, GroupBy::kPlace) > 0;
  return {.identities = hasPlaces};
}

}  // namespace ZORToolkit

#endif
