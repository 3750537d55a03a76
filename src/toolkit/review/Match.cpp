#include "toolkit/review/Match.h"

#include <algorithm>
#include <limits>
#include <map>
#include <numeric>

#include "toolkit/review/Assignment.h"
#include "toolkit/review/Frames.h"
#include "toolkit/review/ProductMatch.h"

namespace ZORToolkit {
namespace {

constexpr std::uint32_t kReasonBits = ResultMatch::kReasonBits;
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
  PairMatcher(const Motions& inMotions, const MatchOptions& inOptions, ResultMatch& ioMatch)
      : old_(inMotions.Old()),
        new_(inMotions.New()),
        motions_(inMotions),
        options_(inOptions),
        match_(ioMatch) {}

  void Match(const Items& inOlds, const Items& inNews) {
    if (inOlds.size() == 1 && inNews.size() == 1 && IsAtSamePlace(inOlds[0], inNews[0]))
      return SetUnmoved(inOlds[0], inNews[0]);
    olds_ = inOlds;
    news_ = inNews;
    oldPlaces_.clear();
    newPlaces_.clear();
    for (const Item& item : olds_)
      oldPlaces_.push_back(PlacesOf(Old(item), item, old_, [&](ElementNumber inProduct) {
        return motions_.OldPlacementOf(inProduct);
      }));
    for (const Item& item : news_)
      newPlaces_.push_back(PlacesOf(New(item), item, new_, [&](ElementNumber inProduct) {
        return motions_.NewPlacementOf(inProduct);
      }));
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

  template <class PlacementOf>
  static Places PlacesOf(const ReviewRecord& inRecord, const Item& inItem,
                         const ReviewedResult& inResult, const PlacementOf& inPlacementOf) {
    const std::optional<Position> world = inResult.PlaceOf(inRecord);
    if (!world) return {};
    const auto inFrameOf = [&](std::size_t inProduct) {
      return PlaceInFrame(inPlacementOf(inRecord.productElements[inProduct]), *world);
    };
    return {ToPoint(*world), inFrameOf(inItem.first), inFrameOf(1 - inItem.first)};
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

  void SetBoth(const Item& inOld, const Item& inNew, std::uint32_t inReason, bool inIsUnmoved) {
    PartnerOf(inOld) = {inNew.position, inIsUnmoved, inReason & kReasonBits};
    PartnerOfNew(inNew) = {inOld.position, inIsUnmoved, inReason & kReasonBits};
  }

  /// The only ones of their pair, where all is where it was.
  void SetUnmoved(const Item& inOld, const Item& inNew) {
    const bool hasPlace = old_.GeometryOf(Old(inOld)).points > WrittenGeometry::kNoPoints;
    std::uint32_t reason = hasPlace ? samePlace_ : onlyOne_;
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
      const std::string_view why =
          match_.Reason(match_.productsOfOld[static_cast<std::size_t>(product)]);
      if (!why.empty() && !reason.empty()) reason += "; ";
      reason += why;
    }
    return reason;
  }

  void ExplainAlone() {
    for (const Item& item : olds_)
      if (PartnerOf(item).position < 0) PartnerOf(item).reason = newHasNone_ & kReasonBits;
    for (const Item& item : news_)
      if (PartnerOfNew(item).position < 0) PartnerOfNew(item).reason = oldHasNone_ & kReasonBits;
  }

  const ReviewedResult& old_;
  const ReviewedResult& new_;
  const Motions& motions_;
  const MatchOptions& options_;
  ResultMatch& match_;
  const std::uint32_t samePlace_ = match_.Keep("same products, same place");
  const std::uint32_t onlyOne_ = match_.Keep("same products, the only one of the pair");
  const std::uint32_t newHasNone_ =
      match_.Keep("the new result has none of the pair at this place");
  const std::uint32_t oldHasNone_ =
      match_.Keep("the old result has none of the pair at this place");
  std::map<std::string_view, int> types_;
  Items olds_, news_;
  std::vector<Places> oldPlaces_, newPlaces_;  // of these
  double motion_ = 0;                          // of the second product against the first
  bool stands_ = false;                        // neither product moved
};

/// All interferences whose products both results have, those of a pair together, by the numbers of
/// the products in the new result: by the lower one by counting, then by comparing.
class PairRows {
 public:
  PairRows(const ReviewedResult& inOld, const ReviewedResult& inNew, ResultMatch& ioMatch)
      : match_(ioMatch), ends_(inNew.products.size() + 2) {
    const auto forEachResult = [&](const auto& inVisit) {
      inVisit(inOld, std::uint64_t{0}, match_.productsOfOld, match_.interferencesOfOld);
      inVisit(inNew, kIsNew, match_.productsOfNew, match_.interferencesOfNew);
    };
    std::uint32_t count = 0;
    forEachResult([&](const ReviewedResult& inResult, std::uint64_t, const auto& inProducts,
                      auto& outPartners) {
      outPartners.resize(inResult.interferences.size());
      for (std::size_t i = 0; i < outPartners.size(); ++i) {
        const ReviewRecord& record = inResult.interferences[i];
        outPartners[i].reason = ReasonOfMissing(record, inProducts);
        if (outPartners[i].reason != 0) continue;
        ++ends_[PairOf(record, &inResult == &inOld).low];
        ++count;
      }
    });
    std::exclusive_scan(ends_.begin(), ends_.end(), ends_.begin(), 0u);
    rows_.resize(count);
    forEachResult([&](const ReviewedResult& inResult, std::uint64_t inIsNew, const auto&,
                      const auto& inPartners) {
      for (std::size_t i = 0; i < inPartners.size(); ++i) {
        if (inPartners[i].reason != 0) continue;
        const Pair pair = PairOf(inResult.interferences[i], &inResult == &inOld);
        rows_[ends_[pair.low]++] = pair.high << 32 | inIsNew | i << 1 | pair.first;
      }
    });
    std::uint32_t begin = 0;
    for (const std::uint32_t end : ends_) {
      if (end > begin + 1) std::sort(rows_.begin() + begin, rows_.begin() + end);
      begin = end;
    }
  }

  /// Calls inVisit(old interferences, new ones) for each pair.
  template <class Visit>
  void ForEachPair(const Visit& inVisit) const {
    Items olds, news;
    std::size_t at = 0;
    for (const std::uint32_t end : ends_)
      while (at < end) {
        olds.clear();
        news.clear();
        for (const std::uint64_t high = rows_[at] >> 32; at < end && rows_[at] >> 32 == high; ++at)
          ((rows_[at] & kIsNew) != 0 ? news : olds)
              .push_back({static_cast<int>((rows_[at] & (kIsNew - 1)) >> 1),
                          static_cast<std::uint32_t>(rows_[at] & 1)});
        inVisit(olds, news);
      }
  }

 private:
  // A row: the higher product, whether the interference is new, its position, and which of its
  // products is the lower one
  static constexpr std::uint64_t kIsNew = std::uint64_t{1} << 31;
  struct Pair {
    std::size_t low;
    std::uint64_t high, first;
  };

  /// Why the other result cannot have it: it lacks one of the products.
  static std::uint32_t ReasonOfMissing(const ReviewRecord& inRecord,
                                       const std::vector<ResultMatch::Partner>& inPartners) {
    for (const int product : inRecord.products)
      if (product >= 0 && inPartners[static_cast<std::size_t>(product)].position < 0)
        return inPartners[static_cast<std::size_t>(product)].reason;
    return 0;
  }

  /// 0 for no product.
  Pair PairOf(const ReviewRecord& inRecord, bool inIsOld) const {
    std::size_t products[2];
    for (std::size_t i = 0; i < 2; ++i) {
      int product = inRecord.products[i];
      if (inIsOld && product >= 0)
        product = match_.productsOfOld[static_cast<std::size_t>(product)].position;
      products[i] = static_cast<std::size_t>(product + 1);
    }
    const std::size_t first = products[1] < products[0] ? 1 : 0;
    return {products[first], products[1 - first], first};
  }

  ResultMatch& match_;
  std::vector<std::uint64_t> rows_;
  std::vector<std::uint32_t> ends_;  // of the rows of each lower product, from that of none
};

}  // namespace

ResultMatch MatchResults(const ReviewedResult& inOld, const ReviewedResult& inNew,
                         const MatchOptions& inOptions) {
  return MatchResults(Motions(inOld, inNew), inOptions);
}

ResultMatch MatchResults(const Motions& inMotions, const MatchOptions& inOptions) {
  ResultMatch match;
  MatchProducts(inMotions, inOptions.tolerance, match);
  const PairRows pairs(inMotions.Old(), inMotions.New(), match);
  PairMatcher matcher(inMotions, inOptions, match);
  const std::uint32_t newHasNone = match.Keep("the new result has none of the pair");
  const std::uint32_t oldHasNone = match.Keep("the old result has none of the pair");
  pairs.ForEachPair([&](const Items& inOlds, const Items& inNews) {
    if (!inOlds.empty() && !inNews.empty()) return matcher.Match(inOlds, inNews);
    for (const Item& item : inOlds)
      match.interferencesOfOld[static_cast<std::size_t>(item.position)].reason =
          newHasNone & kReasonBits;
    for (const Item& item : inNews)
      match.interferencesOfNew[static_cast<std::size_t>(item.position)].reason =
          oldHasNone & kReasonBits;
  });
  return match;
}

}  // namespace ZORToolkit
