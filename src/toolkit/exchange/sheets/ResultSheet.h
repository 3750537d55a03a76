// Clash results as spreadsheets.
#ifndef ZOR_TOOLKIT_EXCHANGE_SHEETS_RESULT_SHEET_H
#define ZOR_TOOLKIT_EXCHANGE_SHEETS_RESULT_SHEET_H

#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "toolkit/exchange/bcf/BcfWriter.h"

namespace ZORToolkit {

/// A number where there is one, else a text.
struct SheetCell {
  std::string text;
  std::optional<double> number;
};

/// The headers of the rows below. Lengths are millimetres.
ZOR_TOOLKIT_EXPORT std::vector<std::string> SheetHeaders();

/// A row of cells for each interference that a filter accepts, in the order of SheetHeaders. "Id"
/// is the stable identifier, by which a row comes back; "Status" and "Comment" are for editing;
/// "Base" is what they were when the row was written.
/// @return what the rows have no place for.
ZOR_TOOLKIT_EXPORT std::vector<NotCarried> ForEachSheetRow(
    ClashDocument& ioResult, const RecordFilter& inFilter,
    const std::function<void(const std::vector<SheetCell>& inCells)>& inVisit);

/// What is written, and with which thumbnails.
struct SpreadsheetOptions {
  std::optional<RecordFilter> filter;  ///< nothing: all of them
  GroupOptions grouping;
  /// Thumbnails of a published page; empty: drawn when there is a model, else none.
  std::string page;
  int processes = 1;                                                 ///< that draw; at least 1
  std::function<void(std::size_t inDone, std::size_t inAll)> drawn;  ///< may be empty
};

/// What was written, and what a workbook has no place for.
struct SpreadsheetWritten {
  std::size_t interferences = 0, pictures = 0;
  std::vector<NotCarried> notCarried;
};

/// Writes a workbook (Office Open XML) with sheets of interferences, of counts with a chart, of
/// products and of groups. The memory does not grow with the rows, but for that of the document.
/// @param inOpenModel answers the root of the model that thumbnails show; may be empty.
/// Raises Error, also for more rows than a sheet has.
ZOR_TOOLKIT_EXPORT SpreadsheetWritten
WriteSpreadsheet(ClashDocument& ioResult, const SpreadsheetOptions& inOptions,
                 const std::function<ZORIProduct_var()>& inOpenModel, const std::string& inPath);

}  // namespace ZORToolkit

#endif
