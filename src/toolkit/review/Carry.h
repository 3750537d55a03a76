// Review work on results: what is decided, carried over to a later result, merged and applied.
#ifndef ZOR_TOOLKIT_REVIEW_CARRY_H
#define ZOR_TOOLKIT_REVIEW_CARRY_H

#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "toolkit/review/Diff.h"

namespace ZORToolkit {

/// What is to be said of an interference. Nothing where it stays as it is.
struct ReviewEdit {
  int position = -1;  ///< in ReviewedResult::interferences
  std::optional<std::string>
      status;  ///< "Relevant", "Irrelevant", "Not inspected" or a text as it is
  std::optional<std::string> comment;
  std::optional<std::string_view> retrieve;  ///< "Old" or "New", a literal
};

/// Writes into a document what differs from what it says, in the language of its words. Everything
/// else in it stays as it is.
/// @param ioDocument the one that inResult was read from.
/// @return how many interferences changed.
ZOR_TOOLKIT_EXPORT int ApplyReviewEdits(ClashDocument& ioDocument, const ReviewedResult& inResult,
                                        std::span<const ReviewEdit> inEdits);

struct CarryPlan {
  std::vector<ReviewEdit> edits;  ///< of the new result, where it says something else
  int carried = 0;                ///< decisions of the old result that hold
  int reopened = 0;               ///< decisions that have to be made again
  int replaced = 0;               ///< other decisions of the new result that gave way to old ones
  int left = 0;  ///< decisions on what the new result has not: resolved or not comparable
};

/// The review work of an old result on a new one: status, comment and age. A decision is a status
/// other than "Not inspected", or a comment. What the old result did not decide stays as the new one
/// has it; what both decided follows the old one. A status whose interference changed substantially
/// becomes "Not inspected", and its comment gains a line that says what changed.
/// @param inKeepChanged leaves such a status as it was.
ZOR_TOOLKIT_EXPORT CarryPlan PlanCarry(const ReviewedResult& inOld, const ReviewedResult& inNew,
                                       const ResultDiff& inDiff, bool inKeepChanged = false);

// Merging

struct ReviewConflict {
  int position = -1;  ///< in the result that is merged into
  std::string id;
  std::string what;  ///< "status" or "comment"
  std::string base, mine, theirs;
};

enum class Preference { kNone, kMine, kTheirs };

struct MergePlan {
  std::vector<ReviewEdit> edits;  ///< of mine
  /// Where both changed the same thing to something else. Mine stays there unless theirs is
  /// preferred.
  std::vector<ReviewConflict> conflicts;
  int missing = 0;  ///< decisions of theirs on interferences that mine has not
};

/// Three ways on status and comment: what only one of the two changed since the base is taken.
ZOR_TOOLKIT_EXPORT MergePlan PlanMerge(const ReviewedResult& inBase, const ReviewedResult& inMine,
                                       const ReviewedResult& inTheirs,
                                       Preference inPreference = Preference::kNone);

// Review files

struct ReviewEntry {
  std::string id;
  int index = 0;
  std::optional<std::string> baseStatus, status, comment;
  std::string who, when;
};

/// Decisions that were made away from the result, as JSON:
/// {"format": "zorlyra-review/1", "result": {"document", "hash"}, "entries": [{"id", "index",
/// "baseStatus", "status", "comment", "who", "when"}]}
struct ReviewFile {
  std::string document, hash;
  std::vector<ReviewEntry> entries;
};

/// @param inName what errors call it. Raises Error with the place of what is no such file.
ZOR_TOOLKIT_EXPORT ReviewFile ReadReviewFile(const std::string& inName, std::string_view inBytes);

/// What tells one content of a result's file from another: 32 hexadecimal digits.
ZOR_TOOLKIT_EXPORT std::string DocumentHash(std::string_view inBytes);

struct ApplyPlan {
  std::vector<ReviewEdit> edits;
  /// Entries whose base status is not what the result says any more, and that want yet another.
  /// They are not applied.
  std::vector<ReviewConflict> conflicts;
  std::vector<ReviewEntry> unknown;  ///< whose interference the result has not
};

ZOR_TOOLKIT_EXPORT ApplyPlan PlanApply(const ReviewedResult& inResult, const ReviewFile& inReview,
                                       Preference inPreference = Preference::kNone);

}  // namespace ZORToolkit

#endif
