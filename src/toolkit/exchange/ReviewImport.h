// Review work that was done in other tools, as a review file of ours.
#ifndef ZOR_TOOLKIT_EXCHANGE_REVIEW_IMPORT_H
#define ZOR_TOOLKIT_EXCHANGE_REVIEW_IMPORT_H

#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "toolkit/exchange/bcf/BcfFile.h"
#include "toolkit/review/Carry.h"
#include "toolkit/review/Group.h"

namespace ZORToolkit {

/// What a status is called by us: "Relevant", "Irrelevant" or "Not inspected" for these words in
/// any language, and for the words that other tools have. "Open", "New", "Reopened" and the like
/// are not inspected, "Active", "In progress", "Assigned" and the like relevant, "Closed",
/// "Resolved", "Accepted" and the like irrelevant.
/// @return nothing for another word.
ZOR_TOOLKIT_EXPORT std::optional<std::string> StatusCalled(const std::string& inText);

/// A decision with what a result has no place for; its comment says that too.
struct ImportedEntry : ReviewEntry {
  std::string assignee;
  std::vector<std::string> labels;
};

/// The decisions that were made in another tool.
struct ImportedReview {
  std::string document;                ///< of the result
  std::vector<ImportedEntry> entries;  ///< only what was changed, by number
  int seen = 0;                        ///< topics or rows that are ours
  std::vector<std::string> notes;      ///< what could not be taken over; a line each
};

/// What was done in a BCF file since it was written. Topics are known by their GUIDs, so the result
/// may have been computed again; what was changed is told from the result that the file carries,
/// or, where a tool dropped that, from this one. New comments, the assignee and new labels become
/// lines of the comment; a line that is there already is not added again.
/// @param inGrouping how the topics of groups were made.
ZOR_TOOLKIT_EXPORT ImportedReview ImportBcf(const ReviewedResult& inResult, const BcfProject& inBcf,
                                            const GroupOptions& inGrouping);

/// What was done in a sheet: an Office Open XML workbook, or text with commas, semicolons or tabs.
/// Rows are known by the column "Id" alone, wherever they and their columns are. A status or
/// comment that is not what the column "Base" says, or the result where there is no such column,
/// was changed; an empty cell of a comment takes it out, an empty status says nothing.
/// @param inPath what ends in .xlsx, else text. Raises Error for what is no such file or has no
///               columns "Id" and "Status" or "Comment".
ZOR_TOOLKIT_EXPORT ImportedReview ImportSheet(const ReviewedResult& inResult,
                                              const std::string& inPath);

/// The review file: "zorlyra-review/1".
/// @param inHash of the result's file, see DocumentHash.
ZOR_TOOLKIT_EXPORT std::string ReviewFileText(const ImportedReview& inReview,
                                              const std::string& inHash);

}  // namespace ZORToolkit

#endif
