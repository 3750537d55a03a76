#include <algorithm>
#include <charconv>
#include <functional>
#include <optional>
#include <unordered_map>

#include "foundation/ReadWholeFile.h"
#include "foundation/Utf8.h"
#include "toolkit/exchange/ExchangeLibrary.h"
#include "toolkit/exchange/ExchangeXml.h"
#include "toolkit/exchange/ReviewImport.h"
#include "toolkit/exchange/sheets/SheetBase.h"
#include "toolkit/records/RecordFilter.h"
#include "toolkit/review/Match.h"

namespace ZORToolkit {
namespace {

typedef std::vector<std::string> Row;
/// Called with row after row, the header first. @return false to stop.
typedef std::function<bool(Row& ioRow)> RowVisit;

// Office Open XML

/// Characters that XML cannot carry are written as _xHHHH_ (ECMA-376, ST_Xstring).
std::string Unescaped(const std::string& inText) {
  std::string text;
  for (std::size_t i = 0; i < inText.size(); ++i) {
    unsigned int code = 0;
    const bool isEscape =
        inText.compare(i, 2, "_x") == 0 && i + 6 < inText.size() && inText[i + 6] == '_' &&
        std::from_chars(inText.data() + i + 2, inText.data() + i + 6, code, 16).ptr ==
            inText.data() + i + 6;
    if (!isEscape) {
      text += inText[i];
      continue;
    }
    char bytes[4];
    const bool isSurrogate = code >= 0xD800 && code <= 0xDFFF;
    text.append(bytes, ZORFoundation::EncodeCharacter(isSurrogate ? 0xFFFD : code, bytes));
    i += 6;
  }
  return text;
}

/// The text of a string, plain or in runs, without phonetic hints.
std::string StringIn(const DOM_Node& inElement) {
  std::string text;
  ForEachLocal(inElement, "t", [&](const DOM_Node& inText) { text += TextOf(inText); });
  ForEachLocal(inElement, "r", [&](const DOM_Node& inRun) {
    ForEachLocal(inRun, "t", [&](const DOM_Node& inText) { text += TextOf(inText); });
  });
  return Unescaped(text);
}

/// 0 for a reference such as "A7"; nothing for what is none.
std::optional<std::size_t> ColumnOf(const std::string& inReference) {
  std::size_t column = 0;
  for (const char letter : inReference) {
    if (letter < 'A' || letter > 'Z') break;
    column = 26 * column + static_cast<std::size_t>(letter - 'A' + 1);
  }
  if (column == 0 || column > 16384) return std::nullopt;
  return column - 1;
}

class Workbook {
 public:
  explicit Workbook(const std::string& inPath) : path_(inPath) {
    std::string reason;
    const auto wants = [](std::string_view inName) {
      return inName.ends_with("sharedStrings.xml") ||
             (inName.find("worksheets/") != std::string_view::npos && inName.ends_with(".xml"));
    };
    const auto visit = [&](ArchiveEntry&& inEntry) {
      if (inEntry.bytes.empty()) return;
      if (inEntry.name.ends_with("sharedStrings.xml"))
        ReadStrings(inEntry);
      else
        sheets_[inEntry.name] = std::move(inEntry.bytes);
    };
    if (!FindExchangeFunction<ReadArchiveFunction>(kReadArchiveName)(inPath, wants, visit, reason))
      throw Error(inPath, reason);
    if (sheets_.empty()) throw Error(inPath, "is no workbook: it has no sheet");
  }

  /// @param inVisit told the rows of a sheet; false for the header of one that is not meant.
  void ForEachRow(const RowVisit& inVisit) {
    for (auto& [name, bytes] : sheets_) {
      const DOM_Node root = ParseXml(path_ + ": " + name, bytes);
      std::string().swap(bytes);  // an assignment would keep the memory
      bool goesOn = true;
      ForEachLocal(Child(root, "sheetData"), "row", [&](const DOM_Node& inRow) {
        if (!goesOn) return;
        Row row = RowIn(inRow);
        goesOn = inVisit(row);
      });
      if (goesOn) return;
    }
  }

 private:
  void ReadStrings(const ArchiveEntry& inEntry) {
    ForEachLocal(ParseXml(path_ + ": " + inEntry.name, inEntry.bytes), "si",
                 [&](const DOM_Node& inString) { strings_.push_back(StringIn(inString)); });
  }

  Row RowIn(const DOM_Node& inRow) const {
    Row row;
    ForEachLocal(inRow, "c", [&](const DOM_Node& inCell) {
      const std::size_t column = ColumnOf(AttributeText(inCell, "r")).value_or(row.size());
      if (row.size() <= column) row.resize(column + 1);
      row[column] = CellIn(inCell);
    });
    return row;
  }

  std::string CellIn(const DOM_Node& inCell) const {
    const std::string kind = AttributeText(inCell, "t");
    if (kind == "inlineStr") return StringIn(Child(inCell, "is"));
    const std::string value = TextOf(Child(inCell, "v"));
    if (kind != "s") return Unescaped(value);
    std::size_t place = 0;
    std::from_chars(value.data(), value.data() + value.size(), place);
    return place < strings_.size() ? strings_[place] : "";
  }

  std::string path_;
  std::vector<std::string> strings_;
  std::map<std::string, std::string> sheets_;
};

// Text

/// The delimiter: the candidate that the first line has most of.
char SeparatorIn(std::string_view inText) {
  const std::string_view line = inText.substr(0, inText.find('\n'));
  char best = ',';
  for (const char separator : {';', '\t'})
    if (std::ranges::count(line, separator) > std::ranges::count(line, best)) best = separator;
  return best;
}

/// Removes the apostrophe that our CSV writer puts before a text that a spreadsheet would take for
/// a formula.
std::string WithoutGuard(std::string inCell) {
  constexpr std::string_view kGuarded = "=+-@\t\r";
  if (inCell.size() > 1 && inCell[0] == '\'' && kGuarded.find(inCell[1]) != kGuarded.npos)
    inCell.erase(0, 1);
  return inCell;
}

void ForEachTextRow(std::string_view inText, const RowVisit& inVisit) {
  if (inText.starts_with("\xEF\xBB\xBF")) inText.remove_prefix(3);
  const char separator = SeparatorIn(inText);
  Row row;
  std::string cell;
  bool isQuoted = false;
  const auto endCell = [&] {
    row.push_back(WithoutGuard(cell));
    cell.clear();
  };
  for (std::size_t i = 0; i < inText.size(); ++i) {
    const char byte = inText[i];
    if (isQuoted) {
      if (byte != '"')
        cell += byte;
      else if (i + 1 < inText.size() && inText[i + 1] == '"')
        cell += inText[++i];
      else
        isQuoted = false;
    } else if (byte == '"' && cell.empty()) {
      isQuoted = true;
    } else if (byte == separator) {
      endCell();
    } else if (byte == '\n') {
      endCell();
      if (!inVisit(row)) return;
      row.clear();
    } else if (byte != '\r') {
      cell += byte;
    }
  }
  if (cell.empty() && row.empty()) return;
  endCell();
  inVisit(row);
}

// What rows say

class SheetImporter {
 public:
  SheetImporter(const ReviewedResult& inResult, const std::string& inPath)
      : result_(inResult), path_(inPath) {
    const std::vector<std::string> ids = StableIds(inResult);
    for (std::size_t i = 0; i < ids.size(); ++i) positions_.emplace(ids[i], i);
    review_.document = inResult.name;
  }

  /// @return whether the row, or the sheet that it is the header of, is of any use.
  bool Take(Row& ioRow) {
    if (!columns_) return TakeHeader(ioRow);
    const std::string id = Cell(ioRow, columns_->id);
    if (!id.empty()) TakeRow(id, ioRow);
    return true;
  }

  ImportedReview Finish() {
    if (!columns_) throw Error(path_, "has no columns \"Id\" and \"Status\" or \"Comment\"");
    for (auto& [number, entry] : entries_) review_.entries.push_back(std::move(entry));
    return std::move(review_);
  }

 private:
  struct Columns {
    std::optional<std::size_t> id, status, comment, base;
  };

  bool TakeHeader(const Row& inRow) {
    Columns columns;
    for (std::size_t i = 0; i < inRow.size(); ++i) {
      const std::string header = WordKey(Collapsed(inRow[i]));
      if (header == "id") columns.id = i;
      if (header == "status") columns.status = i;
      if (header == "comment") columns.comment = i;
      if (header == "base") columns.base = i;
    }
    if (!columns.id || (!columns.status && !columns.comment)) return false;
    columns_ = columns;
    return true;
  }

  static std::string Cell(const Row& inRow, const std::optional<std::size_t>& inColumn) {
    return inColumn && *inColumn < inRow.size() ? inRow[*inColumn] : "";
  }

  void TakeRow(const std::string& inId, const Row& inRow) {
    const auto found = positions_.find(inId);
    if (found == positions_.end()) {
      review_.notes.push_back("the row of " + inId + " is of no interference of this result");
      return;
    }
    ++review_.seen;
    const ReviewRecord& record = result_.interferences[found->second];
    const std::string base = Cell(inRow, columns_->base);
    const std::size_t bar = base.rfind('|');
    const bool hasBase = bar != std::string::npos;
    ImportedEntry entry;
    if (columns_->status)
      entry.status = Status(Cell(inRow, columns_->status), record,
                            hasBase ? base.substr(0, bar) : std::string(record.status));
    if (columns_->comment) {
      const std::string comment = Cell(inRow, columns_->comment);
      const std::string was = hasBase ? base.substr(bar + 1) : CommentKey(record.comment);
      if (CommentKey(comment) != was && Collapsed(comment) != Collapsed(record.comment))
        entry.comment = comment;
    }
    if (!entry.status && !entry.comment) return;
    if (entry.status)
      entry.baseStatus = StatusCalled(hasBase ? base.substr(0, bar) : std::string(record.status));
    entry.id = inId;
    entry.index = record.index;
    entries_[record.index] = std::move(entry);
  }

  std::optional<std::string> Status(const std::string& inCell, const ReviewRecord& inRecord,
                                    const std::string& inWas) {
    if (inCell.empty() || inCell == inWas || inCell == inRecord.status) return std::nullopt;
    const std::optional<std::string> status = StatusCalled(inCell);
    if (!status)
      review_.notes.push_back("the status \"" + inCell + "\" of interference " +
                              std::to_string(inRecord.index) + " is none that we know");
    return status;
  }

  const ReviewedResult& result_;
  std::string path_;
  std::unordered_map<std::string, std::size_t> positions_;
  std::optional<Columns> columns_;
  std::map<int, ImportedEntry> entries_;
  ImportedReview review_;
};

}  // namespace

ImportedReview ImportSheet(const ReviewedResult& inResult, const std::string& inPath) {
  constexpr std::uint64_t kMaxText = std::uint64_t{1} << 30;
  SheetImporter importer(inResult, inPath);
  const RowVisit take = [&](Row& ioRow) { return importer.Take(ioRow); };
  try {
    if (LowerCase(inPath).ends_with(".xlsx"))
      Workbook(inPath).ForEachRow(take);
    else
      ForEachTextRow(ZORFoundation::ReadWholeFile(inPath, {kMaxText, true}).bytes, take);
  } catch (const ZORFoundation::FileError& error) {
    throw Error(error.Path(), error.Reason());
  }
  return importer.Finish();
}

}  // namespace ZORToolkit
