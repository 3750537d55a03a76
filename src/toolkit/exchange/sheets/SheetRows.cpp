#include "toolkit/exchange/sheets/SheetRows.h"

#include <cmath>

#include "toolkit/exchange/ExchangeLibrary.h"
#include "toolkit/exchange/bcf/BcfWords.h"
#include "toolkit/exchange/sheets/SheetBase.h"
#include "toolkit/review/Match.h"
#include "toolkit/review/ReviewSource.h"

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

/// A coordinate, without what the rounding of a mean leaves.
double Rounded(double inCoordinate) {
  constexpr double kDigits = 1e6;
  return std::round(inCoordinate * kDigits) / kDigits + 0.0;
}

SheetCell CellOf(const Number& inNumber) { return {inNumber.text, inNumber.value}; }

bool HasHiddenId(const ProductRecord& inProduct) {
  return !inProduct.id.empty() && inProduct.id != NameOf(inProduct);
}

}  // namespace

std::string FittingCell(std::string_view inText) {
  if (inText.size() <= kMaxCellText) return std::string(inText);
  std::size_t end = kMaxCellText;
  while (end > 0 && (inText[end] & 0xC0) == 0x80) --end;
  return std::string(inText.substr(0, end));
}

SheetRows::SheetRows(ClashDocument& ioResult)
    : document_(ioResult),
      result_(ReadForReview(ioResult, {.identities = true})),
      ids_(StableIds(result_)) {
  if (result_.source == nullptr) return;
  const ZORDefault::TreeReader& tree = result_.source->Tree();
  for (ZORDefault::TreeReader::Name name = 0; name < tree.NameEnd(); ++name)
    if (tree.NameText(name) == u"Viewpoint") viewpointName_ = static_cast<int>(name);
}

void SheetRows::ForEach(const RecordFilter& inFilter, const Visit& inVisit) {
  const RecordPart part = inFilter.NeedsLabels() ? RecordPart::kAll : RecordPart::kRow;
  ForEachInterference(document_, part, [&](const InterferenceRecord& inRecord) {
    if (!inFilter.Accepts(inRecord)) return;
    Fill(inRecord);
    CountNotCarried(inRecord);
    inVisit(inRecord, cells_);
  });
}

void SheetRows::AddText(std::string_view inText) {
  isCut_ = isCut_ || inText.size() > kMaxCellText;
  cells_.push_back({FittingCell(inText), {}});
}

void SheetRows::Fill(const InterferenceRecord& inRecord) {
  const auto position = static_cast<std::size_t>(inRecord.index - 1);
  const ReviewRecord& review = result_.interferences[position];
  const auto& [first, second] = inRecord.products;
  cells_.clear();
  isCut_ = false;
  AddText(ids_[position]);
  cells_.push_back({{}, inRecord.index});
  AddText(inRecord.type);
  AddText(review.status);
  AddText(review.comment);
  const std::string comment = cells_.back().text;
  cells_.push_back(CellOf(inRecord.value));
  cells_.push_back(CellOf(inRecord.clearance));
  AddText(NameOf(first));
  AddText(first.shape);
  AddText(NameOf(second));
  AddText(second.shape);
  AddText(inRecord.rule.name);
  AddText(inRecord.rule.severity);
  const std::optional<Position> place = result_.PlaceOf(review);
  for (std::size_t i = 0; i < 3; ++i)
    cells_.push_back({{}, place ? std::optional(Rounded((*place)[i])) : std::nullopt});
  AddText(inRecord.result);
  AddText(inRecord.computationCase);
  AddText(BaseOf(review.status, comment));
}

bool SheetRows::HasViewpoint(const ReviewRecord& inRecord) const {
  bool has = false;
  if (viewpointName_ >= 0)
    result_.source->Tree().ForEachChild(inRecord.element, [&](auto, auto inName) {
      has = has || static_cast<int>(inName) == viewpointName_;
    });
  return has;
}

void SheetRows::CountNotCarried(const InterferenceRecord& inRecord) {
  const ReviewRecord& review = result_.interferences[static_cast<std::size_t>(inRecord.index - 1)];
  const auto& [first, second] = inRecord.products;
  std::size_t what = 0;
  const auto count = [&](bool inIsThere) { notCarried_[what++] += inIsThere ? 1 : 0; };
  count(HasHiddenId(first) || HasHiddenId(second));
  count(result_.HasPlacement(review.productElements[0]) ||
        result_.HasPlacement(review.productElements[1]));
  count(review.geometry != 0);
  count(HasViewpoint(review));
  count(!review.retrieve.empty());
  count(!inRecord.name.empty());
  count(isCut_);
}

std::vector<NotCarried> SheetRows::ListNotCarried() const {
  static constexpr const char* kNames[] = {"identifiers of products that have an alias",
                                           "placements",
                                           "points of contact, but for their mean",
                                           "viewpoint",
                                           "Old or New",
                                           "name",
                                           "the end of texts that are longer than a cell"};
  static_assert(std::size(kNames) == std::tuple_size_v<decltype(notCarried_)>);
  std::vector<NotCarried> list;
  for (std::size_t i = 0; i < notCarried_.size(); ++i)
    if (notCarried_[i] > 0) list.push_back({kNames[i], notCarried_[i], ""});
  return list;
}

std::vector<std::string> SheetHeaders() { return {std::begin(kHeaders), std::end(kHeaders)}; }

std::vector<NotCarried> ForEachSheetRow(
    ClashDocument& ioResult, const RecordFilter& inFilter,
    const std::function<void(const std::vector<SheetCell>& inCells)>& inVisit) {
  SheetRows rows(ioResult);
  rows.ForEach(inFilter, [&](const InterferenceRecord&, const std::vector<SheetCell>& inCells) {
    inVisit(inCells);
  });
  return rows.ListNotCarried();
}

}  // namespace ZORToolkit
