#include "toolkit/exchange/ResultSheet.h"

#include <algorithm>
#include <cmath>
#include <filesystem>
#include <map>
#include <memory>

#include "foundation/Utf8.h"
#include "toolkit/exchange/BcfPictures.h"
#include "toolkit/exchange/DocumentTimes.h"
#include "toolkit/exchange/ExchangeLibrary.h"
#include "toolkit/exchange/SheetBase.h"
#include "toolkit/review/Match.h"

namespace ZORToolkit {
namespace {

constexpr const char* kHeaders[] = {"Id",
                                    "N",
                                    "Type",
                                    "Status",
                                    "Comment",
                                    "Value [mm]",
                                    "Clearance [mm]",
                                    "First product",
                                    "First part",
                                    "Second product",
                                    "Second part",
                                    "Rule",
                                    "Severity",
                                    "X [mm]",
                                    "Y [mm]",
                                    "Z [mm]",
                                    "Result",
                                    "Computation",
                                    kBaseHeader};
constexpr std::size_t kTypeColumn = 2, kStatusColumn = 3, kCommentColumn = 4;
constexpr double kWidths[] = {18, 6,  11, 14, 40, 11, 11, 34, 16, 34,
                              16, 14, 10, 10, 10, 10, 18, 24, 20};
static_assert(std::size(kWidths) == std::size(kHeaders));

const std::vector<std::string> kTypes = {"Clash", "Contact", "Clearance"};
const std::vector<std::uint32_t> kTypeColours = {0xF8CBAD, 0xFFE699, 0xBDD7EE};
const std::vector<std::string> kStatuses = {"Not inspected", "Relevant", "Irrelevant"};
const std::vector<std::uint32_t> kStatusColours = {0xEDEDED, 0xF4B084, 0xC6E0B4};

/// As much as a cell takes, cut between characters.
std::string Fitting(std::string_view inText) {
  if (inText.size() <= kMaxCellText) return std::string(inText);
  std::size_t end = kMaxCellText;
  while (end > 0 && (inText[end] & 0xC0) == 0x80) --end;
  return std::string(inText.substr(0, end));
}

/// A coordinate, without what the rounding of a mean leaves.
double Rounded(double inCoordinate) {
  constexpr double kDigits = 1e6;
  return std::round(inCoordinate * kDigits) / kDigits + 0.0;
}

SheetCell CellOf(const Number& inNumber) { return {inNumber.text, inNumber.value}; }

std::string NameOf(const ProductRecord& inProduct) {
  return inProduct.alias.empty() ? inProduct.id : inProduct.alias;
}

/// The rows of a result, made one after the other.
class RowMaker {
 public:
  explicit RowMaker(ClashDocument& ioResult)
      : document_(ioResult), result_(ReadForReview(ioResult)), ids_(StableIds(result_)) {}

  const ReviewedResult& Result() const { return result_; }
  const std::vector<std::string>& Ids() const { return ids_; }

  template <class Visit>
  void ForEach(const RecordFilter& inFilter, RecordPart inPart, const Visit& inVisit) {
    const RecordPart part = inFilter.NeedsLabels() ? RecordPart::kAll : inPart;
    ForEachInterference(document_, part, [&](const InterferenceRecord& inRecord) {
      if (!inFilter.Accepts(inRecord)) return;
      Fill(inRecord);
      inVisit(inRecord, cells_);
    });
  }

 private:
  void Fill(const InterferenceRecord& inRecord) {
    const auto position = static_cast<std::size_t>(inRecord.index - 1);
    const ReviewRecord& review = result_.interferences[position];
    const auto& [first, second] = inRecord.products;
    const std::string comment = Fitting(review.comment);
    cells_.clear();
    const auto text = [&](std::string_view inText) { cells_.push_back({Fitting(inText), {}}); };
    text(ids_[position]);
    cells_.push_back({{}, inRecord.index});
    text(inRecord.type);
    text(review.status);
    text(comment);
    cells_.push_back(CellOf(inRecord.value));
    cells_.push_back(CellOf(inRecord.clearance));
    text(NameOf(first));
    text(first.shape);
    text(NameOf(second));
    text(second.shape);
    text(inRecord.rule.name);
    text(inRecord.rule.severity);
    const std::optional<Position> place = result_.PlaceOf(review);
    for (std::size_t i = 0; i < 3; ++i)
      cells_.push_back({{}, place ? std::optional(Rounded((*place)[i])) : std::nullopt});
    text(inRecord.result);
    text(inRecord.computationCase);
    text(BaseOf(review.status, comment));
  }

  ClashDocument& document_;
  ReviewedResult result_;
  std::vector<std::string> ids_;
  std::vector<SheetCell> cells_;
};

/// How often things of one kind are there.
struct Counts {
  int all = 0, byType[3] = {};
  std::optional<double> worst;

  void Add(const ReviewRecord& inRecord) {
    ++all;
    const auto type = std::ranges::find(kTypes, inRecord.type);
    if (type != kTypes.end()) ++byType[type - kTypes.begin()];
    const std::optional<double> value = inRecord.value.Value();
    if (value) worst = std::min(*value, worst.value_or(*value));
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
    written_.notCarried = {
        {"placements", static_cast<int>(written_.interferences), ""},
        {"points of contact, but for their mean", static_cast<int>(written_.interferences), ""},
        {"viewpoint and Old or New", static_cast<int>(written_.interferences), ""}};
    if (written_.interferences == 0) written_.notCarried.clear();
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
    std::vector<InterferenceRecord> records;
    ForEachInterference(result_, RecordPart::kAll, [&](const InterferenceRecord& inRecord) {
      if (filter_.Accepts(inRecord)) records.push_back(inRecord);
    });
    if (!inOpenModel) {
      for (const InterferenceRecord& record : records)
        pictures_.push_back(maker_->PagePicture(record.index));
      return;
    }
    std::vector<const InterferenceRecord*> shown;
    for (const InterferenceRecord& record : records) shown.push_back(&record);
    for (const Snapshot& snapshot : maker_->Make(shown, inOpenModel))
      pictures_.push_back(snapshot.showsProducts ? snapshot.picture : "");
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
    const bool hasPictures = !pictures_.empty();
    SheetLayout layout;
    layout.name = "Interferences";
    for (std::size_t i = 0; i < std::size(kHeaders); ++i)
      layout.columns.push_back({kHeaders[i], kWidths[i], i + 1 == std::size(kHeaders),
                                i == kStatusColumn || i == kCommentColumn});
    if (hasPictures) layout.columns.push_back({"Picture", 21});
    layout.rows = CountAccepted();
    layout.rowHeight = hasPictures ? 78 : 0;
    layout.words = {{kTypeColumn, kTypes, kTypeColours, false},
                    {kStatusColumn, kStatuses, kStatusColours, true}};
    book_->AddSheet(layout);
    std::size_t row = 0;
    rows_.ForEach(
        filter_, RecordPart::kRow,
        [&](const InterferenceRecord& inRecord, const std::vector<SheetCell>& inCells) {
          WriteRow(row, inCells);
          if (hasPictures) WritePicture(row, inCells.size());
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

  void WritePicture(std::size_t inRow, std::size_t inColumn) {
    const std::string& path = pictures_[inRow];
    const std::optional<PictureSize> size = SizeOfPicture(path);
    if (!size || size->width < 1 || size->height < 1) return;
    book_->Picture(inRow, inColumn, path, std::min(148.0 / size->width, 100.0 / size->height));
    ++written_.pictures;
  }

  void Count(const ReviewRecord& inRecord) {
    all_.Add(inRecord);
    byStatus_[std::string(inRecord.status)].Add(inRecord);
    for (std::size_t i = 0; i < 2; ++i)
      if (inRecord.products[i] >= 0 && (i == 0 || inRecord.products[0] != inRecord.products[1]))
        byProduct_[inRecord.products[i]].Add(inRecord);
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
    book_->Text(inRow, inColumn, Fitting(inName));
    book_->Number(inRow, inColumn + 1, inCounts.all);
    for (std::size_t i = 0; i < 3; ++i) book_->Number(inRow, inColumn + 2 + i, inCounts.byType[i]);
    if (inCounts.worst) book_->Number(inRow, inColumn + 5, *inCounts.worst);
  }

  void WriteProducts() {
    std::vector<std::pair<int, Counts>> products(byProduct_.begin(), byProduct_.end());
    std::ranges::stable_sort(products, std::ranges::greater(),
                             [](const auto& inProduct) { return inProduct.second.all; });
    SheetLayout layout;
    layout.name = "Products";
    layout.columns = {{"Product", 50},   {"Interferences", 14},    {"Clash", 10}, {"Contact", 10},
                      {"Clearance", 10}, {"Worst value [mm]", 18}, {"Part", 24}};
    layout.rows = products.size();
    book_->AddSheet(layout);
    for (std::size_t i = 0; i < products.size(); ++i) {
      const ReviewProduct& product =
          rows_.Result().products[static_cast<std::size_t>(products[i].first)];
      WriteCounts(i, product.Name(), 0, products[i].second);
      book_->Text(i, 6, Fitting(product.part));
    }
  }

  void WriteGroups() {
    std::vector<InterferenceGroup> groups =
        GroupInterferences(rows_.Result(), rows_.Ids(), options_.grouping);
    for (InterferenceGroup& group : groups)
      std::erase_if(group.members, [&](int inMember) {
        return !std::binary_search(accepted_.begin(), accepted_.end(), inMember);
      });
    std::erase_if(groups, [](const InterferenceGroup& inGroup) { return inGroup.members.empty(); });
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
      book_->Text(i, 0, Fitting(groups[i].label));
      book_->Number(i, 1, static_cast<double>(groups[i].members.size()));
      if (groups[i].worst) book_->Number(i, 2, *groups[i].worst);
      book_->Number(i, 3, groups[i].representative + 1);
      book_->Text(i, 4, groups[i].id);
    }
  }

  DocumentRecord about_;
  const SpreadsheetOptions& options_;
  RecordFilter filter_;
  RowMaker rows_;
  ClashDocument& result_;
  std::unique_ptr<SpreadsheetWriter> book_;
  BcfOptions snapshotOptions_;
  std::unique_ptr<SnapshotMaker> maker_;
  std::vector<std::string> pictures_;  // of the rows
  Counts all_;
  std::map<std::string, Counts> byStatus_;
  std::map<int, Counts> byProduct_;
  std::vector<int> accepted_;  // positions, ascending
  SpreadsheetWritten written_;
};

}  // namespace

std::vector<std::string> SheetHeaders() { return {std::begin(kHeaders), std::end(kHeaders)}; }

void ForEachSheetRow(ClashDocument& ioResult, const RecordFilter& inFilter,
                     const std::function<void(const std::vector<SheetCell>& inCells)>& inVisit) {
  RowMaker(ioResult).ForEach(
      inFilter, RecordPart::kRow,
      [&](const InterferenceRecord&, const std::vector<SheetCell>& inCells) { inVisit(inCells); });
}

SpreadsheetWritten WriteSpreadsheet(ClashDocument& ioResult, const SpreadsheetOptions& inOptions,
                                    const std::function<ZORIProduct_var()>& inOpenModel,
                                    const std::string& inPath) {
  ioResult.RequireInterferences();
  return WorkbookMaker(ioResult, inOptions, inPath).Write(inOpenModel);
}

}  // namespace ZORToolkit
