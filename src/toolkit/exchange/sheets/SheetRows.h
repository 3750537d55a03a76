// The rows of interferences in sheets, one after the other; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_EXCHANGE_SHEETS_SHEET_ROWS_H
#define ZOR_TOOLKIT_EXCHANGE_SHEETS_SHEET_ROWS_H

#include <array>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

#include "toolkit/exchange/sheets/ResultSheet.h"
#include "toolkit/review/ReviewRecords.h"

namespace ZORToolkit {

inline constexpr std::size_t kTypeColumn = 2, kStatusColumn = 3, kCommentColumn = 4;

/// As much as a cell takes, cut between characters.
std::string FittingCell(std::string_view inText);

class SheetRows {
 public:
  typedef std::function<void(const InterferenceRecord& inRecord,
                             const std::vector<SheetCell>& inCells)>
      Visit;

  explicit SheetRows(ClashDocument& ioResult);

  const ReviewedResult& Result() const { return result_; }
  const std::vector<std::string>& Ids() const { return ids_; }
  /// The cells are valid until the next row.
  void ForEach(const RecordFilter& inFilter, const Visit& inVisit);
  /// What the rows that were visited have no place for.
  std::vector<NotCarried> ListNotCarried() const;

 private:
  void Fill(const InterferenceRecord& inRecord);
  void AddText(std::string_view inText);
  void CountNotCarried(const InterferenceRecord& inRecord);
  bool HasViewpoint(const ReviewRecord& inRecord) const;

  ClashDocument& document_;
  ReviewedResult result_;
  std::vector<std::string> ids_;
  std::vector<SheetCell> cells_;
  bool isCut_ = false;  // a text of the row
  int viewpointName_ = -1;
  std::array<int, 7> notCarried_{};
};

}  // namespace ZORToolkit

#endif
