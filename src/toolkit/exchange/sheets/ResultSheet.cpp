#include "toolkit/exchange/sheets/ResultSheet.h"

#include <algorithm>
#include <cmath>
#include <filesystem>
#include <map>
#include <memory>

#include "toolkit/exchange/DocumentTimes.h"
#include "toolkit/exchange/ExchangeLibrary.h"
#include "toolkit/exchange/bcf/BcfPictures.h"
#include "toolkit/exchange/sheets/SheetRows.h"

namespace ZORToolkit {
namespace {

constexpr double kWidths[] = {18, 6,  11, 14, 40, 11, 11, 34, 16, 34,
                              16, 14, 10, 10, 10, 10, 18, 24, 20};

const std::vector<std::string> kTypes = {"Clash", "Contact", "Clearance"};
const std::vector<std::uint32_t> kTypeColours = {0xF8CBAD, 0xFFE699, 0xBDD7EE};
const std::vector<std::string> kStatuses = {"Not inspected", "Relevant", "Irrelevant"};
const std::vector<std::uint32_t> kStatusColours = {0xEDEDED, 0xF4B084, 0xC6E0B4};

/// Counts for one kind of thing.
struct Counts {
  int all = 0, byType[3] = {};
  double worst = HUGE_VAL;  // none: infinity

  void Add(const ReviewRecord& inRecord) {
    ++all;
    const auto type = std::ranges::find(kTypes, inRecord.type);
    if (type != kTypes.end()) ++byType[type - kTypes.begin()];
    worst = std::min(worst, inRecord.value.Value().value_or(HUGE_VAL));
  }
};

class WorkbookMaker {
 public:
  WorkbookMaker(ClashDocument& ioResult, const SpreadsheetOptions& inOptions,
                const std::string& inPath)
      : about_(ReadDocument(ioResult)),
        options_(inOptions),
        filter_(inOptions.filter.value_or(RecordFilter())),
        rows_(ioResult),
        result_(ioResult),
        byProduct_(rows_.Result().products.size()),
        book_(FindExchangeFunction<NewSpreadsheetFunction>(kNewSpreadsheetName)(
            inPath, static_cast<std::int64_t>(EpochOf(about_)))) {}

  SpreadsheetWritten Write(const std::function<ZORIProduct_var()>& inOpenModel) {
    if (rows_.Result().interferences.size() > kMaxSheetRows)
      throw Error(about_.file, "has more interferences than a sheet has rows");
    FindPictures(inOpenModel);
    WriteInterferences();
    WriteSummary();
    WriteProducts();
    WriteGroups();
    const std::string reason = book_->Finish();
    if (!reason.empty())
      throw Error(about_.file, std::string("the spreadsheet cannot be written: ") + reason);
    written_.notCarried = rows_.ListNotCarried();
    return written_;
  }

 private:
  void FindPictures(const std::function<ZORIProduct_var()>& inOpenModel) {
    if (options_.page.empty() && !inOpenModel) return;
    snapshotOptions_.page = options_.page;
    snapshotOptions_.size = {150, 100};
    snapshotOptions_.processes = options_.processes;
    snapshotOptions_.drawn = options_.drawn;
    maker_ = std::make_unique<SnapshotMaker>(snapshotOptions_, about_.file);
    if (!inOpenModel) return;
    std::vector<InterferenceRecord> records;
    ForEachInterference(result_, RecordPart::kAll, [&](const InterferenceRecord& inRecord) {
      if (filter_.Accepts(inRecord)) records.push_back(inRecord);
    });
    std::vector<const InterferenceRecord*> shown;
    for (const InterferenceRecord& record : records) shown.push_back(&record);
    for (const Snapshot& snapshot : maker_->Make(shown, inOpenModel))
      drawn_.push_back(snapshot.showsProducts ? snapshot.picture : "");
  }

  std::size_t CountAccepted() {
    if (!options_.filter) return rows_.Result().interferences.size();
    std::size_t count = 0;
    ForEachInterference(
        result_, filter_.NeedsLabels() ? RecordPart::kAll : RecordPart::kRow,
        [&](const InterferenceRecord& inRecord) { count += filter_.Accepts(inRecord) ? 1 : 0; });
    return count;
  }

  void WriteInterferences() {
    const bool hasPictures = maker_ != nullptr;
    SheetLayout layout;
    layout.name = "Interferences";
    const std::vector<std::string> headers = SheetHeaders();
    for (std::size_t i = 0; i < headers.size(); ++i)
      layout.columns.push_back({headers[i], kWidths[i], i + 1 == headers.size(),
                                i == kStatusColumn || i == kCommentColumn});
    if (hasPictures) layout.columns.push_back({"Picture", 21});
    layout.rows = CountAccepted();
    layout.rowHeight = hasPictures ? 78 : 0;
    layout.words = {{kTypeColumn, kTypes, kTypeColours, false},
                    {kStatusColumn, kStatuses, kStatusColours, true}};
    book_->AddSheet(layout);
    std::size_t row = 0;
    rows_.ForEach(
        filter_, [&](const InterferenceRecord& inRecord, const std::vector<SheetCell>& inCells) {
          WriteRow(row, inCells);
          if (hasPictures)
            WritePicture(row, inCells.size(),
                         drawn_.empty() ? maker_->PagePicture(inRecord.index) : drawn_[row]);
          Count(rows_.Result().interferences[static_cast<std::size_t>(inRecord.index - 1)]);
          ++row;
        });
    written_.interferences = row;
  }

  void WriteRow(std::size_t inRow, const std::vector<SheetCell>& inCells) {
    for (std::size_t i = 0; i < inCells.size(); ++i) {
      if (inCells[i].number)
        book_->Number(inRow, i, *inCells[i].number);
      else if (!inCells[i].text.empty() || i == kCommentColumn)
        book_->Text(inRow, i, inCells[i].text);
    }
  }

  void WritePicture(std::size_t inRow, std::size_t inColumn, const std::string& inPath) {
    const std::optional<PictureSize> size = SizeOfPicture(inPath);
    if (!size || size->width < 1 || size->height < 1) return;
    book_->Picture(inRow, inColumn, inPath, std::min(148.0 / size->width, 100.0 / size->height));
    ++written_.pictures;
  }

  void Count(const ReviewRecord& inRecord) {
    all_.Add(inRecord);
    byStatus_[std::string(inRecord.status)].Add(inRecord);
    for (std::size_t i = 0; i < 2; ++i)
      if (inRecord.products[i] >= 0 && (i == 0 || inRecord.products[0] != inRecord.products[1]))
        byProduct_[static_cast<std::size_t>(inRecord.products[i])].Add(inRecord);
    accepted_.insert(accepted_.end(), inRecord.index - 1);
  }

  void WriteSummary() {
    SheetLayout layout;
    layout.name = "Summary";
    layout.columns = {{"What", 30},    {"Interferences", 14}, {"Clash", 10},
                      {"Contact", 10}, {"Clearance", 10},     {"Worst value [mm]", 18}};
    const std::size_t lastStatus = 1 + std::max<std::size_t>(byStatus_.size(), 1) - 1;
    layout.rows = 1 + byStatus_.size();
    if (!byStatus_.empty())
      layout.charts = {{"Interferences by status", 1, lastStatus, 0, 1, layout.rows + 1, 0}};
    book_->AddSheet(layout);
    WriteCounts(0, "All of " + (about_.reference.empty() ? about_.file : about_.reference), 0,
                all_);
    std::size_t row = 1;
    for (const auto& [status, counts] : byStatus_) WriteCounts(row++, status, 0, counts);
  }

  void WriteCounts(std::size_t inRow, std::string_view inName, std::size_t inColumn,
                   const Counts& inCounts) {
    book_->Text(inRow, inColumn, FittingCell(inName));
    book_->Number(inRow, inColumn + 1, inCounts.all);
    for (std::size_t i = 0; i < 3; ++i) book_->Number(inRow, inColumn + 2 + i, inCounts.byType[i]);
    if (inCounts.worst < HUGE_VAL) book_->Number(inRow, inColumn + 5, inCounts.worst);
  }

  void WriteProducts() {
    std::vector<std::uint32_t> products;  // the most often first
    for (std::size_t i = 0; i < byProduct_.size(); ++i)
      if (byProduct_[i].all > 0) products.push_back(static_cast<std::uint32_t>(i));
    std::ranges::stable_sort(products, std::ranges::greater(),
                             [&](std::uint32_t inProduct) { return byProduct_[inProduct].all; });
    SheetLayout layout;
    layout.name = "Products";
    layout.columns = {{"Product", 50},   {"Interferences", 14},    {"Clash", 10}, {"Contact", 10},
                      {"Clearance", 10}, {"Worst value [mm]", 18}, {"Part", 24}};
    layout.rows = products.size();
    book_->AddSheet(layout);
    for (std::size_t i = 0; i < products.size(); ++i) {
      const ReviewProduct& product = rows_.Result().products[products[i]];
      WriteCounts(i, product.Name(), 0, byProduct_[products[i]]);
      book_->Text(i, 6, FittingCell(product.part));
    }
  }

  /// Those of the first level alone: what is nested in them would take as much memory again.
  void WriteGroups() {
    GroupOptions grouping = options_.grouping;
    while (grouping.by.size() > 1) grouping.by.pop_back();
    const InterferenceGroups all = GroupInterferences(rows_.Result(), grouping);
    std::vector<std::pair<InterferenceGroup, double>> groups;  // with how many are accepted
    for (const InterferenceGroup group : all) {
      const auto count = std::ranges::count_if(group.Members(), [&](int inMember) {
        return std::binary_search(accepted_.begin(), accepted_.end(), inMember);
      });
      if (count > 0) groups.emplace_back(group, static_cast<double>(count));
    }
    SheetLayout layout;
    layout.name = "Groups";
    layout.columns = {{"Group", 50},
                      {"Interferences", 14},
                      {"Worst value [mm]", 18},
                      {"Representative [N]", 18},
                      {"Group id", 18}};
    layout.rows = groups.size();
    book_->AddSheet(layout);
    for (std::size_t i = 0; i < groups.size(); ++i) {
      const auto& [group, count] = groups[i];
      book_->Text(i, 0, FittingCell(group.Label()));
      book_->Number(i, 1, count);
      if (group.Worst()) book_->Number(i, 2, *group.Worst());
      book_->Number(i, 3, group.Representative() + 1);
      book_->Text(i, 4, group.Id());
    }
  }

  DocumentRecord about_;
  const SpreadsheetOptions& options_;
  RecordFilter filter_;
  SheetRows rows_;
  ClashDocument& result_;
  std::vector<Counts> byProduct_;  // of the positions in ReviewedResult::products
  std::unique_ptr<SpreadsheetWriter> book_;
  BcfOptions snapshotOptions_;
  std::unique_ptr<SnapshotMaker> maker_;
  std::vector<std::string> drawn_;  // of the rows, where there is a model
  Counts all_;
  std::map<std::string, Counts> byStatus_;
  std::vector<int> accepted_;  // positions, ascending
  SpreadsheetWritten written_;
};

}  // namespace

SpreadsheetWritten WriteSpreadsheet(ClashDocument& ioResult, const SpreadsheetOptions& inOptions,
                                    const std::function<ZORIProduct_var()>& inOpenModel,
                                    const std::string& inPath) {
  ioResult.RequireInterferences();
  return WorkbookMaker(ioResult, inOptions, inPath).Write(inOpenModel);
}

}  // namespace ZORToolkit
