// What became of the interferences of a result when it was computed again.
#ifndef ZOR_TOOLKIT_REVIEW_DIFF_H
#define ZOR_TOOLKIT_REVIEW_DIFF_H

#include <array>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <unordered_set>
#include <vector>

#include "toolkit/review/Match.h"

namespace ZORToolkit {

enum class DiffClass { kNew, kPersisting, kChanged, kResolved, kNotComparable };
inline constexpr std::size_t kDiffClassCount = 5;
/// @return "new", "persisting", "changed", "resolved" or "notComparable".
ZOR_TOOLKIT_EXPORT const char* Name(DiffClass inClass);

/// Its texts live as long as the difference.
struct Change {
  const char* what = "";      ///< "type", "value", "placement", "rule", "status" or "comment"
  std::string_view from, to;  ///< for a person; a value and a word as the documents have them
  /// Whether it is another interference to decide on: a type, a value, a rule, or a placement of one
  /// product against the other. Products that moved together do not make it one.
  bool isSubstantial = false;
};

struct ZOR_TOOLKIT_EXPORT DiffEntry {
  DiffClass itsClass = DiffClass::kNew;
  int oldPosition = -1, newPosition = -1;  ///< in ReviewedResult::interferences, -1 for none
  std::string_view reason;                 ///< lives as long as the difference
  std::span<const Change> changes;         ///< likewise

  /// Whether an old decision does not hold any more.
  bool IsReopened() const;
};

struct DiffOptions : MatchOptions {
  /// The identifiers or aliases of the products of the new model, when it is known.
  std::optional<std::unordered_set<std::string>> productsOfNewModel;
};

struct ZOR_TOOLKIT_EXPORT ResultDiff {
  std::vector<DiffEntry> entries;  ///< those with a new interference by its number, then the others
  std::array<int, kDiffClassCount> counts{};  ///< by DiffClass
  ResultMatch match;
  std::vector<std::unique_ptr<Change[]>> changes;              ///< of the entries
  std::array<std::shared_ptr<const ReviewSource>, 2> sources;  ///< for the texts of both results

  int Count(DiffClass inClass) const { return counts[static_cast<std::size_t>(inClass)]; }
  /// Whether there is anything but persisting interferences.
  bool HasDifferences() const;
};

/// What the old result had and the new one has not is resolved only if the new computation looked
/// for it. It did not where its specification or its model lacks one of the products, its clearance
/// is smaller, or it is of another kind: that is not comparable. A specification that lacked the
/// pair in the old result too says nothing.
ZOR_TOOLKIT_EXPORT ResultDiff Diff(const ReviewedResult& inOld, const ReviewedResult& inNew,
                                   const DiffOptions& inOptions = {});

/// The stable identifier of each entry: in the new result, or in the old one where there is no new.
ZOR_TOOLKIT_EXPORT std::vector<std::string> EntryIds(const ResultDiff& inDiff,
                                                     const ReviewedResult& inOld,
                                                     const ReviewedResult& inNew);

}  // namespace ZORToolkit

#endif
