#include "toolkit/review/Match.h"

#include <algorithm>
#include <limits>
#include <map>
#include <tuple>

#include "toolkit/review/Assignment.h"
#include "toolkit/review/Frames.h"
#include "toolkit/review/ProductMatch.h"

namespace ZORToolkit {
namespace {

constexpr double kOtherType = 1;      // what another type costs, in millimetres of distance
constexpr double kValueWeight = 0.1;  // what a small difference of values costs, likewise

/// An interference of the pair in hand.
struct Item {
  int position;
  std::uint32_t first;  // which of its products is the pair's first
};
typedef std::vector<Item> Items;

enum Place { kInWorld, kInFirst, kInSecond };
/// The place of an item in the world and in the frames of the pair's products, as far as known.
typedef std::array<std::optional<Point3>, 3> Places;

class PairMatcher {
 public:
  PairMatcher(const ReviewedResult& inOld, const ReviewedResult& inNew,
              const MatchOptions& inOptions, ResultMatch& ioMatch)
      : old_(inOld), new_(inNew), motions_(inOld, inNew), options_(inOptions), match_(ioMatch) {}

  void Match(const Items& inOlds, const Items& inNews) {
    if (inOlds.size() == 1 && inNews.size() == 1 && IsAtSamePlace(inOlds[0], inNews[0]))
      return SetUnmoved(inOlds[0], inNews[0]);
    olds_ = inOlds;
    news_ = inNews;
    oldPlaces_.clear();
    newPlaces_.clear();
    for (const Item& item : olds_) oldPlaces_.push_back(PlacesOf(old_, item));
    for (const Item& item : news_) newPlaces_.push_back(PlacesOf(new_, item));
    const ReviewRecord &was = Old(olds_[0]), &is = New(news_[0]);
    const bool isSwapped = olds_[0].first != news_[0].first;
    motion_ = motions_.Relative(was, is, isSwapped);
    stands_ = motions_.Of(was, 0, is, isSwapped ? 1 : 0) <= options_.tolerance &&
              motions_.Of(was, 1, is, isSwapped ? 0 : 1) <= options_.tolerance;
    if (olds_.size() == 1 && news_.size() == 1)
      MatchOnly();
    else
      MatchSeveral();
    ExplainAlone();
  }

 private:
  const ReviewRecord& Old(const Item& inItem) const {
    return old_.interferences[static_cast<std::size_t>(inItem.position)];
  }
  const ReviewRecord& New(const Item& inItem) const {
    return new_.interferences[static_cast<std::size_t>(inItem.position)];
  }

  /// By the texts of placements and points, without understanding them.
  bool IsAtSamePlace(const Item& inOld, const Item& inNew) const {
    const WrittenGeometry was = old_.GeometryOf(Old(inOld)), is = new_.GeometryOf(New(inNew));
    const std::size_t swap = inOld.first == inNew.first ? 0 : 1;
    return was.placements[0] == is.placements[swap] &&
           was.placements[1] == is.placements[1 - swap] && was.points == is.points &&
           was.points != WrittenGeometry::kNeverAlike;
  }

  static Places PlacesOf(const ReviewedResult& inResult, const Item& inItem) {
    const ReviewRecord& record = inResult.interferences[static_cast<std::size_t>(inItem.position)];
    const std::optional<Position> world = inResult.PlaceOf(record);
    if (!world) return {};
    return {ToPoint(*world), PlaceInFrame(inResult, record.productElements[inItem.first], *world),
            PlaceInFrame(inResult, record.productElements[1 - inItem.first], *world)};
  }

  /// In the frame in which they are nearest; nothing when a place is unknown.
  std::optional<double> Distance(std::size_t inOld, std::size_t inNew) const {
    std::optional<double> least;
    for (const Place frame : {kInWorld, kInFirst, kInSecond}) {
      const auto &from = oldPlaces_[inOld][frame], &to = newPlaces_[inNew][frame];
      if (!from || !to) continue;
      const double distance = ZORFoundation::Length(*to - *from);
      least = std::min(distance, least.value_or(distance));
      if (stands_) break;
    }
    return least;
  }

  void MatchOnly() {
    const std::optional<double> distance = Distance(0, 0);
    if (!distance || *distance <= MaxDistance()) Set(0, 0, false);
  }

  /// Where products move, what is between them may move as far again.
  double MaxDistance() const { return options_.samePlace + 2 * motion_; }

  void MatchSeveral() {
    if (stands_) {
      Assign(kInWorld, options_.samePlace);
    } else {
      for (const double distance : {kExact, MaxDistance()})
        for (const Place frame : {kInFirst, kInSecond, kInWorld}) Assign(frame, distance);
    }
    AssignPlaceless();
  }

  /// One best assignment of those that are still alone and have a place.
  void Assign(Place inPlace, double inMaxDistance) {
    const auto hasPlace = [&](const Places& inPlaces) { return inPlaces[inPlace].has_value(); };
    Assign(hasPlace, hasPlace, inPlace, inMaxDistance);
  }

  /// By type and value where a place is missing on one side.
  void AssignPlaceless() {
    const auto any = [](const Places&) { return true; };
    const auto placeless = [](const Places& inPlaces) { return !inPlaces[kInWorld]; };
    Assign(placeless, placeless, std::nullopt, kUnlimited);
    Assign(placeless, any, std::nullopt, kUnlimited);
    Assign(any, placeless, std::nullopt, kUnlimited);
  }

  template <class OldChoice, class NewChoice>
  void Assign(const OldChoice& inOldChoice, const NewChoice& inNewChoice,
              std::optional<Place> inPlace, double inMaxDistance) {
    std::vector<std::size_t> olds, news;
    for (std::size_t i = 0; i < olds_.size(); ++i)
      if (PartnerOf(olds_[i]).position < 0 && inOldChoice(oldPlaces_[i])) olds.push_back(i);
    for (std::size_t i = 0; i < news_.size(); ++i)
      if (PartnerOfNew(news_[i]).position < 0 && inNewChoice(newPlaces_[i])) news.push_back(i);
    if (olds.empty() || news.empty()) return;
    std::vector<AssignmentPoint> rows, columns;
    rows.reserve(olds.size());
    columns.reserve(news.size());
    for (const std::size_t i : olds) rows.push_back(PointOf(Old(olds_[i]), oldPlaces_[i], inPlace));
    for (const std::size_t i : news)
      columns.push_back(PointOf(New(news_[i]), newPlaces_[i], inPlace));
    const Assignment best = BestAssignment(rows, columns, {inMaxDistance, kOtherType, kAlone});
    for (std::size_t i = 0; i < olds.size(); ++i)
      if (best.columnOfRow[i] >= 0)
        Set(olds[i], news[static_cast<std::size_t>(best.columnOfRow[i])], best.isAmbiguous[i] != 0);
  }

  AssignmentPoint PointOf(const ReviewRecord& inRecord, const Places& inPlaces,
                          std::optional<Place> inPlace) {
    AssignmentPoint point;
    if (inPlace) {
      const Point3& place = *inPlaces[*inPlace];
      point.at = {place.x, place.y, place.z, 0};
    }
    // Large differences cost less than in proportion, so that a place outweighs a value.
    point.at[3] = kValueWeight * std::asinh(inRecord.value.Value().value_or(0));
    point.kind = types_.try_emplace(inRecord.type, static_cast<int>(types_.size())).first->second;
    return point;
  }

  ResultMatch::Partner& PartnerOf(const Item& inOld) {
    return match_.interferencesOfOld[static_cast<std::size_t>(inOld.position)];
  }
  ResultMatch::Partner& PartnerOfNew(const Item& inNew) {
    return match_.interferencesOfNew[static_cast<std::size_t>(inNew.position)];
  }

  void SetBoth(const Item& inOld, const Item& inNew, std::string_view inReason, bool inIsUnmoved) {
    PartnerOf(inOld) = {inNew.position, inIsUnmoved, inReason};
    PartnerOfNew(inNew) = {inOld.position, inIsUnmoved, inReason};
  }

  /// The only ones of their pair, where all is where it was.
  void SetUnmoved(const Item& inOld, const Item& inNew) {
    const bool hasPlace = old_.GeometryOf(Old(inOld)).points > WrittenGeometry::kNoPoints;
    std::string_view reason =
        hasPlace ? "same products, same place" : "same products, the only one of the pair";
    const std::string products = ReasonOfProducts(Old(inOld));
    if (!products.empty())
      reason = match_.Keep(products + (hasPlace ? ", same place" : ", the only one of the pair"));
    SetBoth(inOld, inNew, reason, true);
  }

  /// @param inOld, inNew positions in olds_ and news_.
  void Set(std::size_t inOld, std::size_t inNew, bool inIsAmbiguous) {
    std::string reason = ReasonOfProducts(Old(olds_[inOld]));
    if (reason.empty()) reason = "same products";
    const std::optional<double> distance = Distance(inOld, inNew);
    const bool isOnly = olds_.size() == 1 && news_.size() == 1;
    if (!distance)
      reason += isOnly ? ", the only one of the pair" : ", no place given, by type and value";
    else if (*distance <= kExact)
      reason += ", same place";
    else
      reason.append(isOnly ? ", the only one of the pair, " : ", nearest place, ")
          .append(Millimetres(*distance))
          .append(" away");
    if (inIsAmbiguous) reason += "; several are alike, taken in their order";
    SetBoth(olds_[inOld], news_[inNew], match_.Keep(std::move(reason)), false);
  }

  /// Empty where both have the identifiers that they had.
  std::string ReasonOfProducts(const ReviewRecord& inOld) const {
    std::string reason;
    for (const int product : inOld.products) {
      if (product < 0) continue;
      const std::string_view why = match_.productsOfOld[static_cast<std::size_t>(product)].reason;
      if (!why.empty() && !reason.empty()) reason += "; ";
      reason += why;
    }
    return reason;
  }

  void ExplainAlone() {
    for (const Item& item : olds_)
      if (PartnerOf(item).position < 0)
        PartnerOf(item).reason = "the new result has none of the pair at this place";
    for (const Item& item : news_)
      if (PartnerOfNew(item).position < 0)
        PartnerOfNew(item).reason = "the old result has none of the pair at this place";
  }

  const ReviewedResult& old_;
  const ReviewedResult& new_;
  Motions motions_;
  const MatchOptions& options_;
  ResultMatch& match_;
  std::map<std::string_view, int> types_;
  Items olds_, news_;
  std::vector<Places> oldPlaces_, newPlaces_;  // of these
  double motion_ = 0;                          // of the second product against the first
  bool stands_ = false;                        // neither product moved
};

/// An interference among all of its pair; the products' numbers are those of the new result.
struct PairRow {
  int low, high;  // of the two products
  bool isNew;
  Item item;
};

/// All interferences whose products both results have, those of a pair together: by the lower
/// product by counting, then by comparing.
class PairRows {
 public:
  PairRows(const ReviewedResult& inOld, const ReviewedResult& inNew, ResultMatch& ioMatch)
      : match_(ioMatch), ends_(inNew.products.size() + 2) {
    Collect(inOld, false, match_.productsOfOld, match_.interferencesOfOld);
    Collect(inNew, true, match_.productsOfNew, match_.interferencesOfNew);
    Sort();
  }

  const std::vector<PairRow>& Get() const { return rows_; }

 private:
  void Collect(const ReviewedResult& inResult, bool inIsNew,
               const std::vector<ResultMatch::Partner>& inProducts,
               std::vector<ResultMatch::Partner>& outPartners) {
    outPartners.resize(inResult.interferences.size());
    rows_.reserve(rows_.size() + outPartners.size());
    for (std::size_t i = 0; i < outPartners.size(); ++i) {
      const ReviewRecord& record = inResult.interferences[i];
      outPartners[i].reason = ReasonOfMissing(record, inProducts);
      if (outPartners[i].reason.empty()) Add(record, inIsNew);
    }
  }

  /// Why the other result cannot have it: it lacks one of the products.
  static std::string_view ReasonOfMissing(const ReviewRecord& inRecord,
                                          const std::vector<ResultMatch::Partner>& inPartners) {
    for (const int product : inRecord.products)
      if (product >= 0 && inPartners[static_cast<std::size_t>(product)].position < 0)
        return inPartners[static_cast<std::size_t>(product)].reason;
    return {};
  }

  void Add(const ReviewRecord& inRecord, bool inIsNew) {
    std::array<int, 2> products = inRecord.products;
    if (!inIsNew)
      for (int& product : products)
        if (product >= 0)
          product = match_.productsOfOld[static_cast<std::size_t>(product)].position;
    const std::uint32_t first = products[1] < products[0] ? 1 : 0;
    rows_.push_back({products[first], products[1 - first], inIsNew, {inRecord.index - 1, first}});
    ++ends_[PlaceOf(products[first])];
  }

  static std::size_t PlaceOf(int inProduct) { return static_cast<std::size_t>(inProduct) + 1; }

  void Sort() {
    std::uint32_t sum = 0;
    for (std::uint32_t& end : ends_) {
      const std::uint32_t count = end;
      end = sum;
      sum += count;
    }
    std::vector<PairRow> sorted(rows_.size());
    for (const PairRow& row : rows_) sorted[ends_[PlaceOf(row.low)]++] = row;
    rows_.swap(sorted);
    const auto order = [](const PairRow& inRow) {
      return std::tie(inRow.high, inRow.isNew, inRow.item.position);
    };
    std::uint32_t begin = 0;
    for (const std::uint32_t end : ends_) {
      if (end > begin + 1)
        std::sort(rows_.begin() + begin, rows_.begin() + end,
                  [&](const PairRow& inA, const PairRow& inB) { return order(inA) < order(inB); });
      begin = end;
    }
  }

  ResultMatch& match_;
  std::vector<PairRow> rows_;
  std::vector<std::uint32_t> ends_;  // of the rows of each lower product, from that of none
};

}  // namespace

ResultMatch MatchResults(const ReviewedResult& inOld, const ReviewedResult& inNew,
                         const MatchOptions& inOptions) {
  ResultMatch match;
  MatchProducts(inOld, inNew, inOptions.tolerance, match);
  const PairRows pairRows(inOld, inNew, match);
  const std::vector<PairRow>& rows = pairRows.Get();
  PairMatcher matcher(inOld, inNew, inOptions, match);
  Items olds, news;
  for (std::size_t begin = 0, end = 0; begin < rows.size(); begin = end) {
    olds.clear();
    news.clear();
    for (; end < rows.size() && rows[end].low == rows[begin].low &&
           rows[end].high == rows[begin].high;
         ++end)
      (rows[end].isNew ? news : olds).push_back(rows[end].item);
    if (!olds.empty() && !news.empty()) {
      matcher.Match(olds, news);
      continue;
    }
    for (const Item& item : olds)
      match.interferencesOfOld[static_cast<std::size_t>(item.position)].reason =
          "the new result has none of the pair";
    for (const Item& item : news)
      match.interferencesOfNew[static_cast<std::size_t>(item.position)].reason =
          "the old result has none of the pair";
  }
  return match;
}

}  // namespace ZORToolkit
