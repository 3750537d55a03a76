// Interferences that belong together.
#ifndef ZOR_TOOLKIT_REVIEW_GROUP_H
#define ZOR_TOOLKIT_REVIEW_GROUP_H

#include <optional>
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

struct ZOR_TOOLKIT_EXPORT InterferenceGroup {
  std::uint64_t number = 0;  ///< the identifier
  GroupBy by = GroupBy::kParts;
  std::string label;            ///< for a person
  std::vector<int> members;     ///< positions in ReviewedResult::interferences, ascending
  int representative = -1;      ///< the member of the worst value; of several the first
  std::optional<double> worst;  ///< the least value of its members: the deepest penetration
  std::vector<InterferenceGroup> groups;

  /// 16 hexadecimal digits; the same as long as what it is grouped by is.
  std::string Id() const;
};

/// Every interference is in exactly one group of each level. The largest group comes first; of equal
/// size the worst, then the one whose first member comes first. Deterministic, n log n.
ZOR_TOOLKIT_EXPORT std::vector<InterferenceGroup> GroupInterferences(
    const ReviewedResult& inResult, const GroupOptions& inOptions = {});

/// The group of an identifier among these and those inside them; null when there is none.
ZOR_TOOLKIT_EXPORT const InterferenceGroup* FindGroup(
    const std::vector<InterferenceGroup>& inGroups, const std::string& inId);

}  // namespace ZORToolkit

#endif
